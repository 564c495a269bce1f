package com.quenda.tessel.desktop.ocr;

import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.core.RotatedRect;
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

  private LineRectifier() {}

  /** {@code rect} in the grey picture's pixels; {@code upsideDown} turns the strip by 180°. */
  static Mat strip(Mat grey, RotatedRect rect, boolean bright, boolean upsideDown) {
    double h = Math.max(1, rect.size.height);
    double scale = Math.max(0.25, Math.min(5, INK_HEIGHT / h));
    double margin = 0.5 * h;
    int width = (int) Math.ceil((rect.size.width + 2 * margin) * scale);
    int height = (int) Math.ceil((h + 2 * margin) * scale);
    Mat m = Imgproc.getRotationMatrix2D(rect.center, rect.angle + (upsideDown ? 180 : 0), scale);
    m.put(0, 2, m.get(0, 2)[0] - rect.center.x + width / 2.0);
    m.put(1, 2, m.get(1, 2)[0] - rect.center.y + height / 2.0);
    Mat out = new Mat();
    Imgproc.warpAffine(
        grey, out, m, new Size(width, height), Imgproc.INTER_CUBIC, Core.BORDER_REPLICATE);
    m.release();
    if (bright) {
      Core.bitwise_not(out, out);
    }
    return out;
  }
}
