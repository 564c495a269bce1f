package com.quenda.tessel.desktop.video;

import org.opencv.core.RotatedRect;

/**
 * When the host reads the text again (a keyframe: OCR, translation and erasing on the current
 * frame) and when it only erases again, keeping the texts.
 *
 * <p>Keyframes: the first frame; a frame in which the tracker lost every line (it then returns
 * all-zero rectangles); a frame in which less than {@link #MIN_COVERAGE} of the tracked spread is
 * left in view (text leaving the picture: what is left is re-read, what comes in is read); a frame
 * whose colour histogram has drifted from the keyframe's below {@link #MIN_FRAME_ACCURACY} (the
 * camera looks at something else). With nothing on screen, OCR is retried every {@link
 * #RETRY_FRAMES} frames, so text coming (back) into view is found within half a second, without
 * running OCR on every frame.
 *
 * <p>Erasing again: a patch was cut from the frame at one scale, angle and light; drawn at the
 * tracked place it is scaled, turned and colour-corrected by the renderer. Past a quarter more or
 * less in size, 10 degrees of turn or a light change of a third in any channel, the stretched
 * patch no longer passes for the surface under it, and the line is erased again from the current
 * frame, keeping its text, translation and line id (the new patch gets an id of its own, so that
 * the renderer takes its pixels).
 */
public final class KeyframeRules {
  static final double MIN_COVERAGE = 0.6;
  static final double MIN_FRAME_ACCURACY = 0.5;
  static final int RETRY_FRAMES = 15;
  static final double MAX_SCALE_CHANGE = 1.25;
  static final double MAX_TURN_DEGREES = 10;
  static final double MAX_LIGHT_GAIN = 1.33;

  private KeyframeRules() {}

  /** Whether the line drawn now at {@code now} needs a patch cut again. */
  static boolean needsErasing(RotatedRect erasedAt, RotatedRect now, double[] gains) {
    double scale = now.size.height / erasedAt.size.height;
    if (scale > MAX_SCALE_CHANGE || scale < 1 / MAX_SCALE_CHANGE) {
      return true;
    }
    if (turnDegrees(erasedAt.angle, now.angle) > MAX_TURN_DEGREES) {
      return true;
    }
    for (double gain : gains) {
      if (gain > MAX_LIGHT_GAIN || gain < 1 / MAX_LIGHT_GAIN) {
        return true;
      }
    }
    return false;
  }

  /**
   * How far a line turned from {@code fromDegrees} to {@code toDegrees}, 0..180: the short way
   * round, so that 179 and -179 are 2 degrees apart, not 358.
   */
  static double turnDegrees(double fromDegrees, double toDegrees) {
    double turn = Math.abs(toDegrees - fromDegrees) % 360;
    return turn > 180 ? 360 - turn : turn;
  }
}
