package com.quenda.tessel.desktop.photo;

import com.quenda.tessel.desktop.Upright;
import java.util.ArrayList;
import java.util.Collections;
import java.util.List;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.core.MatOfPoint;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * How heavy a line's strokes are, as a share of its height: the translation is drawn in a bold
 * font where the original was bold. A stroke of width w and length L covers w·L pixels inside a
 * border of 2·L, so twice the ink's area over its border length is the mean stroke width (after
 * Otsu's threshold, which keeps most of the antialiased edge). The line's height varies by a
 * quarter with its words (descenders or none), less than bold and regular strokes differ.
 */
public final class StrokeWeight {
  private StrokeWeight() {}

  /** Median stroke ratio of the lines at {@code rects} in {@code rgb}; 0 without lines. */
  public static double medianRatio(Mat rgb, List<RotatedRect> rects) {
    List<Double> ratios = new ArrayList<>();
    for (RotatedRect rect : rects) {
      double ratio = ratio(rgb, rect);
      if (ratio > 0) {
        ratios.add(ratio);
      }
    }
    if (ratios.isEmpty()) {
      return 0;
    }
    Collections.sort(ratios);
    return ratios.get(ratios.size() / 2);
  }

  private static double ratio(Mat rgb, RotatedRect rect) {
    if (rect.size.height < 4 || rect.size.width < 4) {
      return 0;
    }
    Mat upright = Upright.cut(rgb, rect.center, rect.angle, 1,
        new Size(Math.round(rect.size.width), Math.round(rect.size.height)), Imgproc.INTER_LINEAR);
    Mat grey = new Mat();
    Imgproc.cvtColor(upright, grey, Imgproc.COLOR_RGB2GRAY);
    Mat ink = new Mat();
    Imgproc.threshold(grey, ink, 0, 255, Imgproc.THRESH_BINARY | Imgproc.THRESH_OTSU);
    // The text is the smaller of the two sides of the threshold.
    if (Core.countNonZero(ink) > ink.total() / 2) {
      Core.bitwise_not(ink, ink);
    }
    List<MatOfPoint> contours = new ArrayList<>();
    Imgproc.findContours(ink, contours, new Mat(), Imgproc.RETR_LIST, Imgproc.CHAIN_APPROX_NONE);
    double border = 0;
    for (MatOfPoint contour : contours) {
      border += contour.total();
      contour.release();
    }
    double area = Core.countNonZero(ink);
    upright.release();
    grey.release();
    ink.release();
    return border > 0 ? 2 * area / border / rect.size.height : 0;
  }
}
