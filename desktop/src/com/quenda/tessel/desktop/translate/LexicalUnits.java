package com.quenda.tessel.desktop.translate;

import java.util.ArrayList;
import java.util.List;
import java.util.regex.Matcher;
import java.util.regex.Pattern;

/**
 * A segment in Apertium's stream format cut into lexical units ("^surface/lemma&lt;tags&gt;$") and
 * the blanks between them, so that rules can read and replace units and put the segment back
 * together unchanged elsewhere.
 */
final class LexicalUnits {
  private static final Pattern UNIT = Pattern.compile("\\^((?:\\\\.|[^\\\\$])*)\\$");

  /** Blanks and units in order: even positions are blanks (maybe empty), odd ones units. */
  final List<String> pieces = new ArrayList<>();

  LexicalUnits(String stream) {
    Matcher m = UNIT.matcher(stream);
    int end = 0;
    while (m.find()) {
      pieces.add(stream.substring(end, m.start()));
      pieces.add(m.group(1));
      end = m.end();
    }
    pieces.add(stream.substring(end));
  }

  int size() {
    return pieces.size() / 2;
  }

  /** The inside of unit {@code i}, without ^ and $. */
  String get(int i) {
    return pieces.get(2 * i + 1);
  }

  void set(int i, String unit) {
    pieces.set(2 * i + 1, unit);
  }

  /** Removes unit {@code i} with the blank before it. */
  void remove(int i) {
    pieces.remove(2 * i + 1);
    pieces.remove(2 * i);
  }

  /** Inserts {@code unit} before unit {@code i}, separated from it by a space. */
  void insert(int i, String unit) {
    pieces.add(2 * i + 1, unit);
    pieces.add(2 * i + 2, " ");
  }

  /** The analyses of an analysed unit (what follows its surface form). */
  static List<String> readings(String unit) {
    List<String> parts = new ArrayList<>();
    StringBuilder part = new StringBuilder();
    for (int i = 0; i < unit.length(); i++) {
      char c = unit.charAt(i);
      if (c == '\\' && i + 1 < unit.length()) {
        part.append(c).append(unit.charAt(++i));
      } else if (c == '/') {
        parts.add(part.toString());
        part.setLength(0);
      } else {
        part.append(c);
      }
    }
    parts.add(part.toString());
    return parts.subList(1, parts.size());
  }

  /** The surface form of an analysed unit. */
  static String surface(String unit) {
    int slash = unit.indexOf('/');
    return slash < 0 ? unit : unit.substring(0, slash);
  }

  @Override
  public String toString() {
    StringBuilder out = new StringBuilder();
    for (int i = 0; i < pieces.size(); i++) {
      out.append(i % 2 == 1 ? "^" + pieces.get(i) + "$" : pieces.get(i));
    }
    return out.toString();
  }
}
