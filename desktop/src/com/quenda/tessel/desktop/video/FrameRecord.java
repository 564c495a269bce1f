package com.quenda.tessel.desktop.video;

import com.quenda.tessel.desktop.typeset.Face;
import java.util.List;
import org.opencv.core.RotatedRect;

/**
 * What was drawn over one output frame: per line its id, texts and tracked rectangle, the keyframe
 * it was read on with the rectangle it was read at (where tracking started from), and where and in
 * which face its translation was drawn.
 */
public record FrameRecord(int frame, List<Drawn> lines) {
  /** One drawn line. */
  public record Drawn(long id, String text, String translation, RotatedRect rect, int keyframe,
      RotatedRect readAt, RotatedRect textRect, Face face) {}
}
