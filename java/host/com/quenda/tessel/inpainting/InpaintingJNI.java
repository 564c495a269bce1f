package com.quenda.tessel.inpainting;

import com.quenda.tessel.NativeLibrary;

/**
 * Erases recognised text from camera frames. Frames and overlays are OpenCV matrices passed by
 * their native address ({@code Mat.getNativeObjAddr()}); rectangles are flat arrays of five
 * doubles each (centre x, centre y, width, height, angle in degrees), see {@code
 * Constants.getValsPerRect()}.
 */
public final class InpaintingJNI {
  static {
    NativeLibrary.load();
  }

  private InpaintingJNI() {}

  /**
   * Erases the text inside every rectangle of an RGB frame ({@code CV_8UC3}).
   *
   * @param imageAddr the frame
   * @param outputMatAddrs one matrix per rectangle; each receives the RGBA overlay of its
   *     rectangle, upright (the rectangle's width along x), alpha fading out away from the text
   * @param rects the text lines' rotated rectangles
   * @param fontColors one per rectangle; receives the text colour as 0xFF000000 | B << 16 | G
   *     << 8 | R
   * @return 0 on success, -1 on bad arguments or a refused request
   */
  public static native int InpaintingRotRectImg(
      long imageAddr, long[] outputMatAddrs, double[] rects, int[] fontColors);

  /**
   * Per-channel mean and standard deviation of a half-resolution frame inside each rectangle,
   * the rectangles given at full resolution.
   *
   * @param means receives channel c of rectangle i at i * channels + c
   * @param stdDevs the same layout as {@code means}
   * @return 0 on success, -1 when the arrays do not hold channels * (rects.length / 5) values
   */
  public static native int CalculateMeansStdDevs(
      long imageAddr, double[] rects, double[] means, double[] stdDevs);
}
