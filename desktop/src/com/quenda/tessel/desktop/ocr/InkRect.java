package com.quenda.tessel.desktop.ocr;

import java.util.ArrayList;
import java.util.List;
import org.opencv.core.CvType;
import org.opencv.core.MatOfPoint2f;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * The rectangle hugging a line's ink, its angle taken from the baseline.
 *
 * <p>The minimum-area rectangle of the ink is a first guess: for a short line its bottom side may
 * run from a capital's foot to a descender's tip, a few degrees off. The baseline is then fitted
 * through the lowest point of every letter with RANSAC (most feet within 6% of the line height of
 * one line), so descenders drop out as outliers; finally the ink is measured along that direction.
 */
final class InkRect {
  /** A first guess further than this from the candidates' fitted direction is not trusted. */
  private static final double MAX_GUESS_ERROR = 8;
  /** The baseline can only correct the guess by this much. */
  private static final double MAX_BASELINE_TURN = 10;

  private InkRect() {}

  /** Width along the row, angle in (-90, 90]; null if the parts hold no pixels. */
  static RotatedRect of(List<Component> parts, double direction) {
    List<int[]> xy = new ArrayList<>();
    int n = 0;
    for (Component c : parts) {
      int[] p = c.xy();
      xy.add(p);
      n += p.length / 2;
    }
    if (n < 3) {
      return null;
    }
    float[] all = new float[2 * n];
    int k = 0;
    for (int[] p : xy) {
      for (int v : p) {
        all[k++] = v;
      }
    }
    MatOfPoint2f pts = new MatOfPoint2f();
    pts.create(n, 1, CvType.CV_32FC2);
    pts.put(0, 0, all);
    RotatedRect guess = alongRow(Imgproc.minAreaRect(pts), direction);
    pts.release();
    double angle = guess.angle;
    if (Math.abs(fold(angle - direction)) > MAX_GUESS_ERROR) {
      angle = direction;
    }
    angle = baseline(xy, angle, guess.size.height);
    return measureAlong(all, angle);
  }

  /** The direction of the line through most letters' feet, near {@code angle}. */
  static double baseline(List<int[]> parts, double angle, double height) {
    double t = Math.toRadians(angle);
    double cos = Math.cos(t);
    double sin = Math.sin(t);
    int m = parts.size();
    double[] fu = new double[m];
    double[] fv = new double[m];
    for (int i = 0; i < m; i++) {
      int[] p = parts.get(i);
      double bestV = -Double.MAX_VALUE;
      for (int j = 0; j < p.length; j += 2) {
        double v = -p[j] * sin + p[j + 1] * cos;
        if (v > bestV) {
          bestV = v;
          fu[i] = p[j] * cos + p[j + 1] * sin;
        }
      }
      fv[i] = bestV;
    }
    double tolerance = Math.max(1.0, 0.06 * height);
    double maxSlope = Math.tan(Math.toRadians(MAX_BASELINE_TURN));
    int bestCount = 0;
    double bestSlope = 0;
    for (int i = 0; i < m; i++) {
      for (int j = i + 1; j < m; j++) {
        double du = fu[j] - fu[i];
        if (Math.abs(du) < height) {
          continue; // feet too close together to give a direction
        }
        double slope = (fv[j] - fv[i]) / du;
        if (Math.abs(slope) > maxSlope) {
          continue;
        }
        int count = 0;
        for (int q = 0; q < m; q++) {
          if (Math.abs(fv[i] + slope * (fu[q] - fu[i]) - fv[q]) <= tolerance) {
            count++;
          }
        }
        if (count > bestCount) {
          bestCount = count;
          bestSlope = leastSquares(fu, fv, fv[i] - slope * fu[i], slope, tolerance);
        }
      }
    }
    if (bestCount < 3) {
      return angle;
    }
    return angle + Math.toDegrees(Math.atan(bestSlope));
  }

  /** The slope of the least-squares line through the points within tolerance of a line. */
  private static double leastSquares(double[] u, double[] v, double b, double slope, double tol) {
    double su = 0;
    double sv = 0;
    double suu = 0;
    double suv = 0;
    int n = 0;
    for (int q = 0; q < u.length; q++) {
      if (Math.abs(b + slope * u[q] - v[q]) <= tol) {
        su += u[q];
        sv += v[q];
        suu += u[q] * u[q];
        suv += u[q] * v[q];
        n++;
      }
    }
    double d = n * suu - su * su;
    return Math.abs(d) < 1e-9 ? slope : (n * suv - su * sv) / d;
  }

  /** The same rectangle described with its width on the side nearest the row's direction. */
  static RotatedRect alongRow(RotatedRect r, double direction) {
    double a = fold(r.angle);
    double w = r.size.width;
    double h = r.size.height;
    if (Math.abs(fold(a - direction)) > 45) {
      a = fold(a + 90);
      double t = w;
      w = h;
      h = t;
    }
    return new RotatedRect(r.center, new Size(w, h), a);
  }

  /** The extent of interleaved x, y points along {@code angle} and across it. */
  static RotatedRect measureAlong(float[] p, double angle) {
    double t = Math.toRadians(angle);
    double ux = Math.cos(t);
    double uy = Math.sin(t);
    double minU = Double.MAX_VALUE;
    double maxU = -Double.MAX_VALUE;
    double minV = Double.MAX_VALUE;
    double maxV = -Double.MAX_VALUE;
    for (int i = 0; i < p.length; i += 2) {
      double u = p[i] * ux + p[i + 1] * uy;
      double v = -p[i] * uy + p[i + 1] * ux;
      minU = Math.min(minU, u);
      maxU = Math.max(maxU, u);
      minV = Math.min(minV, v);
      maxV = Math.max(maxV, v);
    }
    double cu = (minU + maxU) / 2;
    double cv = (minV + maxV) / 2;
    return new RotatedRect(new Point(cu * ux - cv * uy, cu * uy + cv * ux),
        new Size(maxU - minU, maxV - minV), fold(angle));
  }

  /** An undirected angle brought into (-90, 90]. */
  static double fold(double a) {
    double f = a % 180;
    if (f <= -90) {
      f += 180;
    } else if (f > 90) {
      f -= 180;
    }
    return f;
  }
}
