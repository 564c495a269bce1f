package com.quenda.tessel.utils;

import com.quenda.tessel.NativeLibrary;

/**
 * Effective resolution of a camera frame: how much real detail it holds, as opposed to how many
 * pixels it has. A frame that was upscaled (digital zoom), defocused or heavily compressed reads
 * lower than a sharp frame of the same size; a host can ask the user to move closer when the
 * text it wants to read is small and the frame reads low.
 */
public final class ResolutionJNI {
  static {
    NativeLibrary.load();
  }

  /** Returned for a valid frame in which no part holds detail (blank, or only noise). */
  public static final double NO_DETAIL = 0.0;

  /** Returned when the frame cannot be measured; the engine logs an error line saying why. */
  public static final double NOT_MEASURED = -1.0;

  private ResolutionJNI() {}

  /**
   * Estimates the effective resolution of one frame.
   *
   * <p>The engine looks at nine windows on a 3×3 grid, finds in each the highest spatial
   * frequency that still holds detail (where its energy spectrum falls to the noise floor or, once
   * whitened, far below its peak) and returns the median over the windows that hold any
   * detail, so that a window of blank wall or sky does not decide. The work is at most nine 256×256
   * transforms whatever the frame size; the call may come from any thread and only reads the
   * frame.
   *
   * @param matAddr {@code getNativeObjAddr()} of an {@code org.opencv.core.Mat} of type {@code
   *     CV_8UC4} (R, G, B, A), {@code CV_8UC3} (R, G, B) or {@code CV_8UC1} (grey), at least 96
   *     pixels on its shorter side
   * @return the highest frequency that holds detail, as a fraction of the frame's Nyquist limit
   *     (half a cycle per pixel), in (0, 1]. 1 is detail up to the pixel grid; a sharp image
   *     enlarged s times reads about 1/s; a Gaussian defocus of sigma pixels (2 or more) about
   *     0.5/sigma. Times the frame's width it gives the effective pixels across. {@link
   *     #NO_DETAIL} for a frame without detail; {@link #NOT_MEASURED} for a null address, an empty
   *     or smaller frame, or another type.
   * @throws org.opencv.core.CvException should OpenCV fail on a frame that passed those checks (not
   *     seen); the engine does not handle it
   */
  public static native double ImgResEstimate(long matAddr);
}
