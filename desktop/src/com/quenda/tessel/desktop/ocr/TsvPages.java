package com.quenda.tessel.desktop.ocr;

import java.util.ArrayList;
import java.util.HashMap;
import java.util.List;
import java.util.Map;

/**
 * The words of the recogniser's TSV output, by page: with a list of line strips as input, page n
 * (from 1) is the n-th strip. Rows that are not words (page, block and line rows, and the "Page n
 * : file" notes the program interleaves) are skipped.
 */
final class TsvPages {
  /** A word, with its left edge and width in the strip's pixels. */
  record Word(String text, double confidence, int left, int width) {}

  private static final int LEVEL_WORD = 5;

  private TsvPages() {}

  static Map<Integer, List<Word>> parse(String tsv) {
    Map<Integer, List<Word>> pages = new HashMap<>();
    for (String row : tsv.split("\n")) {
      String[] f = row.split("\t", -1);
      if (f.length < 12 || !f[0].equals(Integer.toString(LEVEL_WORD))) {
        continue;
      }
      String text = f[11].trim();
      if (text.isEmpty()) {
        continue;
      }
      try {
        int page = Integer.parseInt(f[1]);
        double conf = Double.parseDouble(f[10]);
        Word w = new Word(text, conf, Integer.parseInt(f[6]), Integer.parseInt(f[8]));
        pages.computeIfAbsent(page, k -> new ArrayList<>()).add(w);
      } catch (NumberFormatException e) {
        // Not a word row after all.
      }
    }
    return pages;
  }
}
