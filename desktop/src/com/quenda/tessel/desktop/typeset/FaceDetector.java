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
 * are the feet at the bottom of stems: a stem crossing the middle of the small letters stands, at
 * the baseline, on ink that reaches out on both sides of it in a serif face, and on ink as wide
 * as itself in a sans face (whose "t", "u" and "a" may have a tail, but on one side only). Bold
 * faces have wider stems. Lines are measured scaled to one height, so a pixel's rounding weighs
 * the same in small and large lines.
 */
public final class FaceDetector {
  // A serif reach above this share of the small letters' height reads as serif: sans faces
  // measure 0, serif faces 0.11 to 0.16, bold or regular (Noto and DejaVu, lines of 16 to 60
  // pixels, printed or photographed).
  static final double SERIF_REACH = 0.05;
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
   * A line's strokes, as shares of its small letters' height: how far its stems' feet reach out
   * on both sides (the upper quartile over its stems), and how wide its stems are (the median).
   */
  record Strokes(double serifReach, double stem) {}

  /** The strokes of the line at {@code rect}; null when it is too small or holds no ink. */
  static Strokes measure(Mat rgb, RotatedRect rect) {
    if (rect.size.height < MIN_LINE_HEIGHT || rect.size.width < MIN_LINE_HEIGHT) {
      return null;
    }
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
    List<Double> reaches = new ArrayList<>();
    List<Double> stems = new ArrayList<>();
    for (double at : new double[] {0.4, 0.5, 0.6}) {
      int stemRow = top + (int) Math.round(at * core);
      for (int footRow = bottom - footRows + 1; footRow <= bottom; footRow++) {
        footReaches(pixels, cols, stemRow, footRow, core, reaches, stems);
      }
    }
    if (reaches.isEmpty()) {
      return null;
    }
    // Not every stem has feet on both sides ("d", "a" and "u" have one): the upper quartile.
    return new Strokes(quantile(reaches, 0.75) / core, quantile(stems, 0.5) / core);
  }

  /**
   * For each stem crossing {@code stemRow} (a run narrower than half the small letters' height)
   * that stands on ink in {@code footRow}, how much wider that ink runs than the stem; adds the
   * stems' widths to {@code stems}. Bowls are left out: their sides do not reach the baseline
   * where they cross the middle.
   */
  private static void footReaches(byte[] pixels, int cols, int stemRow, int footRow, int core,
      List<Double> reaches, List<Double> stems) {
    int start = -1;
    for (int x = 0; x <= cols; x++) {
      boolean ink = x < cols && pixels[stemRow * cols + x] != 0;
      if (ink && start < 0) {
        start = x;
      } else if (!ink && start >= 0) {
        int width = x - start;
        int stemLeft = start;
        int centre = (start + x) / 2;
        start = -1;
        if (width * 2 > core || pixels[footRow * cols + centre] == 0) {
          continue;
        }
        int left = centre;
        int right = centre;
        while (left > 0 && pixels[footRow * cols + left - 1] != 0) {
          left--;
        }
        while (right < cols - 1 && pixels[footRow * cols + right + 1] != 0) {
          right++;
        }
        // Feet reach out on both sides; the tails of a sans "t", "u" or "a" on one.
        reaches.add((double) Math.min(stemLeft - left, right - (stemLeft + width - 1)));
        stems.add((double) width);
      }
    }
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

  private static double median(List<Double> values) {
    return quantile(values, 0.5);
  }

  private static double quantile(List<Double> values, double q) {
    double[] sorted = values.stream().mapToDouble(Double::doubleValue).toArray();
    Arrays.sort(sorted);
    return sorted[(int) (q * (sorted.length - 1) + 0.5)];
  }
}
