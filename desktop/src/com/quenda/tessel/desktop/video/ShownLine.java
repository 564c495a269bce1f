package com.quenda.tessel.desktop.video;

import com.quenda.tessel.desktop.ocr.RecognizedLine;
import com.quenda.tessel.desktop.typeset.Face;
import com.quenda.tessel.desktop.typeset.Typesetter;
import org.opencv.core.Mat;
import org.opencv.core.RotatedRect;

/**
 * A line drawn over the video: its text and its share of its block's translation, its id (the same
 * line read again keeps it), where it is now, where its translation is drawn and what is erased
 * relative to it (set at the keyframe, following it since), the face it is drawn in, and the patch
 * it is drawn with, with its own id and where and in what light it was cut.
 */
final class ShownLine {
  final long id;
  final int keyframe;
  final RecognizedLine read;
  final String translation;
  final Face face;
  private final LineAnchored textAt;
  private final LineAnchored erasedAround;
  /** Where the line is in the current frame; null while the tracker has lost it. */
  RotatedRect rect;
  Mat patch;
  /**
   * The renderer uploads a patch only when its id changes, and caches the line's text object under
   * it: every patch cut gets an id of its own.
   */
  long patchId = -1;
  int color;
  RotatedRect erasedAt;
  /** The frame's mean R, G, B under the patch when it was cut. */
  double[] referenceMeans;

  ShownLine(long id, int keyframe, RecognizedLine read, Typesetter.SetLine set, Face face) {
    this.id = id;
    this.keyframe = keyframe;
    this.read = read;
    this.translation = set.text();
    this.face = face;
    this.textAt = LineAnchored.relativeTo(read.rect, set.textRect());
    this.erasedAround = LineAnchored.relativeTo(read.rect, set.eraseRect());
    this.rect = read.rect;
  }

  /** Where the translation is drawn in the current frame; only while the line is tracked. */
  RotatedRect textRect() {
    return textAt.on(rect);
  }

  /** What is erased to hide the original in the current frame; only while the line is tracked. */
  RotatedRect eraseRect() {
    return erasedAround.on(rect);
  }

  void replacePatch(Mat newPatch, long newPatchId, int newColor, RotatedRect at, double[] means) {
    if (patch != null) {
      patch.release();
    }
    patch = newPatch;
    patchId = newPatchId;
    color = newColor;
    erasedAt = at;
    referenceMeans = means;
  }

  void release() {
    if (patch != null) {
      patch.release();
      patch = null;
    }
  }
}
