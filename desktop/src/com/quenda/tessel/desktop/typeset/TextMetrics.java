package com.quenda.tessel.desktop.typeset;

import java.awt.Font;
import java.awt.FontFormatException;
import java.awt.font.FontRenderContext;
import java.awt.font.TextLayout;
import java.awt.geom.Rectangle2D;
import java.io.File;
import java.io.IOException;
import java.util.Map;
import java.util.concurrent.ConcurrentHashMap;

/**
 * Sizes of a text in one font, in ems (y up, baseline at 0), measured the way the renderer fits a
 * text to its rectangle: the laid-out width, and the height of the ink box for its kind of text
 * (capitals' and ascenders' top to descenders' bottom with small letters, capitals' top to the
 * baseline without; ideographs' ink in CJK) grown to hold the text's own ink.
 */
public final class TextMetrics {
  private static final String NOTO = "/usr/share/fonts/truetype/noto/";
  private static final float SIZE = 100f;
  private static final FontRenderContext CONTEXT = new FontRenderContext(null, true, true);
  private static final Map<String, TextMetrics> LOADED = new ConcurrentHashMap<>();

  /** Null when the font could not be read: widths are then estimated, an ideograph per em. */
  private final Font font;
  private final boolean cjk;
  private final Box lowercase;
  private final Box capitals;
  private final Box ideographs;
  private final double xHeight;

  /** A vertical extent in ems, y up. */
  record Box(double top, double bottom) {
    double height() {
      return top - bottom;
    }

    Box union(Box o) {
      return new Box(Math.max(top, o.top), Math.min(bottom, o.bottom));
    }
  }

  private TextMetrics(Font font, boolean cjk) {
    this.font = font;
    this.cjk = cjk;
    this.lowercase = ink("Hdbhlkfgjpqy", new Box(0.73, -0.24));
    this.capitals = new Box(ink("H", new Box(0.71, 0)).top, 0);
    this.ideographs = ink("国", new Box(0.88, -0.08));
    this.xHeight = ink("x", new Box(0.54, 0)).top;
  }

  /** The metrics of a face the host binds (Latin, Greek and Cyrillic translations). */
  public static TextMetrics of(Face face) {
    return LOADED.computeIfAbsent(face.file, f -> new TextMetrics(load(new File(NOTO + f)), false));
  }

  /** The metrics of the renderer's own default font for CJK, from its assets when present. */
  public static TextMetrics cjk(String fontFile) {
    String assets = System.getProperty("ocr.assets", "");
    return LOADED.computeIfAbsent(
        "cjk:" + fontFile, f -> new TextMetrics(load(new File(assets, fontFile)), true));
  }

  /** The laid-out width of {@code text} on one line. */
  public double width(String text) {
    if (text.isEmpty()) {
      return 0;
    }
    if (font == null) {
      return text.codePointCount(0, text.length());
    }
    return new TextLayout(text, font, CONTEXT).getAdvance() / SIZE;
  }

  /** The height the renderer fits to the rectangle's height. */
  public double fittedHeight(String text) {
    return fittedBox(text).height();
  }

  /** What the renderer fits to the rectangle's height, from the baseline. */
  Box fittedBox(String text) {
    Box kind = kindBox(text);
    return text.isBlank() ? kind : kind.union(ink(text, kind));
  }

  /** The capitals' height, or the ideographs' in CJK: what a reader sees as the text's size. */
  public double capHeight() {
    return cjk ? ideographs.height() : capitals.top;
  }

  /**
   * The height of the box a reader's line box around {@code original} hugs, were it set in this
   * font: from its tallest letter's top to its lowest letter's bottom.
   */
  public double inkBoxHeight(String original) {
    boolean small = original.codePoints().anyMatch(Character::isLowerCase);
    boolean tall = original.codePoints().anyMatch(
        c -> Character.isUpperCase(c) || Character.isDigit(c) || "bdfhklt".indexOf(c) >= 0);
    boolean low = original.codePoints().anyMatch(c -> "gjpqy".indexOf(c) >= 0);
    double top = !small ? capitals.top : tall ? lowercase.top : xHeight;
    return top - (low ? lowercase.bottom : 0);
  }

  /** The ink box for {@code text}'s kind, from the baseline. */
  Box kindBox(String text) {
    if (cjk) {
      return ideographs;
    }
    return text.codePoints().anyMatch(Character::isLowerCase) ? lowercase : capitals;
  }

  private Box ink(String text, Box fallback) {
    if (font == null || text.isEmpty()) {
      return fallback;
    }
    Rectangle2D bounds = new TextLayout(text, font, CONTEXT).getBounds();
    if (bounds.isEmpty()) {
      return fallback;
    }
    // TextLayout's y runs down.
    return new Box(-bounds.getMinY() / SIZE, -bounds.getMaxY() / SIZE);
  }

  private static Font load(File file) {
    try {
      return Font.createFonts(file)[0].deriveFont(SIZE);
    } catch (FontFormatException | IOException e) {
      return null;
    }
  }
}
