package com.quenda.tessel.desktop.typeset;

import java.util.List;

/**
 * Lines that belong together, a paragraph or one sign: translated as one text and typeset back
 * over its lines. {@code lines} are indices into the reader's lines, top to bottom.
 */
public final class Block {
  public final List<Integer> lines;
  public final Align align;
  /** The direction the block's text runs, degrees as in a rotated rectangle. */
  public final double axis;

  Block(List<Integer> lines, Align align, double axis) {
    this.lines = List.copyOf(lines);
    this.align = align;
    this.axis = axis;
  }

  @Override
  public String toString() {
    return lines + " " + align.label;
  }
}
