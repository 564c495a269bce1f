package com.quenda.tessel.desktop.engine;

import com.quenda.tessel.desktop.Language;
import com.quenda.tessel.desktop.typeset.Face;

/**
 * The font a translation is drawn in. The engine's default font is a CJK font whose Latin glyphs
 * are set in a tall line box; Latin, Greek and Cyrillic translations get a Noto face instead, serif
 * or sans and in the weight closest to the original text's, so that the translation looks printed
 * where it stands.
 */
public final class FontChoice {
  private FontChoice() {}

  /**
   * The platform font for {@code language} in {@code face} ("/system/fonts/NAME" as the renderer
   * bridge takes it), or null to keep the engine's default font for the language (CJK scripts).
   */
  public static String platformFont(Language language, Face face) {
    return language.isCjk() ? null : "/system/fonts/" + face.file;
  }
}
