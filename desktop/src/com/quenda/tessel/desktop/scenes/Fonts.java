package com.quenda.tessel.desktop.scenes;

import java.awt.Font;
import java.awt.FontFormatException;
import java.io.File;
import java.io.IOException;

/**
 * The fonts scenes are drawn with, read from Debian's font files so that a picture is the same on
 * every machine; the logical Java fonts, which differ between installations, are only a fallback.
 */
public final class Fonts {
  private static final String DEJAVU = "/usr/share/fonts/truetype/dejavu/";
  private static final String NOTO = "/usr/share/fonts/truetype/noto/";

  public static final Font SANS = load(DEJAVU + "DejaVuSans.ttf", Font.PLAIN);
  public static final Font SANS_BOLD = load(DEJAVU + "DejaVuSans-Bold.ttf", Font.BOLD);
  public static final Font NOTO_SANS = load(NOTO + "NotoSans-Regular.ttf", Font.PLAIN);
  public static final Font SERIF = load(DEJAVU + "DejaVuSerif.ttf", Font.PLAIN);

  private Fonts() {}

  private static Font load(String path, int fallbackStyle) {
    try {
      return Font.createFont(Font.TRUETYPE_FONT, new File(path));
    } catch (FontFormatException | IOException e) {
      return new Font(Font.SANS_SERIF, fallbackStyle, 12);
    }
  }
}
