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
  /** How heavy the original text's strokes are. */
  public enum Weight { REGULAR, BOLD }

  // Thicker strokes than this share of the line's height read as bold: regular sans text measures
  // 0.10 to 0.125 (more without descenders), bold 0.15 and up.
  static final double BOLD_STROKE_RATIO = 0.135;

  private FontChoice() {}

  /**
   * The platform font for {@code language} ("/system/fonts/NAME" as the renderer bridge takes
   * it), or null to keep the engine's default font for the language (CJK scripts).
   */
  public static String platformFont(Language language, Weight weight) {
    return platformFont(language, weight == Weight.BOLD ? Face.SANS_BOLD : Face.SANS);
  }

  /** The platform font for {@code language} in {@code face}; null for CJK scripts. */
  public static String platformFont(Language language, Face face) {
    return language.isCjk() ? null : "/system/fonts/" + face.file;
  }

  /** The weight of text whose median stroke width is {@code strokeRatio} of its line height. */
  public static Weight weightOf(double strokeRatio) {
    return strokeRatio > BOLD_STROKE_RATIO ? Weight.BOLD : Weight.REGULAR;
  }
}
