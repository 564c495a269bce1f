package com.quenda.tessel.desktop.ocr;

import java.util.ArrayList;
import java.util.Arrays;
import java.util.Comparator;
import java.util.HashMap;
import java.util.List;
import java.util.Map;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.MatOfPoint2f;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.imgproc.Imgproc;

/**
 * Groups character candidates into text lines, in two passes.
 *
 * <p>First, neighbours are linked: same polarity, heights within a factor 2 (capitals beside
 * x-height letters), the gap between their boxes under 0.9 of the taller height (a word space is
 * about half a capital, the gap to the next line of a page a whole one), and the direction between
 * their centres within 40° of horizontal, so that text tilted up to ±30° links while the letters
 * above and below, on a page, do not. Second, each linked group's direction is fitted through its
 * centres and the links are redone within 20° of it, which cuts groups that bridged two lines.
 *
 * <p>Within a row, candidates over 1.45 times its median height are left out (letters fused with
 * the line above); rows of fewer than three candidates (two blobs always line up) or narrower than
 * 1.3 times their height are dropped; the rectangle is {@link InkRect}'s. Overlapping rows keep
 * the one with more candidates.
 */
final class LineGrouper {
  private static final double MAX_LINK_ANGLE = 40;
  private static final double MAX_REFIT_ANGLE = 20;
  private static final double MAX_JOIN_ANGLE = 5;
  private static final double MAX_JOIN_HEIGHT_RATIO = 1.3;
  private static final double MAX_JOIN_OFFSET = 0.25;
  private static final double MAX_JOIN_GAP = 1.2;

  List<TextLine> group(List<Component> components) {
    List<TextLine> lines = new ArrayList<>();
    for (boolean bright : new boolean[] {false, true}) {
      for (List<Component> g : link(ofPolarity(components, bright), Double.NaN)) {
        double direction = fitDirection(g);
        for (List<Component> row : link(g, direction)) {
          TextLine line = line(row, direction, bright);
          if (line != null) {
            lines.add(line);
          }
        }
      }
    }
    return dropOverlaps(joinFragments(lines));
  }

  /**
   * Joins the pieces of one line that the links left apart: between two words of only x-height
   * letters the gap can be wider than 0.9 of their height ("at the  counter"), though narrow for
   * the line as a whole. Two lines of one polarity are one when they run in the same direction
   * (within 5°), are as tall (within a factor 1.3), lie on one centreline (off by under a quarter
   * of the height) and their ends are less than 1.2 line heights apart. Lines of a page, one above
   * the other, are a whole height off each other's centreline.
   */
  private static List<TextLine> joinFragments(List<TextLine> lines) {
    List<TextLine> out = new ArrayList<>(lines);
    for (boolean joined = true; joined;) {
      joined = false;
      for (int i = 0; i < out.size() && !joined; i++) {
        for (int j = i + 1; j < out.size() && !joined; j++) {
          TextLine both = joined(out.get(i), out.get(j));
          if (both != null) {
            out.set(i, both);
            out.remove(j);
            joined = true;
          }
        }
      }
    }
    return out;
  }

  private static TextLine joined(TextLine a, TextLine b) {
    if (a.bright != b.bright
        || Math.abs(InkRect.fold(a.rect.angle - b.rect.angle)) > MAX_JOIN_ANGLE) {
      return null;
    }
    double ha = a.rect.size.height;
    double hb = b.rect.size.height;
    double h = Math.max(ha, hb);
    if (h > MAX_JOIN_HEIGHT_RATIO * Math.min(ha, hb)) {
      return null;
    }
    double radians = Math.toRadians(a.rect.angle);
    double dx = b.rect.center.x - a.rect.center.x;
    double dy = b.rect.center.y - a.rect.center.y;
    double along = dx * Math.cos(radians) + dy * Math.sin(radians);
    double across = -dx * Math.sin(radians) + dy * Math.cos(radians);
    double gap = Math.abs(along) - (a.rect.size.width + b.rect.size.width) / 2;
    if (Math.abs(across) > MAX_JOIN_OFFSET * h || gap > MAX_JOIN_GAP * h) {
      return null;
    }
    List<Component> parts = new ArrayList<>(a.parts);
    parts.addAll(b.parts);
    return line(parts, fitDirection(parts), a.bright);
  }

  /** The candidates of one polarity, left to right: lines are built from one polarity only. */
  private static List<Component> ofPolarity(List<Component> components, boolean bright) {
    List<Component> same = new ArrayList<>();
    for (Component c : components) {
      if (c.bright == bright) {
        same.add(c);
      }
    }
    same.sort(Comparator.comparingInt(c -> c.box.x));
    return same;
  }

  /**
   * How many candidates stand in linked rows of three or more, without fitting the rows: evidence
   * of how much text runs across the picture, cheap enough to compare with its transposition.
   */
  static int candidatesInRows(List<Component> components) {
    int n = 0;
    for (boolean bright : new boolean[] {false, true}) {
      for (List<Component> g : link(ofPolarity(components, bright), Double.NaN)) {
        n += g.size() >= 3 ? g.size() : 0;
      }
    }
    return n;
  }

  /**
   * Groups linked candidates (sorted by left edge); with a direction, a link must also lie within
   * MAX_REFIT_ANGLE of it. Groups of one are dropped.
   */
  private static List<List<Component>> link(List<Component> cs, double direction) {
    int n = cs.size();
    int[] parent = new int[n];
    for (int i = 0; i < n; i++) {
      parent[i] = i;
    }
    for (int i = 0; i < n; i++) {
      Component a = cs.get(i);
      int reach = a.box.x + a.box.width + 2 * a.box.height;
      for (int j = i + 1; j < n && cs.get(j).box.x <= reach; j++) {
        if (linked(a, cs.get(j), direction)) {
          union(parent, i, j);
        }
      }
    }
    Map<Integer, List<Component>> groups = new HashMap<>();
    for (int i = 0; i < n; i++) {
      groups.computeIfAbsent(find(parent, i), k -> new ArrayList<>()).add(cs.get(i));
    }
    List<List<Component>> out = new ArrayList<>();
    for (List<Component> g : groups.values()) {
      if (g.size() >= 2) {
        out.add(g);
      }
    }
    return out;
  }

  static boolean linked(Component a, Component b, double direction) {
    double ha = a.box.height;
    double hb = b.box.height;
    double tall = Math.max(ha, hb);
    if (tall > 2 * Math.min(ha, hb)) {
      return false;
    }
    int gapX = Math.max(a.box.x, b.box.x) - Math.min(a.box.x + a.box.width, b.box.x + b.box.width);
    int gapY =
        Math.max(a.box.y, b.box.y) - Math.min(a.box.y + a.box.height, b.box.y + b.box.height);
    double dx = b.cx() - a.cx();
    double dy = b.cy() - a.cy();
    if (Math.hypot(dx, dy) < 0.5 * Math.min(ha, hb)) {
      return true; // one letter found at two thresholds, or a letter and its stroke
    }
    if (Math.hypot(Math.max(0, gapX), Math.max(0, gapY)) > 0.9 * tall) {
      return false;
    }
    double angle = Math.toDegrees(Math.atan2(dy, dx));
    if (Double.isNaN(direction)) {
      return Math.abs(InkRect.fold(angle)) <= MAX_LINK_ANGLE;
    }
    return Math.abs(InkRect.fold(angle - direction)) <= MAX_REFIT_ANGLE;
  }

  /** Direction of the row through its candidates' centres, in degrees, robust to outliers. */
  private static double fitDirection(List<Component> g) {
    Point[] centres = new Point[g.size()];
    for (int i = 0; i < centres.length; i++) {
      centres[i] = new Point(g.get(i).cx(), g.get(i).cy());
    }
    MatOfPoint2f m = new MatOfPoint2f(centres);
    Mat fit = new Mat();
    Imgproc.fitLine(m, fit, Imgproc.DIST_HUBER, 0, 0.01, 0.01);
    double angle = InkRect.fold(Math.toDegrees(Math.atan2(fit.get(1, 0)[0], fit.get(0, 0)[0])));
    m.release();
    fit.release();
    return angle;
  }

  private static TextLine line(List<Component> all, double direction, boolean bright) {
    List<Component> row = withoutTallOutliers(all);
    if (row.size() < 3) {
      return null;
    }
    RotatedRect r = InkRect.of(row, direction);
    if (r == null || r.size.width < 1.3 * r.size.height) {
      return null;
    }
    return new TextLine(row, r, bright);
  }

  /**
   * Without candidates over 1.45 times the row's median height: a letter that blur has fused with
   * a descender of the line above would otherwise stretch the rectangle and skew its angle. Tall
   * letters (capitals and descenders beside x-height letters) stay within that factor.
   */
  static List<Component> withoutTallOutliers(List<Component> row) {
    int[] heights = new int[row.size()];
    for (int i = 0; i < heights.length; i++) {
      heights[i] = row.get(i).box.height;
    }
    Arrays.sort(heights);
    double limit = 1.45 * heights[heights.length / 2];
    List<Component> out = new ArrayList<>();
    for (Component c : row) {
      if (c.box.height <= limit) {
        out.add(c);
      }
    }
    return out;
  }

  /**
   * Where two lines overlap by more than 40% of the smaller, keeps the one with more candidates:
   * the counters of light letters make a row of fewer dark candidates inside the light one, and
   * a few large blobs of the backdrop (shadows, a plate's shape) can make a row around a sign.
   */
  private static List<TextLine> dropOverlaps(List<TextLine> lines) {
    lines.sort(Comparator.comparingInt((TextLine l) -> l.parts.size())
                   .thenComparingLong(TextLine::inkArea)
                   .reversed());
    List<TextLine> kept = new ArrayList<>();
    for (TextLine l : lines) {
      boolean covered = false;
      for (TextLine k : kept) {
        if (overlap(l.rect, k.rect) > 0.4 * Math.min(area(l.rect), area(k.rect))) {
          covered = true;
          break;
        }
      }
      if (!covered) {
        kept.add(l);
      }
    }
    return kept;
  }

  private static double area(RotatedRect r) {
    return r.size.width * r.size.height;
  }

  private static double overlap(RotatedRect a, RotatedRect b) {
    Mat region = new Mat();
    int kind = Imgproc.rotatedRectangleIntersection(a, b, region);
    double area = 0;
    if (kind != Imgproc.INTERSECT_NONE && region.total() > 2) {
      MatOfPoint2f poly = new MatOfPoint2f();
      region.convertTo(poly, CvType.CV_32FC2);
      area = Imgproc.contourArea(poly);
      poly.release();
    }
    region.release();
    return area;
  }

  private static int find(int[] parent, int i) {
    while (parent[i] != i) {
      parent[i] = parent[parent[i]];
      i = parent[i];
    }
    return i;
  }

  private static void union(int[] parent, int a, int b) {
    parent[find(parent, a)] = find(parent, b);
  }
}
