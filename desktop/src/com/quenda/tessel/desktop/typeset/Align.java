package com.quenda.tessel.desktop.typeset;

import java.util.ArrayList;
import java.util.Collections;
import java.util.List;

/**
 * How a block's lines stand against each other, read from their edges: a paragraph set flush left
 * starts every line at one edge, a sign is centred, a justified paragraph also ends every line but
 * the last at one edge.
 */
public enum Align {
  LEFT("left"),
  CENTRE("centre"),
  RIGHT("right"),
  JUSTIFIED("justified");

  /** As the JSON report names it. */
  public final String label;

  Align(String label) {
    this.label = label;
  }

  // Edges within this share of the lines' median height count as one edge: OCR boxes hug the ink,
  // and a line starting with "T" or "W" has its ink a little in from the margin.
  static final double EDGE_TOLERANCE = 0.35;

  /**
   * The alignment of lines whose edges along the block's axis are {@code lefts[i]} and {@code
   * rights[i]}, top to bottom, of median height {@code height}. A block of one line is centred:
   * nothing tells otherwise, and the renderer centres a line on its place.
   */
  public static Align detect(double[] lefts, double[] rights, double height) {
    int n = lefts.length;
    if (n < 2) {
      return CENTRE;
    }
    double tolerance = EDGE_TOLERANCE * height;
    double[] centres = new double[n];
    for (int i = 0; i < n; i++) {
      centres[i] = (lefts[i] + rights[i]) / 2;
    }
    double leftSpread = spread(lefts, n);
    double rightSpreadButLast = spread(rights, n - 1);
    if (n >= 3 && leftSpread <= tolerance && rightSpreadButLast <= tolerance) {
      return JUSTIFIED;
    }
    double rightSpread = spread(rights, n);
    double centreSpread = spread(centres, n);
    // Lines of one length agree on every edge: they read as set flush left.
    if (leftSpread <= tolerance && leftSpread <= centreSpread + tolerance / 2) {
      return LEFT;
    }
    if (centreSpread <= rightSpread && centreSpread <= tolerance) {
      return CENTRE;
    }
    if (rightSpread <= tolerance) {
      return RIGHT;
    }
    return leftSpread <= Math.min(centreSpread, rightSpread) ? LEFT
        : centreSpread <= rightSpread                        ? CENTRE
                                                             : RIGHT;
  }

  /** Largest distance of the first {@code n} values from their median. */
  private static double spread(double[] values, int n) {
    List<Double> sorted = new ArrayList<>();
    for (int i = 0; i < n; i++) {
      sorted.add(values[i]);
    }
    Collections.sort(sorted);
    double median = sorted.get(n / 2);
    return Math.max(median - sorted.get(0), sorted.get(n - 1) - median);
  }
}
