package com.quenda.tessel.desktop.video;

import java.util.List;
import org.opencv.core.RotatedRect;

/**
 * What was drawn over one output frame: per line its id, texts and text rectangle, and the
 * keyframe it was read on with the rectangle it was read at (where tracking started from).
 */
public record FrameRecord(int frame, List<Drawn> lines) {
  /** One drawn line. */
  public record Drawn(long id, String text, String translation, RotatedRect rect, int keyframe,
      RotatedRect readAt) {}
}
