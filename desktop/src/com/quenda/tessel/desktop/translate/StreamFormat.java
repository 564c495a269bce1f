package com.quenda.tessel.desktop.translate;

/**
 * Apertium's stream format, the text its pipeline stages pass on: characters that mark lexical
 * units are escaped with a backslash, and anything inside square brackets is a "superblank" that
 * every stage copies through untouched. The host formats its own input (instead of Apertium's
 * text deformatter, which does not flush on NUL) and protects text Apertium must not translate,
 * such as memory translations and times, as superblanks.
 */
final class StreamFormat {
  private static final String SPECIAL = "\\[]^$@/<>{}";
  /** What ends every segment: an empty superblank and a line break in a blank. */
  static final String SEGMENT_END = "[][\n]";

  private StreamFormat() {}

  /** Text to be translated, with the characters that mean something to Apertium escaped. */
  static String escape(String text) {
    StringBuilder out = new StringBuilder(text.length() + 8);
    for (int i = 0; i < text.length(); i++) {
      char c = text.charAt(i);
      if (SPECIAL.indexOf(c) >= 0) {
        out.append('\\');
      }
      out.append(c);
    }
    return out.toString();
  }

  /** Text Apertium passes through as it is. */
  static String superblank(String text) {
    return "[" + escape(text) + "]";
  }

  /** The plain text of a pipeline's output: brackets of superblanks dropped, escapes undone. */
  static String plain(String stream) {
    StringBuilder out = new StringBuilder(stream.length());
    for (int i = 0; i < stream.length(); i++) {
      char c = stream.charAt(i);
      if (c == '\\' && i + 1 < stream.length()) {
        out.append(stream.charAt(++i));
      } else if (c != '[' && c != ']' && c != '\0') {
        out.append(c);
      }
    }
    return out.toString();
  }
}
