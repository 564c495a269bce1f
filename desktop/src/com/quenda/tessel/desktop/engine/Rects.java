package com.quenda.tessel.desktop.engine;

import java.util.List;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;

/** Rotated rectangles as the engine's bridges take them: five doubles each. */
public final class Rects {
  private Rects() {}

  /** Centre x, centre y, width, height, angle in degrees, per rectangle. */
  public static double[] pack(List<RotatedRect> rects) {
    double[] values = new double[5 * rects.size()];
    for (int i = 0; i < rects.size(); i++) {
      RotatedRect r = rects.get(i);
      values[5 * i] = r.center.x;
      values[5 * i + 1] = r.center.y;
      values[5 * i + 2] = r.size.width;
      values[5 * i + 3] = r.size.height;
      values[5 * i + 4] = r.angle;
    }
    return values;
  }

  /** Rectangle {@code i} of a packed array. */
  public static RotatedRect at(double[] values, int i) {
    return new RotatedRect(new Point(values[5 * i], values[5 * i + 1]),
        new Size(values[5 * i + 2], values[5 * i + 3]), values[5 * i + 4]);
  }
}
