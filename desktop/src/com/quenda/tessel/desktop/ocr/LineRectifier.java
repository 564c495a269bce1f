package com.quenda.tessel.desktop.ocr;

import com.quenda.tessel.desktop.Upright;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.core.Rect;
import org.opencv.core.RotatedRect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * Cuts one line out of the grey picture as an upright, dark-on-light strip for single-line OCR.
 *
 * <p>One affine warp turns the line by its angle, scales it so that its ink is 40 px tall (capitals
 * then about 30 px, where the recogniser is most accurate; it also shrinks big text, which only
 * costs time) and leaves a margin of half the ink height, as the recogniser wants a little clear
 * ground around a line. Light lettering is inverted so that every strip has the same polarity.
 */
final class LineRectifier {
  static final double INK_HEIGHT = 40;
  /** Clear ground kept around the ink, in ink heights; the rest of the margin is painted over. */
  static final double CLEAR_GAP = 0.2;

  private LineRectifier() {}

  static double scale(RotatedRect rect) {
    return Math.max(0.25, Math.min(5, INK_HEIGHT / Math.max(1, rect.size.height)));
  }

  /**
   * Where column {@code x} of the line's strip lies along the line, in the picture's pixels from
   * the rectangle's centre towards its reading end.
   */
  static double alongLine(RotatedRect rect, double x, boolean upsideDown) {
    double scale = scale(rect);
    double h = Math.max(1, rect.size.height);
    int width = (int) Math.ceil((rect.size.width + h) * scale);
    double u = (x - width / 2.0) / scale;
    return upsideDown ? -u : u;
  }

  /** {@code rect} in the grey picture's pixels; {@code upsideDown} turns the strip by 180°. */
  static Mat strip(Mat grey, RotatedRect rect, boolean bright, boolean upsideDown) {
    double h = Math.max(1, rect.size.height);
    double scale = scale(rect);
    double margin = 0.5 * h;
    int width = (int) Math.ceil((rect.size.width + 2 * margin) * scale);
    int height = (int) Math.ceil((h + 2 * margin) * scale);
    Mat out = Upright.cut(grey, rect.center, rect.angle + (upsideDown ? 180 : 0), scale,
        new Size(width, height), Imgproc.INTER_CUBIC);
    if (bright) {
      Core.bitwise_not(out, out);
    }
    clearAround(out,
        new Rect((int) Math.round((margin - CLEAR_GAP * h) * scale),
            (int) Math.round((margin - CLEAR_GAP * h) * scale),
            (int) Math.round((rect.size.width + 2 * CLEAR_GAP * h) * scale),
            (int) Math.round((h + 2 * CLEAR_GAP * h) * scale)));
    return out;
  }

  /**
   * Paints the strip outside {@code keep} with the ground's grey: the margin shows whatever lies
   * around the line (a plate's border or edge, the next line's descenders), which the recogniser
   * would otherwise read as "|", ":" or an extra letter. The ground's grey is the median of the
   * pixels above the Otsu threshold inside the kept part.
   */
  private static void clearAround(Mat strip, Rect keep) {
    int x0 = Math.max(0, keep.x);
    int y0 = Math.max(0, keep.y);
    int x1 = Math.min(strip.cols(), keep.x + keep.width);
    int y1 = Math.min(strip.rows(), keep.y + keep.height);
    if (x1 <= x0 || y1 <= y0) {
      return;
    }
    Rect inner = new Rect(x0, y0, x1 - x0, y1 - y0);
    Mat roi = strip.submat(inner);
    Mat binary = new Mat();
    Imgproc.threshold(roi, binary, 0, 255, Imgproc.THRESH_BINARY | Imgproc.THRESH_OTSU);
    byte[] px = new byte[(int) roi.total()];
    byte[] bin = new byte[px.length];
    roi.clone().get(0, 0, px);
    binary.get(0, 0, bin);
    int[] histogram = new int[256];
    int n = 0;
    for (int i = 0; i < px.length; i++) {
      if (bin[i] != 0) {
        histogram[px[i] & 0xff]++;
        n++;
      }
    }
    int ground = 255;
    for (int v = 0, seen = 0; v < 256; v++) {
      seen += histogram[v];
      if (seen * 2 >= n) {
        ground = v;
        break;
      }
    }
    Mat keepCopy = roi.clone();
    strip.setTo(new Scalar(ground));
    keepCopy.copyTo(strip.submat(inner));
    keepCopy.release();
    binary.release();
    roi.release();
  }
}
