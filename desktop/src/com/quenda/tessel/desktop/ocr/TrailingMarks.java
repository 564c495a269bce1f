package com.quenda.tessel.desktop.ocr;

import com.quenda.tessel.desktop.Upright;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * Widens a line's rectangle over the marks just beyond its ends that are too small to be letter
 * candidates: full stops, commas, colons. Without this the rectangle stops short of the ink (by a
 * few pixels, which the engine's erasing would leave behind) and the strip's cleared margin cuts
 * the mark, so "five." reads as "five,".
 *
 * <p>The line and {@link #REACH} line heights beyond each end are cut out upright and thresholded
 * with Otsu; a blob beyond an end counts as a mark when it lies clear of the cut's edges (a plate's
 * border or the next thing along runs into them), is shaped like a dot or a comma, lies within the
 * line's height and follows the line within a quarter of its height.
 */
final class TrailingMarks {
  static final double REACH = 0.45;

  private TrailingMarks() {}

  /** A dot or a comma: at least 8% of the line height thick, not a sliver, at most 0.6 tall. */
  static boolean markShaped(int w, int h, double lineHeight) {
    int thin = Math.min(w, h);
    int thick = Math.max(w, h);
    return thin >= Math.max(2, 0.08 * lineHeight) && thin >= 0.3 * thick && h <= 0.6 * lineHeight;
  }

  static RotatedRect widen(Mat grey, RotatedRect rect, boolean bright) {
    double w = rect.size.width;
    double h = rect.size.height;
    int reach = (int) Math.ceil(REACH * h);
    int pad = Math.max(2, (int) Math.ceil(0.15 * h));
    int cols = (int) Math.ceil(w) + 2 * reach;
    int rows = (int) Math.ceil(h) + 2 * pad;
    if (reach < 2 || cols * (long) rows > 4_000_000) {
      return rect;
    }
    Mat cut =
        Upright.cut(grey, rect.center, rect.angle, 1, new Size(cols, rows), Imgproc.INTER_LINEAR);
    Mat ink = new Mat();
    Imgproc.threshold(cut, ink, 0, 255,
        (bright ? Imgproc.THRESH_BINARY : Imgproc.THRESH_BINARY_INV) | Imgproc.THRESH_OTSU);
    Mat labels = new Mat();
    Mat stats = new Mat();
    Mat centroids = new Mat();
    int n = Imgproc.connectedComponentsWithStats(ink, labels, stats, centroids, 8, CvType.CV_32S);
    double left = cols / 2.0 - w / 2;
    double right = cols / 2.0 + w / 2;
    double from = left;
    double to = right;
    int before = 0;
    int after = 0;
    for (int i = 1; i < n; i++) {
      int x = (int) stats.get(i, Imgproc.CC_STAT_LEFT)[0];
      int y = (int) stats.get(i, Imgproc.CC_STAT_TOP)[0];
      int bw = (int) stats.get(i, Imgproc.CC_STAT_WIDTH)[0];
      int bh = (int) stats.get(i, Imgproc.CC_STAT_HEIGHT)[0];
      boolean clear = x > 0 && y > 0 && x + bw < cols && y + bh < rows;
      // Within the line's height, give or take a comma's tail; a border's corner sticks out.
      double slack = 0.08 * h;
      boolean within = y >= pad - slack && y + bh <= pad + h + slack;
      if (!clear || !within || !markShaped(bw, bh, h)) {
        continue;
      }
      // A mark follows its word closely; a plate's border stands further off.
      double near = 0.25 * h;
      if (x > right && x - right <= near) {
        to = Math.max(to, x + bw - 1);
        after++;
      } else if (x + bw - 1 < left && left - (x + bw - 1) <= near) {
        from = Math.min(from, x);
        before++;
      }
    }
    // More than two blobs beyond an end are a broken line (a thin border), not a colon.
    from = before > 2 ? left : from;
    to = after > 2 ? right : to;
    cut.release();
    ink.release();
    labels.release();
    stats.release();
    centroids.release();
    if (from == left && to == right) {
      return rect;
    }
    // Shift the centre along the line by the mid-point of the new ends.
    double shift = ((from - left) + (to - right)) / 2;
    double t = Math.toRadians(rect.angle);
    Point c = new Point(rect.center.x + shift * Math.cos(t), rect.center.y + shift * Math.sin(t));
    return new RotatedRect(c, new Size(to - from, h), rect.angle);
  }
}
