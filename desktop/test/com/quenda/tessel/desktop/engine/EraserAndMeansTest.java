package com.quenda.tessel.desktop.engine;

import static org.junit.jupiter.api.Assertions.assertArrayEquals;
import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertTrue;

import java.util.List;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.MatOfDouble;
import org.opencv.core.Point;
import org.opencv.core.Rect;
import org.opencv.core.RotatedRect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * What the engine gives the host for a line: a patch with the text gone and the text's colour,
 * and the light under a patch, from which the renderer's light correction follows.
 */
class EraserAndMeansTest {
  // R, G, B of the wall and of the ink.
  static final Scalar WALL = new Scalar(210, 190, 150);
  static final Scalar INK = new Scalar(30, 40, 110);

  @BeforeAll
  static void load() {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
  }

  /** A 640x360 wall with "WAY OUT" written at (200, 200); returns the text's box. */
  static RotatedRect writeSign(Mat rgb) {
    rgb.setTo(WALL);
    Imgproc.putText(rgb, "WAY OUT", new Point(200, 200), Imgproc.FONT_HERSHEY_SIMPLEX, 2, INK, 6);
    Size text = Imgproc.getTextSize("WAY OUT", Imgproc.FONT_HERSHEY_SIMPLEX, 2, 6, new int[1]);
    return new RotatedRect(new Point(200 + text.width / 2, 200 - text.height / 2),
        new Size(text.width + 6, text.height + 6), 0);
  }

  @Test
  void aPatchHasTheWallWithoutTheTextAndTheInkColourIsReported() throws Exception {
    Mat rgb = new Mat(360, 640, CvType.CV_8UC3);
    RotatedRect line = writeSign(rgb);
    Eraser.Patches patches = Eraser.erase(rgb, List.of(line));
    try {
      Mat patch = patches.overlays.get(0);
      assertEquals(CvType.CV_8UC4, patch.type());
      assertTrue(patch.cols() > 100 && patch.rows() > 20, patch.toString());
      Mat middle = patch.submat(
          new Rect(patch.cols() / 4, patch.rows() / 4, patch.cols() / 2, patch.rows() / 2));
      MatOfDouble mean = new MatOfDouble();
      MatOfDouble spread = new MatOfDouble();
      Core.meanStdDev(middle, mean, spread);
      double[] m = mean.toArray();
      double[] s = spread.toArray();
      for (int c = 0; c < 3; c++) {
        assertEquals(WALL.val[c], m[c], 12, "channel " + c + " of the patch");
        assertTrue(s[c] < 15, "the text shows through: spread " + s[c]);
      }
      // 0xFF000000 | B << 16 | G << 8 | R, near the ink.
      int color = patches.colors[0];
      assertEquals(0xFF, color >>> 24);
      assertEquals(INK.val[0], color & 0xFF, 40, "red");
      assertEquals(INK.val[1], (color >> 8) & 0xFF, 40, "green");
      assertEquals(INK.val[2], (color >> 16) & 0xFF, 40, "blue");
    } finally {
      patches.release();
      rgb.release();
    }
  }

  @Test
  void noLinesNeedNoEngineCall() throws Exception {
    Eraser.Patches none = Eraser.erase(new Mat(), List.of());
    assertEquals(0, none.overlays.size());
    assertEquals(0, none.patchRects.length);
  }

  @Test
  void theMeanUnderAPatchIsItsColourInRgbOrderAndFollowsTheLight() {
    Mat rgb = new Mat(360, 640, CvType.CV_8UC3, WALL);
    Imgproc.rectangle(rgb, new Point(400, 0), new Point(639, 359), INK, -1);
    // Full-resolution rectangles, one on each side; the request works on half the frame.
    double[] rects = {150, 180, 120, 40, 10, 520, 180, 120, 40, -10};
    double[] before = FrameMeans.under(rgb, rects);
    assertArrayEquals(new double[] {210, 190, 150, 30, 40, 110}, before, 1.0);

    Core.multiply(rgb, new Scalar(0.6, 0.6, 0.6), rgb);
    double[] gains = FrameMeans.gains(FrameMeans.under(rgb, rects), before);
    for (double gain : gains) {
      assertEquals(0.6, gain, 0.02);
    }
    // A reference too dark to tell gives no correction.
    assertArrayEquals(new double[] {1, 5, 1},
        FrameMeans.gains(new double[] {0, 10, 7}, new double[] {0, 2, 1}), 1e-12);
    rgb.release();
  }
}
