package com.quenda.tessel.desktop.scenes;

import java.awt.Color;
import java.awt.Font;
import java.awt.GradientPaint;
import java.awt.Graphics2D;
import java.awt.image.BufferedImage;
import java.util.ArrayList;
import java.util.List;
import java.util.Random;
import org.opencv.core.Mat;

/**
 * A photographed printed page: dark lines of text on textured paper lying on a desk, the whole
 * page turned by a given angle (a few degrees, or 90 and 180 for pages held the wrong way).
 */
public final class PageScene {
  private final int width;
  private final int height;
  private final long seed;
  private List<String> text = List.of();
  private double rotation;
  private Font font = Fonts.SERIF;

  public PageScene(int width, int height, long seed) {
    this.width = width;
    this.height = height;
    this.seed = seed;
  }

  public PageScene lines(List<String> lines) {
    this.text = List.copyOf(lines);
    return this;
  }

  /** Turns the page by {@code degrees}, clockwise on screen. */
  public PageScene rotation(double degrees) {
    this.rotation = degrees;
    return this;
  }

  public PageScene font(Font font) {
    this.font = font;
    return this;
  }

  public Scene render(String name) {
    Random random = new Random(seed);
    BufferedImage canvas = Pictures.canvas(width, height);
    Graphics2D g = canvas.createGraphics();
    g.setPaint(
        new GradientPaint(0, 0, new Color(95, 70, 50), width, height, new Color(60, 42, 30)));
    g.fillRect(0, 0, width, height);
    // A page held sideways is laid out in the turned frame so that it still fits.
    boolean sideways = Math.abs(Math.abs(Lettering.normalise(rotation)) - 90) < 45;
    double frameW = sideways ? height : width;
    double frameH = sideways ? width : height;
    double pw = 0.86 * frameW;
    double ph = 0.92 * frameH;
    g.translate(width / 2.0, height / 2.0);
    g.rotate(Math.toRadians(rotation));
    g.translate(-pw / 2, -ph / 2);
    paper(g, pw, ph, random);

    double pitch = 0.84 * ph / Math.max(1, text.size());
    double cap = pitch / 2.1;
    List<Lettering> letterings = layout(cap);
    cap = Math.min(cap, cap * 0.86 * pw / widest(letterings));
    letterings = layout(cap);
    List<SceneLine> lines = new ArrayList<>();
    for (int i = 0; i < letterings.size(); i++) {
      Lettering l = letterings.get(i);
      double cx = 0.07 * pw + l.ink.getWidth() / 2;
      double cy = 0.08 * ph + (i + 0.5) * pitch;
      lines.add(new SceneLine(l.text, l.draw(g, new Color(30, 30, 35), cx, cy, 0)));
    }
    g.dispose();
    Mat rgb = Pictures.toRgb(canvas);
    Pictures.cameraFinish(rgb, random, 0.7, 3.0);
    return new Scene(name, rgb, lines);
  }

  private List<Lettering> layout(double cap) {
    Font sized = Lettering.withCapHeight(font, cap);
    List<Lettering> out = new ArrayList<>();
    for (String t : text) {
      out.add(new Lettering(t, sized));
    }
    return out;
  }

  private static double widest(List<Lettering> letterings) {
    double w = 1;
    for (Lettering l : letterings) {
      w = Math.max(w, l.ink.getWidth());
    }
    return w;
  }

  private static void paper(Graphics2D g, double pw, double ph, Random r) {
    g.setColor(new Color(0, 0, 0, 60));
    g.fill(new java.awt.geom.Rectangle2D.Double(6, 8, pw, ph));
    g.setPaint(new GradientPaint(
        0, 0, new Color(246, 243, 235), (float) pw, (float) ph, new Color(222, 218, 208)));
    g.fill(new java.awt.geom.Rectangle2D.Double(0, 0, pw, ph));
    for (int i = 0; i < 900; i++) {
      g.setColor(Backdrop.jitter(new Color(205, 200, 190), r, 12));
      double x = r.nextDouble() * pw;
      double y = r.nextDouble() * ph;
      double a = r.nextDouble() * Math.PI;
      double len = 2 + r.nextDouble() * 5;
      g.draw(new java.awt.geom.Line2D.Double(x, y, x + len * Math.cos(a), y + len * Math.sin(a)));
    }
  }
}
