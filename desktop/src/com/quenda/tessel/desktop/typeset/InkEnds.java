package com.quenda.tessel.desktop.typeset;

import com.quenda.tessel.desktop.Upright;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.Rect;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * A line's rectangle grown to hold the whole ink of the letters it cuts: a reader's box may clip
 * the outer half of a first "W" or a last "y", and the engine can only erase what the rectangle
 * it is given covers; what stays out is left as a grey smudge at the line's end. A letter counts
 * as the line's when most of its ink lies inside the box, so the descenders of the line above
 * that reach into it are not taken.
 */
public final class InkEnds {
  // How far beyond the box to look, in line heights: along the line for a clipped letter, across
  // it for ascenders, descenders and accents.
  static final double ALONG_MARGIN = 0.6;
  static final double ACROSS_MARGIN = 0.35;
  // Room left above and below the ink in the rectangle for erasing, in line heights. None is
  // added at the ends: a sign's lettering often runs close to its edge, and the engine's own
  // widening already reaches it.
  static final double ERASE_ACROSS_PAD = 0.2;

  private InkEnds() {}

  /** Where a line's ink is: the whole of it for erasing, and its extent along the line. */
  public record Cover(RotatedRect erase, RotatedRect along) {}

  /** The cover of the line at {@code rect} in {@code rgb} (8-bit, 3 channels). */
  public static Cover of(Mat rgb, RotatedRect rect) {
    double w = rect.size.width;
    double h = rect.size.height;
    if (w < 2 || h < 2) {
      return new Cover(rect, rect);
    }
    int mx = (int) Math.ceil(ALONG_MARGIN * h);
    int my = (int) Math.ceil(ACROSS_MARGIN * h);
    int iw = (int) Math.round(w);
    int ih = (int) Math.round(h);
    Mat ink = inkAround(rgb, rect, new Rect(mx, my, iw, ih));
    double[] box = letterBox(ink, new Rect(mx, my, iw, ih));
    // The box in the line's own axes, relative to the cut's centre.
    double cx = ink.cols() / 2.0;
    double cy = ink.rows() / 2.0;
    ink.release();
    double left = box[0] - cx;
    double right = box[1] - cx;
    double top = box[2] - cy;
    double bottom = box[3] - cy;
    // The engine fills a patch from its border: ink within a pixel or two of the border is
    // smeared into it as a grey smudge, so the rectangle leaves room above and below the ink.
    double pad = ERASE_ACROSS_PAD * h;
    // Half a pixel more at each end: the cut's pixel grid may sit half a pixel off the box's.
    RotatedRect erase = moved(rect, (left + right) / 2, (top + bottom) / 2,
        new Size(right - left + 1, bottom - top + 2 * pad));
    RotatedRect along = moved(rect, (left + right) / 2, 0, new Size(right - left, h));
    return new Cover(erase, along);
  }

  /** The ink (255) in the box's surroundings, cut upright, thresholded as inside the box. */
  private static Mat inkAround(Mat rgb, RotatedRect rect, Rect inner) {
    Size size = new Size(inner.width + 2.0 * inner.x, inner.height + 2.0 * inner.y);
    Mat cut = Upright.cut(rgb, rect.center, rect.angle, 1, size, Imgproc.INTER_LINEAR);
    Mat grey = new Mat();
    Imgproc.cvtColor(cut, grey, Imgproc.COLOR_RGB2GRAY);
    cut.release();
    Mat innerGrey = grey.submat(inner);
    Mat innerInk = new Mat();
    double threshold =
        Imgproc.threshold(innerGrey, innerInk, 0, 255, Imgproc.THRESH_BINARY | Imgproc.THRESH_OTSU);
    // The text is the smaller of the two sides of the threshold.
    boolean darkText = Core.countNonZero(innerInk) > innerInk.total() / 2;
    innerInk.release();
    innerGrey.release();
    Mat ink = new Mat();
    Imgproc.threshold(
        grey, ink, threshold, 255, darkText ? Imgproc.THRESH_BINARY_INV : Imgproc.THRESH_BINARY);
    grey.release();
    return ink;
  }

  /**
   * Left, right, top and bottom (exclusive) of the box grown by every letter mostly inside it.
   */
  private static double[] letterBox(Mat ink, Rect inner) {
    Mat labels = new Mat();
    Mat stats = new Mat();
    Mat centroids = new Mat();
    int n = Imgproc.connectedComponentsWithStats(ink, labels, stats, centroids, 8, CvType.CV_32S);
    int[] inside = new int[n];
    int[] values = new int[(int) labels.total()];
    labels.get(0, 0, values);
    int cols = labels.cols();
    for (int y = inner.y; y < inner.y + inner.height; y++) {
      for (int x = inner.x; x < inner.x + inner.width; x++) {
        inside[values[y * cols + x]]++;
      }
    }
    double left = inner.x;
    double right = inner.x + inner.width;
    double top = inner.y;
    double bottom = inner.y + inner.height;
    for (int k = 1; k < n; k++) {
      int area = (int) stats.get(k, Imgproc.CC_STAT_AREA)[0];
      if (2 * inside[k] <= area) {
        continue;
      }
      int x = (int) stats.get(k, Imgproc.CC_STAT_LEFT)[0];
      int y = (int) stats.get(k, Imgproc.CC_STAT_TOP)[0];
      left = Math.min(left, x);
      right = Math.max(right, x + stats.get(k, Imgproc.CC_STAT_WIDTH)[0]);
      top = Math.min(top, y);
      bottom = Math.max(bottom, y + stats.get(k, Imgproc.CC_STAT_HEIGHT)[0]);
    }
    labels.release();
    stats.release();
    centroids.release();
    return new double[] {left, right, top, bottom};
  }

  /** {@code rect} with its centre moved by (along, across) in its own axes and a new size. */
  private static RotatedRect moved(RotatedRect rect, double along, double across, Size size) {
    double radians = Math.toRadians(rect.angle);
    double c = Math.cos(radians);
    double s = Math.sin(radians);
    Point centre =
        new Point(rect.center.x + along * c - across * s, rect.center.y + along * s + across * c);
    return new RotatedRect(centre, size, rect.angle);
  }
}
