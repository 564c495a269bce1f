package com.quenda.tessel.desktop.ocr;

import com.quenda.tessel.desktop.ocr.TsvPages.Word;
import java.util.ArrayList;
import java.util.List;

/**
 * Decides whether a recognised strip is text. Texture read as a line comes back as a few symbols
 * or one- and two-letter fragments at low confidence, so a line must have a mean word confidence
 * of at least {@link #MIN_CONFIDENCE} ({@link #SHORT_CONFIDENCE} for three characters or fewer), a
 * word of two letters or more, and mostly letters or digits.
 * Edge words without a letter or digit, or read with a confidence under {@link #EDGE_CONFIDENCE}
 * (a plate's border or corner read as "|" or "j\\"), are trimmed first.
 */
final class TextFilter {
  static final double MIN_CONFIDENCE = 55;
  static final double SHORT_CONFIDENCE = 88;
  static final double EDGE_CONFIDENCE = 45;

  /** The words kept, and the mean confidence of all words read on the strip. */
  record Reading(List<Word> words, double confidence) {
    String text() {
      StringBuilder b = new StringBuilder();
      for (Word w : words) {
        if (b.length() > 0) {
          b.append(' ');
        }
        b.append(w.text());
      }
      return b.toString();
    }
  }

  private TextFilter() {}

  /** The strip's text, or null if what was read is not text. */
  static Reading accept(List<Word> all) {
    List<Word> kept = trim(all);
    double confidence = meanConfidence(all);
    if (kept.isEmpty() || confidence < MIN_CONFIDENCE) {
      return null;
    }
    boolean word = false;
    int alnum = 0;
    int other = 0;
    for (Word w : kept) {
      int run = 0;
      for (int i = 0; i < w.text().length(); i++) {
        char c = w.text().charAt(i);
        if (Character.isLetterOrDigit(c)) {
          alnum++;
        } else {
          other++;
        }
        run = Character.isLetter(c) ? run + 1 : 0;
        word |= run >= 2;
      }
    }
    // Two or three letters are what texture most often reads as, so they must be read surely.
    boolean sure = alnum > 3 || confidence >= SHORT_CONFIDENCE;
    return word && alnum >= 2 * other && sure ? new Reading(kept, confidence) : null;
  }

  /** The words without junk at either end. */
  static List<Word> trim(List<Word> words) {
    int from = 0;
    int to = words.size();
    while (from < to && junk(words.get(from))) {
      from++;
    }
    while (to > from && junk(words.get(to - 1))) {
      to--;
    }
    return new ArrayList<>(words.subList(from, to));
  }

  static double meanConfidence(List<Word> words) {
    double sum = 0;
    for (Word w : words) {
      sum += Math.max(0, w.confidence());
    }
    return words.isEmpty() ? 0 : sum / words.size();
  }

  /** Symbols only, or read with little confidence: what a plate's edge or corner reads as. */
  private static boolean junk(Word w) {
    return !hasAlphanumeric(w.text()) || w.confidence() < EDGE_CONFIDENCE;
  }

  private static boolean hasAlphanumeric(String s) {
    for (int i = 0; i < s.length(); i++) {
      if (Character.isLetterOrDigit(s.charAt(i))) {
        return true;
      }
    }
    return false;
  }
}
