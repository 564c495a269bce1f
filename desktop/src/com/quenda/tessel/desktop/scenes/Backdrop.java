package com.quenda.tessel.desktop.scenes;

import java.awt.Color;
import java.awt.GradientPaint;
import java.awt.Graphics2D;
import java.awt.Polygon;
import java.awt.image.BufferedImage;
import java.util.Random;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.MatOfPoint;
import org.opencv.core.Point;
import org.opencv.core.Scalar;
import org.opencv.imgproc.Imgproc;

/**
 * Procedural photo backgrounds. Each is painted in three layers: a soft far layer (gradients and
 * shapes blurred as if out of focus), a sharp near texture (bricks, plaster specks, window
 * frames: the patterns a text detector must not take for letters). {@link #shadow} is laid over
 * the finished scene, signs included.
 */
public enum Backdrop {
  SKY_OVER_WALL,
  BRICK_WALL,
  PLASTER_WALL,
  FACADE;

  /** Paints the backdrop over the whole canvas. */
  void paint(BufferedImage canvas, Random random) {
    int w = canvas.getWidth();
    int h = canvas.getHeight();
    Graphics2D g = canvas.createGraphics();
    paintFar(g, w, h, random);
    g.dispose();
    Mat m = Pictures.toRgb(canvas);
    Pictures.blur(m, Math.max(w, h) / 200.0);
    Pictures.fromRgb(m, canvas);
    g = canvas.createGraphics();
    paintNear(g, w, h, random);
    g.dispose();
    m.release();
  }

  private void paintFar(Graphics2D g, int w, int h, Random r) {
    switch (this) {
      case SKY_OVER_WALL:
        g.setPaint(new GradientPaint(
            0, 0, new Color(95, 150, 215), 0, h * 0.4f, new Color(200, 220, 240)));
        g.fillRect(0, 0, w, h);
        for (int i = 0; i < 14; i++) {
          g.setColor(jitter(new Color(50, 100, 45), r, 25));
          int d = 60 + r.nextInt(140);
          g.fillOval(r.nextInt(w) - d / 2, (int) (h * 0.3) - d / 2 + r.nextInt(60), d, d);
        }
        g.setPaint(new GradientPaint(
            0, h * 0.4f, new Color(214, 196, 170), w, h, new Color(180, 160, 135)));
        g.fillRect(0, (int) (h * 0.4), w, h);
        break;
      case BRICK_WALL:
        g.setColor(new Color(150, 150, 145));
        g.fillRect(0, 0, w, h);
        break;
      case PLASTER_WALL:
      case FACADE:
        Color base = this == FACADE ? new Color(220, 205, 180) : new Color(200, 195, 185);
        g.setPaint(new GradientPaint(0, 0, base.brighter(), w, h, base.darker()));
        g.fillRect(0, 0, w, h);
        for (int i = 0; i < 40; i++) {
          g.setColor(jitter(base, r, 18));
          int d = 40 + r.nextInt(160);
          g.fillOval(r.nextInt(w) - d / 2, r.nextInt(h) - d / 2, d, d);
        }
        break;
    }
  }

  private void paintNear(Graphics2D g, int w, int h, Random r) {
    switch (this) {
      case BRICK_WALL:
        bricks(g, w, h, r);
        break;
      case PLASTER_WALL:
        specks(g, w, h, r, new Color(120, 115, 105), 2500);
        g.setColor(new Color(90, 90, 95));
        g.fillRect(w / 7, 0, 14, h);
        break;
      case FACADE:
        specks(g, w, h, r, new Color(150, 135, 115), 1500);
        windows(g, w, h, r);
        break;
      case SKY_OVER_WALL:
        specks(g, w, h, r, new Color(150, 130, 110), 1200);
        break;
    }
  }

  private static void bricks(Graphics2D g, int w, int h, Random r) {
    int bw = Math.max(24, w / 20);
    int bh = bw * 3 / 8;
    int mortar = Math.max(2, bw / 16);
    for (int row = 0, y = 0; y < h; row++, y += bh) {
      int offset = (row % 2) * bw / 2;
      for (int x = -offset; x < w; x += bw) {
        g.setColor(jitter(new Color(165, 75, 55), r, 22));
        g.fillRect(x + mortar, y + mortar, bw - mortar, bh - mortar);
        for (int k = 0; k < 6; k++) {
          g.setColor(jitter(new Color(130, 60, 45), r, 20));
          g.fillRect(
              x + mortar + r.nextInt(bw - mortar), y + mortar + r.nextInt(bh - mortar), 2, 2);
        }
      }
    }
  }

  private static void specks(Graphics2D g, int w, int h, Random r, Color c, int count) {
    for (int i = 0; i < count; i++) {
      g.setColor(jitter(c, r, 20));
      int d = 1 + r.nextInt(3);
      g.fillOval(r.nextInt(w), r.nextInt(h), d, d);
    }
  }

  private static void windows(Graphics2D g, int w, int h, Random r) {
    int ww = w / 8;
    int wh = h / 4;
    for (int i = 0; i < 4; i++) {
      for (int j = 0; j < 2; j++) {
        int x = w / 16 + i * w / 4;
        int y = h / 10 + j * h / 2;
        g.setColor(new Color(245, 245, 240));
        g.fillRect(x - 6, y - 6, ww + 12, wh + 12);
        g.setPaint(new GradientPaint(
            x, y, new Color(60, 80, 100), x + ww, y + wh, new Color(140, 170, 190)));
        g.fillRect(x, y, ww, wh);
        g.setColor(new Color(245, 245, 240));
        g.fillRect(x + ww / 2 - 3, y, 6, wh);
        g.fillRect(x, y + wh / 2 - 3, ww, 6);
      }
    }
  }

  /** A soft-edged diagonal shadow over part of the picture, as cast by a roof or a pole. */
  static void shadow(Mat rgb, Random r) {
    int w = rgb.cols();
    int h = rgb.rows();
    Mat mask = Mat.zeros(h, w, CvType.CV_32F);
    int x0 = r.nextInt(w / 2);
    Polygon p =
        new Polygon(new int[] {x0, x0 + w / 3, x0 + w / 2, x0 + w / 5}, new int[] {0, 0, h, h}, 4);
    Point[] pts = new Point[p.npoints];
    for (int i = 0; i < p.npoints; i++) {
      pts[i] = new Point(p.xpoints[i], p.ypoints[i]);
    }
    Imgproc.fillPoly(mask, java.util.List.of(new MatOfPoint(pts)), new Scalar(0.3));
    Pictures.blur(mask, w / 40.0);
    Core.subtract(Mat.ones(h, w, CvType.CV_32F), mask, mask);
    Mat f = new Mat();
    rgb.convertTo(f, CvType.CV_32FC3);
    Mat mask3 = new Mat();
    Core.merge(java.util.List.of(mask, mask, mask), mask3);
    Core.multiply(f, mask3, f);
    f.convertTo(rgb, CvType.CV_8UC3);
    f.release();
    mask.release();
    mask3.release();
  }

  static Color jitter(Color c, Random r, int amount) {
    int d = r.nextInt(2 * amount + 1) - amount;
    return new Color(clamp(c.getRed() + d + r.nextInt(7) - 3), clamp(c.getGreen() + d),
        clamp(c.getBlue() + d + r.nextInt(7) - 3));
  }

  private static int clamp(int v) {
    return Math.max(0, Math.min(255, v));
  }
}
