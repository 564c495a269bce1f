package com.quenda.tessel.desktop.video;

import com.quenda.tessel.desktop.ocr.RecognizedLine;
import org.opencv.core.Mat;
import org.opencv.core.RotatedRect;

/**
 * A line drawn over the video: its text and translation, its id (the same line read again keeps
 * it), where it is now, and the patch it is drawn with, with its own id and where and in what
 * light it was cut.
 */
final class ShownLine {
  final long id;
  final int keyframe;
  final RecognizedLine read;
  final String translation;
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

  ShownLine(long id, int keyframe, RecognizedLine read, String translation) {
    this.id = id;
    this.keyframe = keyframe;
    this.read = read;
    this.translation = translation;
    this.rect = read.rect;
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
