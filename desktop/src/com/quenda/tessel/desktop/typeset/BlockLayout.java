package com.quenda.tessel.desktop.typeset;

import com.quenda.tessel.desktop.engine.TextPlacement;
import java.util.ArrayList;
import java.util.Arrays;
import java.util.Collections;
import java.util.List;
import java.util.Locale;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;

/**
 * Typesets a block's translation over its lines: one size for the whole block, the largest at
 * which the text fits, broken so each line gets its share, each line standing where the
 * original's stood after the block's alignment.
 *
 * <p>The renderer fits each string into its text rectangle, centred, at the largest scale where
 * its ink box fills at most {@link #HEIGHT_FILL} of the height and {@link #WIDTH_FILL} of the
 * width. A rectangle exactly as tall as the wanted size needs, and a little wider than the
 * string, therefore draws the string at that size where the rectangle's centre puts it.
 */
public final class BlockLayout {
  // The renderer's share of a text rectangle its fitted ink box fills, in height and in width.
  static final double HEIGHT_FILL = 0.97;
  static final double WIDTH_FILL = 0.94;
  // Room added to each text rectangle's width so that the renderer's own measure of the string,
  // which may differ by a few hundredths from ours, still leaves the height to set the size.
  static final double WIDTH_SLACK = 1.05;
  // Shrinking stops here; an unbreakable word that still does not fit is left to the renderer,
  // which shrinks that line alone.
  static final double SMALLEST = 0.2;

  /** One line of the block as drawn; {@code text} null where the line is not translated. */
  public record Placed(String text, RotatedRect textRect, double sizeRatio) {}

  /** The block's lines as drawn, and whether the translation fits at the original's size. */
  public record Layout(List<Placed> lines, boolean fits) {}

  private BlockLayout() {}

  /**
   * Lays {@code translation} over the lines {@code originals} (texts as read) at {@code spans}
   * (each line's box, its width holding the line's whole ink), in {@code metrics}' font;
   * {@code originalMetrics} is the font the original looks like, for its capital height.
   */
  public static Layout lay(List<String> originals, List<RotatedRect> spans, String translation,
      Align align, double axis, TextMetrics metrics, TextMetrics originalMetrics, Locale locale) {
    Lines lines = new Lines(originals, spans, Collections.nCopies(spans.size(), translation), align,
        axis, metrics, originalMetrics);
    double full = lines.fullScale;
    LineBreaker breaker = new LineBreaker(translation, locale, metrics::width);
    // At the original's size, first each line its share, then each line as much as its room takes.
    List<String> pieces = breaker.proportional(lines.widths);
    if (lines.fitsAt(pieces, full)) {
      return lines.place(pieces, full, true);
    }
    pieces = breaker.filled(scaled(lines.room, full));
    if (pieces != null) {
      return lines.place(pieces, full, true);
    }
    double scale = largestFitting(breaker, lines.room, SMALLEST * full, full);
    pieces = breaker.filled(scaled(lines.room, scale));
    return lines.place(pieces != null ? pieces : breaker.proportional(lines.widths), scale, false);
  }

  /**
   * Lays a block whose lines were translated one by one ({@code translations}, null where a line
   * could not be) over its lines, each on its own line, at one size.
   */
  public static Layout layLines(List<String> originals, List<RotatedRect> spans,
      List<String> translations, Align align, double axis, TextMetrics metrics,
      TextMetrics originalMetrics) {
    Lines lines = new Lines(originals, spans, translations, align, axis, metrics, originalMetrics);
    double scale = lines.fullScale;
    for (int i = 0; i < translations.size(); i++) {
      String piece = translations.get(i);
      if (piece != null && !piece.isEmpty()) {
        scale = Math.min(scale, lines.room[i] / metrics.width(piece));
      }
    }
    boolean fits = scale >= lines.fullScale;
    return lines.place(translations, Math.max(scale, SMALLEST * lines.fullScale), fits);
  }

  /** A block's lines, measured for its translation. */
  private static final class Lines {
    final List<String> originals;
    final List<RotatedRect> spans;
    final Align align;
    final TextMetrics metrics;
    final TextMetrics originalMetrics;
    /** Where each line's text would stand at the original's size. */
    final List<RotatedRect> full = new ArrayList<>();
    /** Pixels per em at the original's size: the lines' median. */
    final double fullScale;
    /** Where each line's baseline lies below its full-size rectangle's centre, in pixels. */
    final double[] baselines;
    /** Each line's own length, and how long its text may be, in pixels. */
    final double[] widths;
    final double[] room;

    Lines(List<String> originals, List<RotatedRect> spans, List<String> translations, Align align,
        double axis, TextMetrics metrics, TextMetrics originalMetrics) {
      this.originals = originals;
      this.spans = spans;
      this.align = align;
      this.metrics = metrics;
      this.originalMetrics = originalMetrics;
      int n = spans.size();
      double[] scales = new double[n];
      baselines = new double[n];
      for (int i = 0; i < n; i++) {
        String kind = translations.get(i) == null ? originals.get(i) : translations.get(i);
        RotatedRect rect = TextPlacement.textRect(spans.get(i), originals.get(i), kind);
        full.add(rect);
        TextMetrics.Box box = metrics.kindBox(kind);
        scales[i] = HEIGHT_FILL * rect.size.height / box.height();
        // The renderer centres the box on the rectangle: the baseline lies below the centre by
        // the box's middle's height above the baseline.
        baselines[i] = scales[i] * (box.top() + box.bottom()) / 2;
      }
      double[] sorted = scales.clone();
      Arrays.sort(sorted);
      fullScale = sorted[n / 2];
      widths = new double[n];
      room = room(spans, align, axis, widths);
    }

    /**
     * The original's capital height: the block's lines were printed at one size, so the median
     * over its lines, each estimated from its box and its text's letters in the original's face
     * (a reader's box varies by a few pixels from line to line).
     */
    double originalCapHeight() {
      double[] caps = new double[spans.size()];
      for (int i = 0; i < caps.length; i++) {
        caps[i] = spans.get(i).size.height * originalMetrics.capHeight()
            / originalMetrics.inkBoxHeight(originals.get(i));
      }
      Arrays.sort(caps);
      return caps[caps.length / 2];
    }

    boolean fitsAt(List<String> pieces, double scale) {
      for (int i = 0; i < pieces.size(); i++) {
        if (metrics.width(pieces.get(i)) * scale > room[i]) {
          return false;
        }
      }
      return true;
    }

    Layout place(List<String> pieces, double scale, boolean fits) {
      int n = spans.size();
      double originalCap = originalCapHeight();
      List<Placed> placed = new ArrayList<>();
      for (int i = 0; i < n; i++) {
        String piece = pieces.get(i);
        if (piece == null) {
          placed.add(new Placed(null, full.get(i), 0));
          continue;
        }
        RotatedRect rect = textRect(
            full.get(i), baselines[i], spans.get(i), piece, align, i == n - 1, scale, metrics);
        placed.add(new Placed(piece, rect, scale * metrics.capHeight() / originalCap));
      }
      return new Layout(placed, fits);
    }
  }

  /**
   * How long each line may be: to the block's far edge from the edge the line keeps. Fills
   * {@code widths} with the lines' own lengths.
   */
  private static double[] room(List<RotatedRect> spans, Align align, double axis, double[] widths) {
    int n = spans.size();
    LineFrame[] frames = new LineFrame[n];
    double blockLeft = Double.MAX_VALUE;
    double blockRight = -Double.MAX_VALUE;
    for (int i = 0; i < n; i++) {
      frames[i] = new LineFrame(spans.get(i), axis);
      blockLeft = Math.min(blockLeft, frames[i].left);
      blockRight = Math.max(blockRight, frames[i].right);
      widths[i] = frames[i].width();
    }
    double[] room = new double[n];
    for (int i = 0; i < n; i++) {
      room[i] = switch (align) {
        case LEFT -> blockRight - frames[i].left;
        case RIGHT -> frames[i].right - blockLeft;
        case CENTRE, JUSTIFIED -> blockRight - blockLeft;
      };
    }
    return room;
  }

  /** The largest scale in [low, high] at which the text fills into the room, or low. */
  private static double largestFitting(
      LineBreaker breaker, double[] room, double low, double high) {
    if (breaker.filled(scaled(room, low)) == null) {
      return low;
    }
    for (int step = 0; step < 16; step++) {
      double middle = (low + high) / 2;
      if (breaker.filled(scaled(room, middle)) != null) {
        low = middle;
      } else {
        high = middle;
      }
    }
    return low;
  }

  /** Lengths in pixels as ems at {@code scale} pixels per em. */
  private static double[] scaled(double[] lengths, double scale) {
    double[] ems = new double[lengths.length];
    for (int i = 0; i < lengths.length; i++) {
      ems[i] = lengths[i] / scale;
    }
    return ems;
  }

  /**
   * The rectangle that has the renderer draw {@code piece} at {@code scale} pixels per em: its
   * baseline {@code baseline} below the full-size rectangle {@code full}'s centre, its start,
   * centre or end where the original line's ({@code span}) was.
   */
  private static RotatedRect textRect(RotatedRect full, double baseline, RotatedRect span,
      String piece, Align align, boolean last, double scale, TextMetrics metrics) {
    if (piece.isEmpty()) {
      return full;
    }
    double width = scale * metrics.width(piece);
    TextMetrics.Box box = metrics.fittedBox(piece);
    double height = scale * box.height() / HEIGHT_FILL;
    double half = span.size.width / 2;
    double along = switch (align) {
      case LEFT -> -half + width / 2;
      case RIGHT -> half - width / 2;
      case CENTRE -> 0;
      case JUSTIFIED -> last ? -half + width / 2 :
          0;
      };
      // Down the rectangle from the full-size one's centre to the piece's box's middle.
      double across = baseline - scale * (box.top() + box.bottom()) / 2;
      double radians = Math.toRadians(full.angle);
      double c = Math.cos(radians);
      double s = Math.sin(radians);
      // The span and the full-size rectangle share their centre along the line.
      Point centre =
          new Point(full.center.x + along * c - across * s, full.center.y + along * s + across * c);
      return new RotatedRect(
          centre, new Size(width * WIDTH_SLACK / WIDTH_FILL + 1, height), full.angle);
    }
  }
