package com.quenda.tessel.desktop.video;

import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;

/**
 * A rectangle set at a keyframe relative to a line (where its translation is drawn, what is
 * erased around it), kept in the line's own frame so that it follows the tracked line: its centre
 * as offsets along and across the line in units of the line's width and height, its size as
 * ratios of the line's, its angle as a turn from the line's. Moving, turning or scaling the line
 * moves, turns and scales the rectangle with it.
 */
final class LineAnchored {
  private final double along;
  private final double across;
  private final double widthRatio;
  private final double heightRatio;
  private final double turn;

  private LineAnchored(
      double along, double across, double widthRatio, double heightRatio, double turn) {
    this.along = along;
    this.across = across;
    this.widthRatio = widthRatio;
    this.heightRatio = heightRatio;
    this.turn = turn;
  }

  /** {@code rect} as it stands relative to {@code line}, both in the same frame. */
  static LineAnchored relativeTo(RotatedRect line, RotatedRect rect) {
    double radians = Math.toRadians(line.angle);
    double ux = Math.cos(radians);
    double uy = Math.sin(radians);
    double dx = rect.center.x - line.center.x;
    double dy = rect.center.y - line.center.y;
    double w = Math.max(line.size.width, 1e-9);
    double h = Math.max(line.size.height, 1e-9);
    return new LineAnchored((dx * ux + dy * uy) / w, (-dx * uy + dy * ux) / h, rect.size.width / w,
        rect.size.height / h, rect.angle - line.angle);
  }

  /** The rectangle placed on {@code line} where the line now stands. */
  RotatedRect on(RotatedRect line) {
    double radians = Math.toRadians(line.angle);
    double ux = Math.cos(radians);
    double uy = Math.sin(radians);
    double a = along * line.size.width;
    double c = across * line.size.height;
    Point centre = new Point(line.center.x + a * ux - c * uy, line.center.y + a * uy + c * ux);
    return new RotatedRect(centre,
        new Size(widthRatio * line.size.width, heightRatio * line.size.height), line.angle + turn);
  }
}
