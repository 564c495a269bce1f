package com.quenda.tessel.desktop.typeset;

import java.text.BreakIterator;
import java.util.ArrayList;
import java.util.List;
import java.util.Locale;
import java.util.function.ToDoubleFunction;

/**
 * Breaks a text into a given number of lines at the places the language allows: between words,
 * and between characters in scripts written without spaces. Pieces keep the text's logical order,
 * so a right-to-left text's first words go on the first line like any other.
 */
public final class LineBreaker {
  private final String text;
  private final ToDoubleFunction<String> width;
  /** Offsets where a line may end, rising, from 0 to the text's length. */
  private final List<Integer> breaks = new ArrayList<>();

  /** {@code width} measures a piece of the text, trimmed. */
  public LineBreaker(String text, Locale locale, ToDoubleFunction<String> width) {
    this.text = text;
    this.width = width;
    BreakIterator iterator = BreakIterator.getLineInstance(locale);
    iterator.setText(text);
    for (int b = iterator.first(); b != BreakIterator.DONE; b = iterator.next()) {
      breaks.add(b);
    }
    if (breaks.isEmpty()) {
      breaks.add(0);
    }
  }

  /**
   * The text in {@code widths.length} lines, each about its share of the text by width: where
   * the last line is shorter in the original, it is here too. Lines may come out empty when the
   * text has fewer words than there are lines.
   */
  public List<String> proportional(double[] widths) {
    double total = width.applyAsDouble(text.strip());
    double sum = 0;
    for (double w : widths) {
      sum += w;
    }
    List<String> pieces = new ArrayList<>();
    int start = 0;
    double share = 0;
    for (int i = 0; i < widths.length - 1; i++) {
      share += widths[i];
      double target = total * share / sum;
      int best = start;
      double bestMiss = Math.abs(target - measure(0, start));
      for (int b : breaks) {
        if (b <= start) {
          continue;
        }
        double miss = Math.abs(target - measure(0, b));
        // On a tie the line takes the text: a one-word translation goes on the first line.
        if (miss < bestMiss || (best == start && miss <= bestMiss)) {
          best = b;
          bestMiss = miss;
        }
      }
      pieces.add(text.substring(start, best).strip());
      start = best;
    }
    pieces.add(text.substring(start).strip());
    return pieces;
  }

  /**
   * The text filled line by line, each line taking as much as fits {@code capacities[i]}; null
   * when it does not all fit.
   */
  public List<String> filled(double[] capacities) {
    List<String> pieces = new ArrayList<>();
    int start = 0;
    for (double capacity : capacities) {
      int end = start;
      for (int b : breaks) {
        if (b > start && measure(start, b) <= capacity) {
          end = b;
        } else if (b > start) {
          break;
        }
      }
      pieces.add(text.substring(start, end).strip());
      start = end;
    }
    return text.substring(start).isBlank() ? pieces : null;
  }

  private double measure(int from, int to) {
    return width.applyAsDouble(text.substring(from, to).strip());
  }
}
