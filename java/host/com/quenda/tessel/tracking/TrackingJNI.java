package com.quenda.tessel.tracking;

import com.quenda.tessel.NativeLibrary;

/**
 * Region tracking and frame measures of the engine.
 *
 * <p>Rectangles travel as flat arrays of five doubles each: centre x, centre y, width, height
 * (pixels, x right, y down) and angle in degrees. Images are passed as the native address of an
 * {@code org.opencv.core.Mat} ({@code getNativeObjAddr()}) that stays owned by the caller.
 *
 * <p>The engine does not handle errors raised inside OpenCV (a frame of the wrong type or too small
 * for a step): they reach the caller as an {@link org.opencv.core.CvException} whose message is
 * OpenCV's own, and the call returns nothing usable. Running out of native memory throws {@link
 * OutOfMemoryError}; any other native failure a {@link RuntimeException}. Nothing is logged for
 * them, and the engine stays usable for the next call.
 */
public final class TrackingJNI {
  static {
    NativeLibrary.load();
  }

  private TrackingJNI() {}

  /**
   * Starts tracking the given rectangles on an RGB frame (8-bit, 3 channels). Width and height are
   * truncated to whole pixels; a trailing partial rectangle is ignored.
   *
   * @return the tracker handle, or 0 when {@code matAddr} is 0
   * @throws org.opencv.core.CvException for an empty frame, a frame that is not 8-bit RGB or one
   *     too small to refine corners in; no tracker is created
   */
  public static native long initializeTracker(long matAddr, double[] rects);

  /**
   * Tracks the rectangles into the next RGB frame.
   *
   * @return five values per rectangle; all zeros for a rectangle that was lost and for every
   *     rectangle of a frame in which tracking failed or moved implausibly; null when the handle or
   *     the address is 0
   * @throws org.opencv.core.CvException for a frame OpenCV cannot track into (empty, another
   *     type); the tracker stays usable for the next frame
   */
  public static native double[] updateTracker(long handle, long matAddr);

  /** Share of the initially tracked spread still covered after the last successful update. */
  public static native double getCoverageLeft(long handle);

  /** Destroys the tracker; the handle must not be used afterwards. */
  public static native void releaseTracker(long handle);

  /**
   * Colour-histogram correlation of two RGBA frames (8-bit, 4 channels): 1.0 for identical
   * red/green distributions, down to -1.0.
   *
   * @throws org.opencv.core.CvException for an empty frame or one of another channel count
   * @throws IllegalArgumentException for address 0: "calculateFrameAccuracy: no matrix at address
   *     0"
   */
  public static native double calculateFrameAccuracy(long firstMatAddr, long secondMatAddr);

  /**
   * Sharpness of an RGBA frame: standard deviation of its Laplacian (small when blurred).
   *
   * @throws org.opencv.core.CvException for an empty frame or one of another channel count
   * @throws IllegalArgumentException for address 0: "calculateBlur: no matrix at address 0"
   */
  public static native double calculateBlur(long matAddr);
}
