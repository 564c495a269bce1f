package com.quenda.tessel.desktop.scenes;

import java.awt.BasicStroke;
import java.awt.Color;
import java.awt.Font;
import java.awt.Graphics2D;
import java.awt.RenderingHints;
import java.awt.geom.AffineTransform;
import java.awt.geom.RoundRectangle2D;
import java.awt.image.BufferedImage;
import java.util.ArrayList;
import java.util.List;
import java.util.Random;
import org.opencv.core.Mat;

/**
 * A street photograph with signs: one-line plates of given text, size, tilt and colours over a
 * procedural {@link Backdrop}. The same arguments and seed always give the same pixels.
 */
public final class SignScene {
  private record Sign(String text, double cx, double cy, double capHeight, double angle,
      SignStyle style, Font font) {}

  private final int width;
  private final int height;
  private final Backdrop backdrop;
  private final long seed;
  private final List<Sign> signs = new ArrayList<>();

  public SignScene(int width, int height, Backdrop backdrop, long seed) {
    this.width = width;
    this.height = height;
    this.backdrop = backdrop;
    this.seed = seed;
  }

  /**
   * Adds a plate whose lettering is centred on (cx, cy), capital letters {@code capHeight} pixels
   * tall, turned by {@code angle} degrees (clockwise on screen), in bold sans.
   */
  public SignScene sign(
      String text, double cx, double cy, double capHeight, double angle, SignStyle style) {
    return sign(text, cx, cy, capHeight, angle, style, Fonts.SANS_BOLD);
  }

  public SignScene sign(String text, double cx, double cy, double capHeight, double angle,
      SignStyle style, Font font) {
    signs.add(new Sign(text, cx, cy, capHeight, angle, style, font));
    return this;
  }

  public Scene render(String name) {
    Random random = new Random(seed);
    BufferedImage canvas = Pictures.canvas(width, height);
    backdrop.paint(canvas, random);
    Graphics2D g = canvas.createGraphics();
    g.setRenderingHint(RenderingHints.KEY_ANTIALIASING, RenderingHints.VALUE_ANTIALIAS_ON);
    List<SceneLine> lines = new ArrayList<>();
    for (Sign s : signs) {
      Lettering lettering = new Lettering(s.text, Lettering.withCapHeight(s.font, s.capHeight));
      plate(g, s, lettering);
      lines.add(new SceneLine(s.text, lettering.draw(g, s.style.ink, s.cx, s.cy, s.angle)));
    }
    g.dispose();
    Mat rgb = Pictures.toRgb(canvas);
    Backdrop.shadow(rgb, random);
    Pictures.cameraFinish(rgb, random, 0.8, 4.0);
    return new Scene(name, rgb, lines);
  }

  /** The plate, its drop shadow and, on light or blue plates, an inset border. */
  private static void plate(Graphics2D g, Sign s, Lettering lettering) {
    double mx = 0.7 * s.capHeight;
    double my = 0.5 * s.capHeight;
    double w = lettering.ink.getWidth() + 2 * mx;
    double h = lettering.ink.getHeight() + 2 * my;
    AffineTransform saved = g.getTransform();
    g.translate(s.cx, s.cy);
    g.rotate(Math.toRadians(s.angle));
    double arc = 0.4 * s.capHeight;
    g.setColor(new Color(0, 0, 0, 70));
    g.fill(new RoundRectangle2D.Double(-w / 2 + 4, -h / 2 + 5, w, h, arc, arc));
    g.setColor(s.style.plate);
    g.fill(new RoundRectangle2D.Double(-w / 2, -h / 2, w, h, arc, arc));
    if (s.style == SignStyle.DARK_ON_WHITE || s.style == SignStyle.WHITE_ON_BLUE) {
      double inset = 0.18 * s.capHeight;
      g.setColor(s.style.ink);
      g.setStroke(new BasicStroke((float) Math.max(1.5, s.capHeight / 14)));
      g.draw(new RoundRectangle2D.Double(
          -w / 2 + inset, -h / 2 + inset, w - 2 * inset, h - 2 * inset, arc, arc));
    }
    g.setTransform(saved);
  }
}
