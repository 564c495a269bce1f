package com.quenda.tessel.desktop.typeset;

import com.quenda.tessel.desktop.Upright;
import com.quenda.tessel.desktop.engine.FontChoice;
import com.quenda.tessel.desktop.photo.StrokeWeight;
import java.util.ArrayList;
import java.util.Arrays;
import java.util.List;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * Whether a block was printed in a serif or a sans face, and bold or not, from its ink. Serifs
 * are the feet at the bottom of stems: along the baseline the ink runs in wide strokes (feet,
 * and the bowls' bottoms), halfway up the small letters in narrow ones (stems, the bowls'
 * sides). In a sans face the stems end as they run, so the two widths stay close; the feet of a
 * serif face make the baseline's runs twice as wide and more. Bold comes from the stroke width.
 */
public final class FaceDetector {
  // Baseline runs over middle runs above this read as serif: sans text measures 1.0 to 1.6,
  // serif text 2.2 and up (on rendered and photographed lines of 12 to 60 pixels).
  static final double SERIF_RATIO = 1.9;
  // Below this height the feet are a pixel or less: too small to tell.
  static final int MIN_CORE_ROWS = 6;

  private FaceDetector() {}

  /** The face of the lines at {@code rects} in {@code rgb} (8-bit, 3 channels). */
  public static Face detect(Mat rgb, List<RotatedRect> rects) {
    List<Double> ratios = new ArrayList<>();
    for (RotatedRect rect : rects) {
      double ratio = serifRatio(rgb, rect);
      if (!Double.isNaN(ratio)) {
        ratios.add(ratio);
      }
    }
    boolean serif = !ratios.isEmpty() && median(ratios) > SERIF_RATIO;
    boolean bold =
        FontChoice.weightOf(StrokeWeight.medianRatio(rgb, rects)) == FontChoice.Weight.BOLD;
    return Face.of(serif, bold);
  }

  /**
   * The median ink run along the baseline over the median run halfway up the small letters, in
   * the line at {@code rect}; NaN when the line is too small or holds no ink.
   */
  static double serifRatio(Mat rgb, RotatedRect rect) {
    if (rect.size.height < MIN_CORE_ROWS || rect.size.width < MIN_CORE_ROWS) {
      return Double.NaN;
    }
    Mat ink = inkOf(rgb, rect);
    int rows = ink.rows();
    int cols = ink.cols();
    byte[] pixels = new byte[rows * cols];
    ink.get(0, 0, pixels);
    ink.release();
    int[] counts = new int[rows];
    int most = 0;
    for (int y = 0; y < rows; y++) {
      for (int x = 0; x < cols; x++) {
        counts[y] += pixels[y * cols + x] != 0 ? 1 : 0;
      }
      most = Math.max(most, counts[y]);
    }
    // The small letters' band: the rows holding at least half the busiest row's ink.
    int top = -1;
    int bottom = -1;
    for (int y = 0; y < rows; y++) {
      if (counts[y] * 2 >= most && most > 0) {
        top = top < 0 ? y : top;
        bottom = y;
      }
    }
    int core = bottom - top + 1;
    if (top < 0 || core < MIN_CORE_ROWS) {
      return Double.NaN;
    }
    int footRows = Math.max(1, (int) Math.round(0.1 * core));
    double foot = medianRun(pixels, cols, bottom - footRows + 1, bottom);
    double middle =
        medianRun(pixels, cols, top + (int) (0.4 * core), top + (int) Math.ceil(0.6 * core));
    return middle > 0 ? foot / middle : Double.NaN;
  }

  /** The line's ink, upright, 255 where ink: the smaller side of Otsu's threshold. */
  private static Mat inkOf(Mat rgb, RotatedRect rect) {
    Mat upright = Upright.cut(rgb, rect.center, rect.angle, 1,
        new Size(Math.round(rect.size.width), Math.round(rect.size.height)), Imgproc.INTER_LINEAR);
    Mat grey = new Mat();
    Imgproc.cvtColor(upright, grey, Imgproc.COLOR_RGB2GRAY);
    upright.release();
    Mat ink = new Mat();
    Imgproc.threshold(grey, ink, 0, 255, Imgproc.THRESH_BINARY | Imgproc.THRESH_OTSU);
    grey.release();
    if (Core.countNonZero(ink) > ink.total() / 2) {
      Core.bitwise_not(ink, ink);
    }
    return ink;
  }

  /** The median length of the horizontal ink runs in rows {@code from..to}; 0 without ink. */
  private static double medianRun(byte[] pixels, int cols, int from, int to) {
    List<Double> runs = new ArrayList<>();
    for (int y = from; y <= to; y++) {
      int run = 0;
      for (int x = 0; x <= cols; x++) {
        if (x < cols && pixels[y * cols + x] != 0) {
          run++;
        } else if (run > 0) {
          runs.add((double) run);
          run = 0;
        }
      }
    }
    return runs.isEmpty() ? 0 : median(runs);
  }

  private static double median(List<Double> values) {
    double[] sorted = values.stream().mapToDouble(Double::doubleValue).toArray();
    Arrays.sort(sorted);
    return sorted[sorted.length / 2];
  }
}
