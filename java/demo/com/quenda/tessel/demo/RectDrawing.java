package com.quenda.tessel.demo;

import java.util.ArrayList;
import java.util.List;
import org.opencv.core.Mat;
import org.opencv.core.MatOfPoint;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/** Draws rectangles in the bridges' five-value layout onto an image. */
final class RectDrawing {
  private RectDrawing() {}

  static RotatedRect rect(double[] rects, int index) {
    int at = 5 * index;
    return new RotatedRect(
        new Point(rects[at], rects[at + 1]), new Size(rects[at + 2], rects[at + 3]), rects[at + 4]);
  }

  static boolean isZero(double[] rects, int index) {
    for (int k = 0; k < 5; ++k) {
      if (rects[5 * index + k] != 0.0) {
        return false;
      }
    }
    return true;
  }

  /** Outlines every non-zero rectangle. */
  static void outline(Mat image, double[] rects, Scalar colour, int thickness) {
    List<MatOfPoint> polygons = new ArrayList<>();
    for (int i = 0; i < rects.length / 5; ++i) {
      if (isZero(rects, i)) {
        continue;
      }
      Point[] corners = new Point[4];
      rect(rects, i).points(corners);
      polygons.add(new MatOfPoint(corners));
    }
    Imgproc.polylines(image, polygons, true, colour, thickness, Imgproc.LINE_AA);
    for (MatOfPoint polygon : polygons) {
      polygon.release();
    }
  }
}
