package com.quenda.tessel.desktop.scenes;

import org.opencv.core.RotatedRect;

/**
 * The truth about one drawn text line: its text and the rectangle hugging its ink, in the same
 * convention as the OCR's {@code RecognizedLine} (width along the reading direction, angle in
 * degrees, y down; upright text has an angle in (-45, 45], text turned upside down near 180).
 */
public final class SceneLine {
  public final String text;
  public final RotatedRect rect;

  public SceneLine(String text, RotatedRect rect) {
    this.text = text;
    this.rect = rect;
  }

  @Override
  public String toString() {
    return String.format("\"%s\" at (%.1f, %.1f) %.1fx%.1f %.1f°", text, rect.center.x,
        rect.center.y, rect.size.width, rect.size.height, rect.angle);
  }
}
