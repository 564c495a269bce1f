package com.quenda.tessel.desktop.photo;

import com.quenda.tessel.desktop.ocr.RecognizedLine;
import com.quenda.tessel.desktop.typeset.Align;
import com.quenda.tessel.desktop.typeset.Face;
import com.quenda.tessel.desktop.typeset.Typesetter;
import java.util.LinkedHashMap;
import java.util.Map;

/** One recognised line and what became of it. */
public final class LineResult {
  public final RecognizedLine line;
  /**
   * The piece of its block's translation drawn on this line; null when the block could not be
   * translated: the line is then left as it was in the image.
   */
  public final String translation;
  /** The engine's text colour, 0xFF000000 | B << 16 | G << 8 | R; 0 when not erased. */
  public final int color;

  /** The index of the line's block in the report's blocks. */
  public final int block;
  /** The drawn capitals' height over the original's; 0 when not drawn. */
  public final double sizeRatio;
  public final Align align;
  /** Null where not translated, and for CJK translations (drawn in the engine's own font). */
  public final Face face;

  /**
   * Line {@code i} as {@code typeset} set it, with the text colour {@code color} it was erased with
   * (0 where not translated).
   */
  public static LineResult of(RecognizedLine line, Typesetter.Typeset typeset, int i, int color) {
    Typesetter.SetLine set = typeset.lines().get(i);
    Typesetter.SetBlock block = typeset.blocks().get(set.block());
    return new LineResult(
        line, set.text(), color, set.block(), set.sizeRatio(), block.block().align, block.face());
  }

  private LineResult(RecognizedLine line, String translation, int color, int block,
      double sizeRatio, Align align, Face face) {
    this.line = line;
    this.translation = translation;
    this.color = color;
    this.block = block;
    this.sizeRatio = sizeRatio;
    this.align = align;
    this.face = face;
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
    json.put("block", block);
    json.put("size_ratio", translated() ? Math.round(sizeRatio * 1000) / 1000.0 : null);
    json.put("align", align.label);
    json.put("face", translated() && face != null ? face.label : null);
    return json;
  }

  /** "#RRGGBB" of a colour packed as 0xAABBGGRR. */
  static String hex(int packed) {
    return String.format(
        "#%02X%02X%02X", packed & 0xFF, (packed >> 8) & 0xFF, (packed >> 16) & 0xFF);
  }
}
