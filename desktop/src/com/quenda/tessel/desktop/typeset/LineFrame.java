package com.quenda.tessel.desktop.typeset;

import org.opencv.core.Point;
import org.opencv.core.RotatedRect;

/**
 * A line's place measured along an axis (the direction its text runs, degrees as in a rotated
 * rectangle) and across it (down the page): where it starts, ends and stands.
 */
final class LineFrame {
  final double left;
  final double right;
  final double across;
  final double height;

  LineFrame(RotatedRect rect, double axisDegrees) {
    double radians = Math.toRadians(axisDegrees);
    double ux = Math.cos(radians);
    double uy = Math.sin(radians);
    Point c = rect.center;
    double along = c.x * ux + c.y * uy;
    double halfWidth =
        rect.size.width / 2 * Math.abs(Math.cos(Math.toRadians(rect.angle - axisDegrees)));
    this.left = along - halfWidth;
    this.right = along + halfWidth;
    this.across = -c.x * uy + c.y * ux;
    this.height = rect.size.height;
  }

  double centre() {
    return (left + right) / 2;
  }

  double width() {
    return right - left;
  }

  /** The angle between two rectangles' text directions, 0..90 degrees. */
  static double angleBetween(RotatedRect a, RotatedRect b) {
    double d = Math.abs(a.angle - b.angle) % 180;
    return Math.min(d, 180 - d);
  }
}
