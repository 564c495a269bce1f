package com.quenda.tessel.desktop.engine;

import com.quenda.tessel.Constants;
import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.inpainting.InpaintingJNI;
import java.lang.ref.Reference;
import java.util.ArrayList;
import java.util.List;
import org.opencv.core.Mat;
import org.opencv.core.RotatedRect;

/**
 * Erases text lines from a frame through the engine's inpainting bridge, as a phone host asks for
 * it: each OCR rectangle widened and heightened by the engine's ratios (OCR boxes hug the ink; the
 * overlay needs background around it to fade into), one output matrix and one text colour per
 * line.
 */
public final class Eraser {
  private Eraser() {}

  /** The overlays of one request; release them with {@link #release()}. */
  public static final class Patches {
    /** The rectangles as sent, enlarged: where each patch was cut, five values per line. */
    public final double[] patchRects;
    /** Per line its RGBA overlay, upright; empty where the line could not be erased. */
    public final List<Mat> overlays;
    /** Per line the text colour, 0xFF000000 | B << 16 | G << 8 | R. */
    public final int[] colors;

    Patches(double[] patchRects, List<Mat> overlays, int[] colors) {
      this.patchRects = patchRects;
      this.overlays = overlays;
      this.colors = colors;
    }

    public long[] addresses() {
      long[] addresses = new long[overlays.size()];
      for (int i = 0; i < addresses.length; i++) {
        addresses[i] = overlays.get(i).getNativeObjAddr();
      }
      return addresses;
    }

    public void release() {
      overlays.forEach(Mat::release);
    }
  }

  /** Erases the lines at {@code ocrRects} from {@code rgb} (8-bit, 3 channels). */
  public static Patches erase(Mat rgb, List<RotatedRect> ocrRects) throws HostException {
    double[] rects = enlarged(Rects.pack(ocrRects));
    List<Mat> overlays = new ArrayList<>();
    for (int i = 0; i < ocrRects.size(); i++) {
      overlays.add(new Mat());
    }
    Patches patches = new Patches(rects, overlays, new int[ocrRects.size()]);
    if (ocrRects.isEmpty()) {
      return patches;
    }
    int status = InpaintingJNI.InpaintingRotRectImg(
        rgb.getNativeObjAddr(), patches.addresses(), rects, patches.colors);
    // The engine reads the frame by address only; the collector must not free it meanwhile.
    Reference.reachabilityFence(rgb);
    if (status != 0) {
      patches.release();
      throw new HostException(
          ExitStatus.INTERNAL, "the engine refused to erase the text (status " + status + ")");
    }
    return patches;
  }

  /** OCR rectangles as the inpainting request takes them: scaled by the engine's ratios. */
  public static double[] enlarged(double[] ocrRects) {
    int stride = Constants.getValsPerRect();
    double[] rects = ocrRects.clone();
    for (int i = 0; i + stride <= rects.length; i += stride) {
      rects[i + 2] *= Constants.getInpaintRectWidthRatio();
      rects[i + 3] *= Constants.getInpaintRectHeightRatio();
    }
    return rects;
  }
}
