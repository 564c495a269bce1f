package com.quenda.tessel.desktop.engine;

import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;

/**
 * Where a translation's text is drawn, given the OCR box of the original line. The renderer fits
 * the font's ink box for the kind of text it draws into the text rectangle: from the capitals' top
 * to the descenders' bottom for text with lowercase letters, to the baseline for capitals only.
 * An OCR box hugs the original's own ink, so it matches the first kind only when the original has
 * descenders, the second only when it has none. Where the two texts are of different kinds the
 * rectangle is grown or shrunk along its height, keeping the capitals' top in place, so that the
 * translation's capitals come out as tall as the original's. The patch rectangle stays as it is.
 */
public final class TextPlacement {
  // A line's descenders reach about a third of the capital height below the baseline: a box from
  // the capitals' top to the baseline is 0.75 of one reaching the descenders' bottom.
  static final double CAPS_TO_FULL = 1 / 0.75;

  private TextPlacement() {}

  public static RotatedRect textRect(RotatedRect ocr, String original, String translation) {
    if (!hasCasedLetter(translation)) {
      return ocr; // CJK and other caseless scripts: the renderer's own ink box is right
    }
    boolean originalReachesDescenders = hasLowercase(original) && hasDescender(original);
    boolean translationHasLowercase = hasLowercase(translation);
    if (!originalReachesDescenders && translationHasLowercase) {
      return grown(ocr, CAPS_TO_FULL);
    }
    if (originalReachesDescenders && !translationHasLowercase) {
      return grown(ocr, 1 / CAPS_TO_FULL);
    }
    return ocr;
  }

  /** {@code rect} scaled by {@code factor} in height, its top edge kept. */
  private static RotatedRect grown(RotatedRect rect, double factor) {
    double h = rect.size.height;
    double shift = (factor - 1) * h / 2;
    double radians = Math.toRadians(rect.angle);
    // The rectangle's own "down", in image coordinates (y down, angle clockwise).
    Point centre = new Point(
        rect.center.x - shift * Math.sin(radians), rect.center.y + shift * Math.cos(radians));
    return new RotatedRect(centre, new Size(rect.size.width, h * factor), rect.angle);
  }

  private static boolean hasLowercase(String text) {
    return text.codePoints().anyMatch(Character::isLowerCase);
  }

  private static boolean hasCasedLetter(String text) {
    return text.codePoints().anyMatch(c -> Character.isLowerCase(c) || Character.isUpperCase(c));
  }

  private static boolean hasDescender(String text) {
    return text.chars().anyMatch(c -> "gjpqy".indexOf(c) >= 0);
  }
}
