package com.quenda.tessel.desktop.scenes;

import java.awt.Color;
import java.awt.Font;
import java.awt.Graphics2D;
import java.awt.RenderingHints;
import java.awt.Shape;
import java.awt.font.FontRenderContext;
import java.awt.geom.AffineTransform;
import java.awt.geom.PathIterator;
import java.awt.geom.Rectangle2D;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;

/**
 * One line of text as glyph outlines, with the exact bounds of its ink. The bounds come from the
 * flattened outlines, not from font metrics, because the truth a reader is measured against is
 * the rectangle hugging the drawn ink.
 */
final class Lettering {
  private static final FontRenderContext CONTEXT = new FontRenderContext(null, true, true);

  final String text;
  private final Shape outline;
  /** Ink bounds around the baseline origin. */
  final Rectangle2D ink;

  Lettering(String text, Font font) {
    this.text = text;
    this.outline = font.createGlyphVector(CONTEXT, text).getOutline();
    this.ink = flattenedBounds(outline);
  }

  /** A font size whose capital letters are {@code capHeight} pixels tall. */
  static Font withCapHeight(Font font, double capHeight) {
    Font unit = font.deriveFont(100f);
    double cap = flattenedBounds(unit.createGlyphVector(CONTEXT, "H").getOutline()).getHeight();
    return font.deriveFont((float) (100 * capHeight / cap));
  }

  /**
   * Draws the text with its ink centred on (cx, cy), its baseline turned by {@code angle} degrees
   * (clockwise on screen, as OpenCV's), and returns the ink's rectangle in pixel coordinates.
   */
  RotatedRect draw(Graphics2D g, Color colour, double cx, double cy, double angle) {
    AffineTransform saved = g.getTransform();
    g.translate(cx, cy);
    g.rotate(Math.toRadians(angle));
    g.translate(-ink.getCenterX(), -ink.getCenterY());
    g.setColor(colour);
    g.setRenderingHint(RenderingHints.KEY_ANTIALIASING, RenderingHints.VALUE_ANTIALIAS_ON);
    g.fill(outline);
    g.setTransform(saved);
    return truth(g.getTransform(), cx, cy, angle);
  }

  /**
   * The ink rectangle after the graphics' transform, which may turn the whole picture. Java2D's
   * pixel i covers [i, i+1) while OpenCV's pixel i is centred on i, hence the half pixel.
   */
  RotatedRect truth(AffineTransform frame, double cx, double cy, double angle) {
    java.awt.geom.Point2D c = frame.transform(new java.awt.geom.Point2D.Double(cx, cy), null);
    double frameAngle = Math.toDegrees(Math.atan2(frame.getShearY(), frame.getScaleX()));
    double a = normalise(angle + frameAngle);
    return new RotatedRect(
        new Point(c.getX() - 0.5, c.getY() - 0.5), new Size(ink.getWidth(), ink.getHeight()), a);
  }

  /** Brings an angle into (-180, 180]. */
  static double normalise(double angle) {
    double a = angle % 360;
    if (a <= -180) {
      a += 360;
    } else if (a > 180) {
      a -= 360;
    }
    return a;
  }

  private static Rectangle2D flattenedBounds(Shape shape) {
    double minX = Double.MAX_VALUE;
    double minY = Double.MAX_VALUE;
    double maxX = -Double.MAX_VALUE;
    double maxY = -Double.MAX_VALUE;
    double[] p = new double[6];
    for (PathIterator it = shape.getPathIterator(null, 0.01); !it.isDone(); it.next()) {
      if (it.currentSegment(p) != PathIterator.SEG_CLOSE) {
        minX = Math.min(minX, p[0]);
        maxX = Math.max(maxX, p[0]);
        minY = Math.min(minY, p[1]);
        maxY = Math.max(maxY, p[1]);
      }
    }
    return new Rectangle2D.Double(minX, minY, maxX - minX, maxY - minY);
  }
}
