package com.quenda.tessel.desktop.ocr;

import com.quenda.tessel.desktop.ocr.TsvPages.Word;
import java.util.ArrayList;
import java.util.List;

/**
 * Decides whether a recognised strip is text. Texture read as a line comes back as a few symbols
 * or one- and two-letter fragments at low confidence, so a line must have a mean word confidence
 * of at least {@link #MIN_CONFIDENCE} ({@link #SHORT_CONFIDENCE} for three characters or fewer), a
 * word of two letters or more, and mostly letters or digits.
 * Edge words without a letter or digit (a plate's border read as "|") are trimmed first.
 */
final class TextFilter {
  static final double MIN_CONFIDENCE = 55;
  static final double SHORT_CONFIDENCE = 88;

  private TextFilter() {}

  /** The words without symbol-only words at either end. */
  static List<Word> trim(List<Word> words) {
    int from = 0;
    int to = words.size();
    while (from < to && !hasAlphanumeric(words.get(from).text())) {
      from++;
    }
    while (to > from && !hasAlphanumeric(words.get(to - 1).text())) {
      to--;
    }
    return new ArrayList<>(words.subList(from, to));
  }

  static String text(List<Word> words) {
    StringBuilder b = new StringBuilder();
    for (Word w : words) {
      if (b.length() > 0) {
        b.append(' ');
      }
      b.append(w.text());
    }
    return b.toString();
  }

  static double confidence(List<Word> words) {
    double sum = 0;
    for (Word w : words) {
      sum += Math.max(0, w.confidence());
    }
    return words.isEmpty() ? 0 : sum / words.size();
  }

  static boolean isText(List<Word> words) {
    if (words.isEmpty() || confidence(words) < MIN_CONFIDENCE) {
      return false;
    }
    boolean word = false;
    int alnum = 0;
    int other = 0;
    for (Word w : words) {
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
    return word && alnum >= 2 * other && (alnum > 3 || confidence(words) >= SHORT_CONFIDENCE);
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
