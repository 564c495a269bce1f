package com.quenda.tessel.desktop;

import java.util.List;
import java.util.Locale;
import java.util.Map;

/**
 * Writes the host's reports as JSON: maps (kept in their insertion order, so keys come out
 * stable), lists, strings, numbers, booleans and null.
 */
public final class Json {
  private Json() {}

  public static String write(Object value) {
    StringBuilder out = new StringBuilder();
    write(value, out, "");
    return out.append('\n').toString();
  }

  private static void write(Object value, StringBuilder out, String indent) {
    if (value == null) {
      out.append("null");
    } else if (value instanceof String) {
      string((String) value, out);
    } else if (value instanceof Double || value instanceof Float) {
      double d = ((Number) value).doubleValue();
      out.append(Double.isFinite(d) ? number(d) : "null");
    } else if (value instanceof Number || value instanceof Boolean) {
      out.append(value);
    } else if (value instanceof Map) {
      map((Map<?, ?>) value, out, indent);
    } else if (value instanceof List) {
      list((List<?>) value, out, indent);
    } else if (value instanceof double[]) {
      double[] numbers = (double[]) value;
      out.append('[');
      for (int i = 0; i < numbers.length; i++) {
        out.append(i == 0 ? "" : ", ").append(number(numbers[i]));
      }
      out.append(']');
    } else {
      throw new IllegalArgumentException("no JSON form for " + value.getClass());
    }
  }

  private static void map(Map<?, ?> map, StringBuilder out, String indent) {
    if (map.isEmpty()) {
      out.append("{}");
      return;
    }
    String inner = indent + "  ";
    out.append("{\n");
    int k = 0;
    for (Map.Entry<?, ?> entry : map.entrySet()) {
      out.append(inner);
      string(entry.getKey().toString(), out);
      out.append(": ");
      write(entry.getValue(), out, inner);
      out.append(++k < map.size() ? ",\n" : "\n");
    }
    out.append(indent).append('}');
  }

  private static void list(List<?> list, StringBuilder out, String indent) {
    if (list.isEmpty()) {
      out.append("[]");
      return;
    }
    String inner = indent + "  ";
    out.append("[\n");
    for (int i = 0; i < list.size(); i++) {
      out.append(inner);
      write(list.get(i), out, inner);
      out.append(i + 1 < list.size() ? ",\n" : "\n");
    }
    out.append(indent).append(']');
  }

  // Two decimals: pixels and milliseconds need no more, and the files stay readable.
  private static String number(double d) {
    String text = String.format(Locale.ROOT, "%.2f", d);
    text = text.contains(".") ? text.replaceAll("0+$", "").replaceAll("\\.$", "") : text;
    return text.equals("-0") ? "0" : text;
  }

  private static void string(String s, StringBuilder out) {
    out.append('"');
    for (int i = 0; i < s.length(); i++) {
      char c = s.charAt(i);
      switch (c) {
        case '"':
          out.append("\\\"");
          break;
        case '\\':
          out.append("\\\\");
          break;
        case '\n':
          out.append("\\n");
          break;
        case '\r':
          out.append("\\r");
          break;
        case '\t':
          out.append("\\t");
          break;
        default:
          if (c < 0x20) {
            out.append(String.format("\\u%04x", (int) c));
          } else {
            out.append(c);
          }
      }
    }
    out.append('"');
  }
}
