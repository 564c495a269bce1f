package com.quenda.tessel.desktop.typeset;

import com.quenda.tessel.desktop.Upright;
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
 * serif face make the baseline's runs wider by a sixth of the small letters' height and more.
 * Bold faces have wider stems. Lines are measured scaled to one height.
 */
public final class FaceDetector {
  // A serif reach above this reads as serif: sans faces measure 0 to 0.04, serif faces 0.15 and
  // up, bold or regular (Noto and DejaVu, lines 16 to 60 pixels tall).
  static final double SERIF_REACH = 0.09;
  // Stems wider than this share of the small letters' height read as bold: regular faces measure
  // 0.17 to 0.23, bold ones 0.28 and up.
  static final double BOLD_STEM = 0.255;
  // Below this line height the feet are a pixel or less: too small to tell.
  static final double MIN_LINE_HEIGHT = 10;
  static final int MIN_CORE_ROWS = 6;
  // Lines are measured at this height (pixels).
  static final double NORMAL_HEIGHT = 64;

  private FaceDetector() {}

  /** The face of the lines at {@code rects} in {@code rgb} (8-bit, 3 channels). */
  public static Face detect(Mat rgb, List<RotatedRect> rects) {
    List<Double> reaches = new ArrayList<>();
    List<Double> stems = new ArrayList<>();
    for (RotatedRect rect : rects) {
      Strokes strokes = measure(rgb, rect);
      if (strokes != null) {
        reaches.add(strokes.serifReach());
        stems.add(strokes.stem());
      }
    }
    if (reaches.isEmpty()) {
      return Face.SANS;
    }
    return Face.of(median(reaches) > SERIF_REACH, median(stems) > BOLD_STEM);
  }

  /**
   * A line's strokes, as shares of its small letters' height: how much wider the ink runs along
   * the baseline than halfway up (the serifs' reach), and how wide it runs halfway up (the
   * stems).
   */
  record Strokes(double serifReach, double stem) {}

  /** The strokes of the line at {@code rect}; null when it is too small or holds no ink. */
  static Strokes measure(Mat rgb, RotatedRect rect) {
    if (rect.size.height < MIN_LINE_HEIGHT || rect.size.width < MIN_LINE_HEIGHT) {
      return null;
    }
    // Scaled to one height, so a pixel's rounding weighs the same in small and large lines.
    double scale = NORMAL_HEIGHT / rect.size.height;
    Mat ink = inkOf(rgb, rect, scale);
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
      return null;
    }
    int footRows = Math.max(1, (int) Math.round(0.1 * core));
    double foot = medianRun(pixels, cols, bottom - footRows + 1, bottom);
    double middle =
        medianRun(pixels, cols, top + (int) (0.4 * core), top + (int) Math.ceil(0.6 * core));
    return middle > 0 ? new Strokes((foot - middle) / core, middle / core) : null;
  }

  /** The line's ink, upright, 255 where ink: the smaller side of Otsu's threshold. */
  private static Mat inkOf(Mat rgb, RotatedRect rect, double scale) {
    Mat upright = Upright.cut(rgb, rect.center, rect.angle, scale,
        new Size(Math.round(scale * rect.size.width), Math.round(scale * rect.size.height)),
        Imgproc.INTER_CUBIC);
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
