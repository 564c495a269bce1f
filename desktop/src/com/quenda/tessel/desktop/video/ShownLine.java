package com.quenda.tessel.desktop.video;

import com.quenda.tessel.desktop.ocr.RecognizedLine;
import org.opencv.core.Mat;
import org.opencv.core.RotatedRect;

/**
 * A line drawn over the video: its text and translation, its id (the renderer caches its patch
 * and text object under it), where it is now, and the patch it is drawn with, with where and in
 * what light that patch was cut.
 */
final class ShownLine {
  final long id;
  final int keyframe;
  final RecognizedLine read;
  final String translation;
  /** Where the line is in the current frame; null while the tracker has lost it. */
  RotatedRect rect;
  Mat patch;
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

  void replacePatch(Mat newPatch, int newColor, RotatedRect at, double[] means) {
    if (patch != null) {
      patch.release();
    }
    patch = newPatch;
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
