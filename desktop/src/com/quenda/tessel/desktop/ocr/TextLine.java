package com.quenda.tessel.desktop.ocr;

import java.util.List;
import org.opencv.core.RotatedRect;

/** Character candidates of one polarity standing in a row, and the rectangle around their ink. */
final class TextLine {
  final List<Component> parts;
  /** Width along the row, angle in (-90, 90]; detection-scale pixels. */
  final RotatedRect rect;
  final boolean bright;

  TextLine(List<Component> parts, RotatedRect rect, boolean bright) {
    this.parts = parts;
    this.rect = rect;
    this.bright = bright;
  }

  long inkArea() {
    long a = 0;
    for (Component c : parts) {
      a += c.area;
    }
    return a;
  }
}
