package com.quenda.tessel.desktop.typeset;

import com.quenda.tessel.desktop.ocr.RecognizedLine;
import java.util.ArrayList;
import java.util.Comparator;
import java.util.List;

/**
 * Groups a reader's lines into blocks: a line joins the block whose last line stands right above
 * it when the two are about as tall, run the same way, are one line pitch apart (the pitch the
 * block has kept so far) and share a left, right or centre edge. Works for any reader whose line
 * boxes hug the line's ink, a little more or less tightly.
 */
public final class BlockFinder {
  // Line boxes of one paragraph differ in height by what their words hold: descenders or not
  // changes the box by a third.
  static final double MAX_HEIGHT_RATIO = 1.45;
  static final double MAX_ANGLE_DEGREES = 4;
  // Printed lines stand 1.1 to 2 box heights apart (the box holds ascenders and descenders).
  static final double MIN_PITCH = 0.85;
  static final double MAX_PITCH = 2.4;
  // A paragraph's pitch is regular: a line further off than this starts a new block.
  static final double PITCH_TOLERANCE = 0.25;

  private BlockFinder() {}

  public static List<Block> find(List<RecognizedLine> lines) {
    double axis = medianAngle(lines);
    List<Integer> order = new ArrayList<>();
    for (int i = 0; i < lines.size(); i++) {
      order.add(i);
    }
    order.sort(Comparator.comparingDouble(i -> new LineFrame(lines.get(i).rect, axis).across));

    List<List<Integer>> groups = new ArrayList<>();
    for (int i : order) {
      List<Integer> best = null;
      double bestDistance = Double.MAX_VALUE;
      for (List<Integer> group : groups) {
        double distance = joinDistance(lines, group, i);
        if (distance < bestDistance) {
          bestDistance = distance;
          best = group;
        }
      }
      if (best != null) {
        best.add(i);
      } else {
        groups.add(new ArrayList<>(List.of(i)));
      }
    }

    List<Block> blocks = new ArrayList<>();
    for (List<Integer> group : groups) {
      blocks.add(block(lines, group));
    }
    // In reading order: by where their first line stands, top to bottom along the lines' axis.
    blocks.sort(Comparator.comparingInt((Block b) -> order.indexOf(b.lines.get(0))));
    return blocks;
  }

  /**
   * How far line {@code i} stands below the group's last line, or MAX_VALUE when it does not
   * continue the group.
   */
  private static double joinDistance(List<RecognizedLine> lines, List<Integer> group, int i) {
    RecognizedLine last = lines.get(group.get(group.size() - 1));
    RecognizedLine next = lines.get(i);
    if (LineFrame.angleBetween(last.rect, next.rect) > MAX_ANGLE_DEGREES) {
      return Double.MAX_VALUE;
    }
    double ha = last.rect.size.height;
    double hb = next.rect.size.height;
    if (Math.max(ha, hb) > MAX_HEIGHT_RATIO * Math.min(ha, hb)) {
      return Double.MAX_VALUE;
    }
    double axis = last.rect.angle;
    LineFrame a = new LineFrame(last.rect, axis);
    LineFrame b = new LineFrame(next.rect, axis);
    double height = (ha + hb) / 2;
    double pitch = b.across - a.across;
    if (pitch < MIN_PITCH * height || pitch > MAX_PITCH * height) {
      return Double.MAX_VALUE;
    }
    if (group.size() >= 2) {
      LineFrame before = new LineFrame(lines.get(group.get(group.size() - 2)).rect, axis);
      double kept = a.across - before.across;
      if (Math.abs(pitch - kept) > PITCH_TOLERANCE * kept) {
        return Double.MAX_VALUE;
      }
    }
    if (!sharesEdge(lines, group, next, axis, height)) {
      return Double.MAX_VALUE;
    }
    return pitch;
  }

  /** Whether {@code next} shares an edge that every line of the group shares. */
  private static boolean sharesEdge(List<RecognizedLine> lines, List<Integer> group,
      RecognizedLine next, double axis, double height) {
    double tolerance = Align.EDGE_TOLERANCE * height;
    LineFrame b = new LineFrame(next.rect, axis);
    boolean left = true;
    boolean right = true;
    boolean centre = true;
    for (int k : group) {
      LineFrame a = new LineFrame(lines.get(k).rect, axis);
      left &= Math.abs(a.left - b.left) <= tolerance;
      right &= Math.abs(a.right - b.right) <= tolerance;
      centre &= Math.abs(a.centre() - b.centre()) <= tolerance;
    }
    // A justified paragraph's last line ends short: its left edge is enough.
    return left || right || centre;
  }

  private static Block block(List<RecognizedLine> lines, List<Integer> group) {
    double axis = lines.get(group.get(0)).rect.angle;
    double[] lefts = new double[group.size()];
    double[] rights = new double[group.size()];
    double[] heights = new double[group.size()];
    for (int k = 0; k < group.size(); k++) {
      LineFrame f = new LineFrame(lines.get(group.get(k)).rect, axis);
      lefts[k] = f.left;
      rights[k] = f.right;
      heights[k] = f.height;
    }
    java.util.Arrays.sort(heights);
    return new Block(group, Align.detect(lefts, rights, heights[heights.length / 2]), axis);
  }

  private static double medianAngle(List<RecognizedLine> lines) {
    if (lines.isEmpty()) {
      return 0;
    }
    double[] angles = lines.stream().mapToDouble(l -> l.rect.angle).sorted().toArray();
    return angles[angles.length / 2];
  }
}
