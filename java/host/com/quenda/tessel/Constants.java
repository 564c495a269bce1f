package com.quenda.tessel;

/** Sizing constants of the inpainting pipeline, as the engine sees them. */
public final class Constants {
  static {
    NativeLibrary.load();
  }

  private Constants() {}

  /** Doubles per rotated rectangle (centre x, centre y, width, height, angle). */
  public static native int getValsPerRect();

  /** Factor by which the host widens an OCR box before sending it for inpainting. */
  public static native double getInpaintRectWidthRatio();

  /** Factor by which the host heightens an OCR box before sending it for inpainting. */
  public static native double getInpaintRectHeightRatio();

  /** Enlargement of OCR boxes in percent (none). */
  public static native double getStandardOcrEnlargePercent();

  /** Smallest image side, in pixels, that the pipeline accepts. */
  public static native int getMinInpaintSize();
}
