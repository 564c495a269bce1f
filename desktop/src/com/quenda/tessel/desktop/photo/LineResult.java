package com.quenda.tessel.desktop.photo;

import com.quenda.tessel.desktop.ocr.RecognizedLine;
import java.util.LinkedHashMap;
import java.util.Map;

/** One recognised line and what became of it. */
public final class LineResult {
  public final RecognizedLine line;
  /** Null when the line could not be translated: it is then left as it was in the image. */
  public final String translation;
  /** The engine's text colour, 0xFF000000 | B << 16 | G << 8 | R; 0 when not erased. */
  public final int color;

  public LineResult(RecognizedLine line, String translation, int color) {
    this.line = line;
    this.translation = translation;
    this.color = color;
  }

  public boolean translated() {
    return translation != null;
  }

  /** The line as the JSON report lists it. */
  public Map<String, Object> json() {
    Map<String, Object> json = new LinkedHashMap<>();
    json.put("text", line.text);
    json.put("translation", translation);
    json.put("rect",
        new double[] {line.rect.center.x, line.rect.center.y, line.rect.size.width,
            line.rect.size.height, line.rect.angle});
    json.put("color", translated() ? hex(color) : null);
    json.put("confidence", Math.round(line.confidence));
    json.put("reader", line.reader);
    return json;
  }

  /** "#RRGGBB" of a colour packed as 0xAABBGGRR. */
  static String hex(int packed) {
    return String.format(
        "#%02X%02X%02X", packed & 0xFF, (packed >> 8) & 0xFF, (packed >> 16) & 0xFF);
  }
}
