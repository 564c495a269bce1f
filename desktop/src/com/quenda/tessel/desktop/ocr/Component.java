package com.quenda.tessel.desktop.ocr;

import org.opencv.core.MatOfPoint;
import org.opencv.core.Rect;

/** A character candidate: one stable region of one polarity, in detection-scale pixels. */
final class Component {
  /** Null for a {@link #transposed} copy. */
  final MatOfPoint points;
  final Rect box;
  final int area;
  /** Light ink on a darker ground. */
  final boolean bright;

  Component(MatOfPoint points, Rect box, boolean bright) {
    this.points = points;
    this.box = box;
    this.area = points.rows();
    this.bright = bright;
  }

  private Component(Rect box, int area, boolean bright) {
    this.points = null;
    this.box = box;
    this.area = area;
    this.bright = bright;
  }

  /** The candidate mirrored across the diagonal, box only: rows of it are columns of this. */
  Component transposed() {
    return new Component(new Rect(box.y, box.x, box.height, box.width), area, bright);
  }

  private int[] xy;

  /** The pixels as interleaved x, y (copied from native memory once). */
  int[] xy() {
    if (xy == null) {
      xy = new int[area * 2];
      points.get(0, 0, xy);
    }
    return xy;
  }

  double cx() {
    return box.x + box.width / 2.0;
  }

  double cy() {
    return box.y + box.height / 2.0;
  }
}
