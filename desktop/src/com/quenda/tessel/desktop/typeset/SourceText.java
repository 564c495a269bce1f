package com.quenda.tessel.desktop.typeset;

import java.util.List;

/** A block's text as one: its lines joined with spaces, words hyphenated at a line's end joined. */
public final class SourceText {
  private SourceText() {}

  public static String join(List<String> lines) {
    StringBuilder text = new StringBuilder();
    for (String line : lines) {
      String piece = line.strip();
      if (piece.isEmpty()) {
        continue;
      }
      int end = text.length();
      boolean hyphenated = end >= 2 && text.charAt(end - 1) == '-'
          && Character.isLetter(text.charAt(end - 2)) && Character.isLowerCase(piece.charAt(0));
      if (hyphenated) {
        text.setLength(end - 1);
      } else if (end > 0) {
        text.append(' ');
      }
      text.append(piece);
    }
    return text.toString();
  }
}
