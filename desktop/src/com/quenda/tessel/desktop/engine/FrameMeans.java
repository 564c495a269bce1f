package com.quenda.tessel.desktop.engine;

import com.quenda.tessel.inpainting.InpaintingJNI;
import org.opencv.core.Mat;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * The frame's mean colour under each patch, through the engine's colour-statistics request: when
 * the light changes, the ratio of now to when a patch was cut is the gain that keeps the patch
 * matching the surface around it. Exposure multiplies colours, and the mean, unlike the spread,
 * does not move when the camera shakes.
 */
public final class FrameMeans {
  private FrameMeans() {}

  /** Mean R, G, B under each rectangle (five values each), three per rectangle. */
  public static double[] under(Mat rgb, double[] rects) {
    int n = rects.length / 5;
    double[] means = new double[3 * n];
    if (n == 0) {
      return means;
    }
    // The request takes a half-resolution frame with full-resolution rectangles.
    Mat half = new Mat();
    Imgproc.resize(rgb, half, new Size(rgb.cols() / 2, rgb.rows() / 2), 0, 0, Imgproc.INTER_AREA);
    InpaintingJNI.CalculateMeansStdDevs(half.getNativeObjAddr(), rects, means, new double[3 * n]);
    half.release();
    return means;
  }

  /** Per channel, now over then; 1 where the reference is too dark to tell. */
  public static double[] gains(double[] now, double[] then) {
    double[] gains = new double[now.length];
    for (int i = 0; i < now.length; i++) {
      gains[i] = then[i] > 1.0 ? now[i] / then[i] : 1.0;
    }
    return gains;
  }
}
