package com.quenda.tessel.desktop.bench;

import com.quenda.tessel.desktop.Upright;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.RotatedRect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * The height of a line's first capital, measured the same way in the original and in the
 * translated picture: the line is cut upright, its ink is what lies near the text colour, the
 * baseline is the row where most ink columns end, and the capital is the first run of ink columns.
 */
final class CapHeight {
  // Ink within this RGB distance of the text colour; the antialiased edge counts half in and out.
  private static final double INK_DISTANCE = 90;

  private CapHeight() {}

  /** Pixels from the first capital's top to the baseline; 0 when no ink is found. */
  static double of(Mat rgb, RotatedRect rect, int packedColor) {
    Mat ink = ink(upright(rgb, rect), packedColor);
    int rows = ink.rows();
    int cols = ink.cols();
    int[] bottomCount = new int[rows];
    int[] top = new int[cols];
    int[] bottom = new int[cols];
    byte[] pixels = new byte[rows * cols];
    ink.get(0, 0, pixels);
    ink.release();
    for (int x = 0; x < cols; x++) {
      top[x] = -1;
      for (int y = 0; y < rows; y++) {
        if (pixels[y * cols + x] != 0) {
          if (top[x] < 0) {
            top[x] = y;
          }
          bottom[x] = y;
        }
      }
      if (top[x] >= 0) {
        ++bottomCount[bottom[x]];
      }
    }
    int baseline = 0;
    for (int y = 1; y < rows; y++) {
      baseline = bottomCount[y] > bottomCount[baseline] ? y : baseline;
    }
    int x = 0;
    while (x < cols && top[x] < 0) {
      ++x;
    }
    int capTop = rows;
    for (; x < cols && top[x] >= 0; x++) {
      capTop = Math.min(capTop, top[x]);
    }
    return capTop < baseline ? baseline - capTop + 1 : 0;
  }

  private static Mat upright(Mat rgb, RotatedRect rect) {
    // A margin above and below: the drawn text may sit a little outside the OCR box.
    return Upright.cut(rgb, rect.center, rect.angle, 1,
        new Size(rect.size.width, rect.size.height * 1.6), Imgproc.INTER_LINEAR);
  }

  private static Mat ink(Mat upright, int packed) {
    Mat difference = new Mat();
    Core.absdiff(upright, new Scalar(packed & 0xFF, (packed >> 8) & 0xFF, (packed >> 16) & 0xFF),
        difference);
    difference.convertTo(difference, CvType.CV_32FC3);
    Core.multiply(difference, difference, difference);
    Mat distance = new Mat();
    Core.transform(difference, distance, new Mat(1, 3, CvType.CV_32F, new Scalar(1)));
    Mat ink = new Mat();
    Imgproc.threshold(distance, ink, INK_DISTANCE * INK_DISTANCE, 255, Imgproc.THRESH_BINARY_INV);
    ink.convertTo(ink, CvType.CV_8U);
    upright.release();
    difference.release();
    distance.release();
    return ink;
  }
}
