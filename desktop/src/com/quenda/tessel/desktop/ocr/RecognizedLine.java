package com.quenda.tessel.desktop.ocr;

import org.opencv.core.RotatedRect;

/**
 * One text line read from an image: its text, where it stands and how sure the OCR is.
 *
 * <p>{@code rect} is in the input image's pixels, in OpenCV's {@code RotatedRect} convention
 * (centre, size, angle in degrees, y down), with the width running along the text: the rectangle
 * hugs the line's ink as an OCR box does, before the engine's inpainting ratios are applied.
 */
public final class RecognizedLine {
  public final String text;
  public final RotatedRect rect;
  /** Mean word confidence, 0..100. */
  public final double confidence;

  public RecognizedLine(String text, RotatedRect rect, double confidence) {
    this.text = text;
    this.rect = rect;
    this.confidence = confidence;
  }

  @Override
  public String toString() {
    return String.format("\"%s\" at (%.1f, %.1f) %.1fx%.1f %.1f° conf %.0f", text, rect.center.x,
        rect.center.y, rect.size.width, rect.size.height, rect.angle, confidence);
  }
}
