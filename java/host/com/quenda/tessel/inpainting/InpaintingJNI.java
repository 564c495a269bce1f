package com.quenda.tessel.inpainting;

import com.quenda.tessel.NativeLibrary;

/**
 * Erases recognised text from camera frames. Frames and overlays are OpenCV matrices passed by
 * their native address ({@code Mat.getNativeObjAddr()}); rectangles are flat arrays of five
 * doubles each (centre x, centre y, width, height, angle in degrees), see {@code
 * Constants.getValsPerRect()}.
 *
 * <p>The engine does not handle errors raised inside OpenCV (a frame of the wrong type or too small
 * for a step): they reach the caller as an {@link org.opencv.core.CvException} whose message is
 * OpenCV's own, and the call returns nothing usable. Running out of native memory throws {@link
 * OutOfMemoryError}; any other native failure a {@link RuntimeException}. Nothing is logged for
 * them, and the engine stays usable for the next call.
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
   * @throws org.opencv.core.CvException when OpenCV fails inside the erase; overlays written
   *     before the error stay written
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
   * @throws org.opencv.core.CvException for a frame OpenCV has no statistics for (half floats,
   *     more than four channels); the arrays may hold part of the results
   */
  public static native int CalculateMeansStdDevs(
      long imageAddr, double[] rects, double[] means, double[] stdDevs);
}
