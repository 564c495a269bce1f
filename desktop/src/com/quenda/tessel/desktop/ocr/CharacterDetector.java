package com.quenda.tessel.desktop.ocr;

import java.util.ArrayList;
import java.util.List;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.core.MatOfPoint;
import org.opencv.core.MatOfRect;
import org.opencv.core.Rect;
import org.opencv.features2d.MSER;

/**
 * Finds character candidates with MSER, once per polarity (the grey image and its negative), so
 * that every candidate knows whether its ink is dark or light and lines are only built from one
 * polarity: the counters of white letters never join the black letters around them.
 *
 * <p>MSER because a letter is a region of nearly uniform ink that stays the same over a wide range
 * of thresholds whatever the lighting, which is what separates it from photographic texture; the
 * shape rules below then drop what is too flat, too full or too big to be a letter: bricks and
 * window panes are nearly full rectangles, a plate or a facade is far too large.
 */
final class CharacterDetector {
  /** Smallest letter height, in detection pixels, that OCR can still read once enlarged. */
  static final int MIN_HEIGHT = 9;

  private final MSER mser;

  CharacterDetector(int imageArea) {
    // delta 4: the ink-to-ground step of a blurred camera letter spans a few grey levels only.
    mser = MSER.create(4, 30, Math.max(2000, imageArea / 40), 0.25, 0.2, 200, 1.01, 0.003, 5);
    mser.setPass2Only(true);
  }

  List<Component> detect(Mat grey) {
    List<Component> out = new ArrayList<>();
    collect(grey, true, out);
    Mat negative = new Mat();
    Core.bitwise_not(grey, negative);
    collect(negative, false, out);
    negative.release();
    return out;
  }

  /** With pass2Only MSER finds the regions lighter than their surround. */
  private void collect(Mat grey, boolean bright, List<Component> out) {
    List<MatOfPoint> regions = new ArrayList<>();
    MatOfRect boxes = new MatOfRect();
    mser.detectRegions(grey, regions, boxes);
    Rect[] box = boxes.toArray();
    List<Component> kept = new ArrayList<>();
    for (int i = 0; i < box.length; i++) {
      MatOfPoint region = regions.get(i);
      if (letterShaped(box[i], region.rows(), grey.rows()) && !duplicate(box[i], kept)) {
        kept.add(new Component(region, box[i], bright));
      } else {
        region.release();
      }
    }
    boxes.release();
    out.addAll(kept);
  }

  /**
   * Height from MIN_HEIGHT to a third of the picture; width at most twice the height (wide enough
   * for "m" or two touching letters tilted by 30°); ink covering at least 12% of the box, and at
   * most 80% unless the box is a narrow upright stroke.
   */
  static boolean letterShaped(Rect box, int area, int imageHeight) {
    if (box.height < MIN_HEIGHT || box.height > imageHeight / 3) {
      return false;
    }
    if (box.width > 2 * box.height || box.width * 12 < box.height) {
      return false;
    }
    double fill = area / (double) (box.width * box.height);
    if (fill > 0.8 && box.width > 0.4 * box.height) {
      return false; // a solid block (a brick, a pane), not a stroke like "I" or "l"
    }
    return fill >= 0.12;
  }

  /** MSER reports a letter again at neighbouring thresholds with nearly the same box. */
  private static boolean duplicate(Rect b, List<Component> kept) {
    for (Component c : kept) {
      Rect a = c.box;
      int ix = Math.min(a.x + a.width, b.x + b.width) - Math.max(a.x, b.x);
      int iy = Math.min(a.y + a.height, b.y + b.height) - Math.max(a.y, b.y);
      if (ix > 0 && iy > 0) {
        double inter = ix * (double) iy;
        double union = a.area() + b.area() - inter;
        if (inter / union > 0.8) {
          return true;
        }
      }
    }
    return false;
  }
}
