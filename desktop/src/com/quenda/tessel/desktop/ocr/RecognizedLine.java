package com.quenda.tessel.desktop.ocr;

import org.opencv.core.RotatedRect;

/**
 * One text line read from an image: its text, where it stands and how sure the OCR is.
 *
 * <p>{@code rect} is in the input image's pixels, in OpenCV's {@code RotatedRect} convention
 * (centre, size, angle in degrees, y down), with the width running along the text: the rectangle
 * holds the line's letters as an OCR box does, before the engine's inpainting ratios are applied.
 */
public final class RecognizedLine {
  public final String text;
  public final RotatedRect rect;
  /** How sure the recogniser is of the text, 0..100. */
  public final double confidence;
  /** Which recogniser read the text (see {@link PhotoReader#recogniser()}). */
  public final String reader;

  public RecognizedLine(String text, RotatedRect rect, double confidence, String reader) {
    this.text = text;
    this.rect = rect;
    this.confidence = confidence;
    this.reader = reader;
  }

  @Override
  public String toString() {
    return String.format("\"%s\" at (%.1f, %.1f) %.1fx%.1f %.1f° conf %.0f", text, rect.center.x,
        rect.center.y, rect.size.width, rect.size.height, rect.angle, confidence);
  }
}
