package com.quenda.tessel.desktop.ocr;

import com.quenda.tessel.desktop.scenes.SceneLine;
import java.util.ArrayList;
import java.util.List;
import java.util.Locale;

/**
 * Compares read lines with a scene's truth: the nearest read line to each true one, the words
 * found and the rectangle errors. Shared by the tests and {@link ReadingMeasure}.
 */
final class LineMatch {
  final SceneLine truth;
  /** Null when no read line lies within the truth's height of it. */
  final RecognizedLine read;

  private LineMatch(SceneLine truth, RecognizedLine read) {
    this.truth = truth;
    this.read = read;
  }

  static List<LineMatch> match(List<SceneLine> truths, List<RecognizedLine> lines) {
    List<LineMatch> out = new ArrayList<>();
    for (SceneLine t : truths) {
      RecognizedLine best = null;
      double bestDistance = t.rect.size.height;
      for (RecognizedLine l : lines) {
        double d = distance(t, l);
        if (d <= bestDistance) {
          bestDistance = d;
          best = l;
        }
      }
      out.add(new LineMatch(t, best));
    }
    return out;
  }

  static double distance(SceneLine t, RecognizedLine l) {
    return Math.hypot(t.rect.center.x - l.rect.center.x, t.rect.center.y - l.rect.center.y);
  }

  double centreError() {
    return distance(truth, read);
  }

  /** Difference of the reading directions, in degrees, 0..180. */
  double angleError() {
    double d = Math.abs(read.rect.angle - truth.rect.angle) % 360;
    return Math.min(d, 360 - d);
  }

  int truthWords() {
    return words(truth.text).size();
  }

  /** The truth's words found among the read ones, case and punctuation aside. */
  int wordsFound() {
    if (read == null) {
      return 0;
    }
    List<String> got = words(read.text);
    int n = 0;
    for (String w : words(truth.text)) {
      if (got.remove(w)) {
        n++;
      }
    }
    return n;
  }

  static List<String> words(String text) {
    List<String> out = new ArrayList<>();
    for (String w : text.toLowerCase(Locale.ROOT).split("\\s+")) {
      String bare = w.replaceAll("[^\\p{L}\\p{N}]", "");
      if (!bare.isEmpty()) {
        out.add(bare);
      }
    }
    return out;
  }

  @Override
  public String toString() {
    return truth + " read as " + read;
  }
}
