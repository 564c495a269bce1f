package com.quenda.tessel.desktop;

import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * Cuts a turned region out of a picture, upright: the output of {@code size} pixels is centred on
 * {@code centre}, the picture turned by {@code angleDegrees} (a rotated rectangle's angle, so that
 * its width runs along x) and scaled by {@code scale}. Outside the picture the edge is repeated.
 */
public final class Upright {
  private Upright() {}

  public static Mat cut(
      Mat picture, Point centre, double angleDegrees, double scale, Size size, int interpolation) {
    Mat m = Imgproc.getRotationMatrix2D(centre, angleDegrees, scale);
    m.put(0, 2, m.get(0, 2)[0] - centre.x + size.width / 2.0);
    m.put(1, 2, m.get(1, 2)[0] - centre.y + size.height / 2.0);
    Mat out = new Mat();
    Imgproc.warpAffine(picture, out, m, size, interpolation, Core.BORDER_REPLICATE);
    m.release();
    return out;
  }
}
