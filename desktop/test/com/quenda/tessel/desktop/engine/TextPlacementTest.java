package com.quenda.tessel.desktop.engine;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertSame;

import org.junit.jupiter.api.Test;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;

/**
 * Where a translation is drawn over its original's OCR box: the translation's capitals must come
 * out as tall as the original's, and stand where they stood, on a level line or a turned one.
 */
class TextPlacementTest {
  static final double H = 30;

  static RotatedRect box(double angle) {
    return new RotatedRect(new Point(400, 300), new Size(240, H), angle);
  }

  /** The middle of the box's top edge: where the capitals start. */
  static Point top(RotatedRect r) {
    double t = Math.toRadians(r.angle);
    double half = r.size.height / 2;
    return new Point(r.center.x + half * Math.sin(t), r.center.y - half * Math.cos(t));
  }

  static void assertPlaced(RotatedRect ocr, RotatedRect text, double height) {
    assertEquals(height, text.size.height, 1e-9, "height");
    assertEquals(ocr.size.width, text.size.width, 1e-9, "width");
    assertEquals(ocr.angle, text.angle, 1e-9, "angle");
    assertEquals(top(ocr).x, top(text).x, 1e-9, "top edge x");
    assertEquals(top(ocr).y, top(text).y, 1e-9, "top edge y");
  }

  @Test
  void capitalsOverLowercaseGrowTheBoxDownToTheDescenders() {
    for (double angle : new double[] {0, -12, 35, 90, 180}) {
      RotatedRect ocr = box(angle);
      // The box of "NO PARKING" ends at the baseline; the Spanish has lowercase letters.
      assertPlaced(ocr, TextPlacement.textRect(ocr, "NO PARKING", "Prohibido aparcar"), H * 4 / 3);
      // Lowercase without descenders also ends at the baseline.
      assertPlaced(ocr, TextPlacement.textRect(ocr, "Exit", "Salida"), H * 4 / 3);
    }
    // Level: the centre moves down by a sixth of the height, the top stays at y = 285.
    RotatedRect grown = TextPlacement.textRect(box(0), "WAY OUT", "Salida");
    assertEquals(305, grown.center.y, 1e-9);
    assertEquals(400, grown.center.x, 1e-9);
  }

  @Test
  void descendersOverCapitalsShrinkTheBoxToTheBaseline() {
    for (double angle : new double[] {0, 20, -90}) {
      RotatedRect ocr = box(angle);
      assertPlaced(ocr, TextPlacement.textRect(ocr, "Keep going", "SIGA"), H * 0.75);
    }
  }

  @Test
  void textsOfTheSameKindOrWithoutCaseKeepTheOcrBox() {
    RotatedRect ocr = box(7);
    assertSame(
        ocr, TextPlacement.textRect(ocr, "Please keep the door closed", "Mantenga la puerta"));
    assertSame(ocr, TextPlacement.textRect(ocr, "STAFF ONLY", "SOLO PERSONAL"));
    assertSame(ocr, TextPlacement.textRect(ocr, "Way out", "出口"));
    assertSame(ocr, TextPlacement.textRect(ocr, "NO PARKING", "123"));
  }
}
