package com.quenda.tessel.desktop.typeset;

import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import com.quenda.tessel.desktop.ocr.RecognizedLine;
import com.quenda.tessel.desktop.translate.Translator;
import java.util.ArrayList;
import java.util.Collections;
import java.util.List;
import java.util.Locale;
import org.opencv.core.Mat;
import org.opencv.core.RotatedRect;

/**
 * Translates a frame's lines block by block and typesets each translation over its block: the
 * lines grouped into blocks, each block's text translated as one, its face read from the ink, and
 * its translation broken back over its lines at one size, aligned as the original.
 */
public final class Typesetter {
  private final Translator translator;
  private final Language target;

  public Typesetter(Translator translator, Language target) {
    this.translator = translator;
    this.target = target;
  }

  /** One block as typeset; {@code translation} and {@code face} are null where not translated. */
  public record SetBlock(Block block, String source, String translation, Face face, boolean fits) {}

  /**
   * One line as typeset. {@code text} is null where its block was not translated; then the line
   * is neither erased nor drawn over.
   */
  public record SetLine(
      int block, String text, RotatedRect eraseRect, RotatedRect textRect, double sizeRatio) {}

  /** The frame's blocks, and its lines in the reader's order. */
  public record Typeset(List<SetBlock> blocks, List<SetLine> lines) {}

  /** Typesets {@code lines} read from {@code rgb} (8-bit, 3 channels). */
  public Typeset run(Mat rgb, List<RecognizedLine> lines) throws HostException {
    List<Block> blocks = BlockFinder.find(lines);
    List<String> sources = new ArrayList<>();
    for (Block block : blocks) {
      sources.add(SourceText.join(texts(lines, block)));
    }
    List<String> translations = stripped(translator.translate(sources));
    List<String> byLine = byLine(blocks, translations, lines);

    SetLine[] set = new SetLine[lines.size()];
    List<SetBlock> setBlocks = new ArrayList<>();
    for (int b = 0; b < blocks.size(); b++) {
      Block block = blocks.get(b);
      String whole = translations.get(b);
      List<String> perLine = new ArrayList<>();
      for (int i : block.lines) {
        perLine.add(byLine.get(i));
      }
      if (whole == null && perLine.stream().allMatch(t -> t == null)) {
        for (int i : block.lines) {
          // Left as it stands: nothing erased, so no need to find its ink's ends.
          set[i] = new SetLine(b, null, lines.get(i).rect, lines.get(i).rect, 0);
        }
        setBlocks.add(new SetBlock(block, sources.get(b), null, null, false));
        continue;
      }
      List<InkEnds.Cover> covers = new ArrayList<>();
      List<RotatedRect> spans = new ArrayList<>();
      List<RotatedRect> inks = new ArrayList<>();
      for (int i : block.lines) {
        covers.add(InkEnds.of(rgb, lines.get(i).rect));
        spans.add(covers.get(covers.size() - 1).along());
        inks.add(lines.get(i).rect);
      }
      Face face = FaceDetector.detect(rgb, inks);
      BlockLayout.Layout layout = whole != null
          ? BlockLayout.lay(texts(lines, block), spans, whole, block.align, block.axis,
              drawnIn(face), TextMetrics.of(face), Locale.forLanguageTag(target.iso))
          : BlockLayout.layLines(texts(lines, block), spans, perLine, block.align, block.axis,
              drawnIn(face), TextMetrics.of(face));
      for (int k = 0; k < block.lines.size(); k++) {
        int i = block.lines.get(k);
        BlockLayout.Placed placed = layout.lines().get(k);
        set[i] = new SetLine(
            b, placed.text(), covers.get(k).erase(), placed.textRect(), placed.sizeRatio());
      }
      String translation = whole != null ? whole : SourceText.join(nonNull(perLine));
      setBlocks.add(new SetBlock(
          block, sources.get(b), translation, target.isCjk() ? null : face, layout.fits()));
    }
    return new Typeset(setBlocks, List.of(set));
  }

  /**
   * Per line, its own translation where its block of several lines could not be translated
   * whole; null elsewhere. A list of separate items (a notice's lines, a menu) looks like a
   * paragraph but is not one, and a back-end that knows phrases knows them line by line.
   */
  private List<String> byLine(List<Block> blocks, List<String> translations,
      List<RecognizedLine> lines) throws HostException {
    List<Integer> asked = new ArrayList<>();
    for (int b = 0; b < blocks.size(); b++) {
      if (translations.get(b) == null && blocks.get(b).lines.size() > 1) {
        asked.addAll(blocks.get(b).lines);
      }
    }
    List<String> byLine = new ArrayList<>(Collections.nCopies(lines.size(), (String) null));
    if (asked.isEmpty()) {
      return byLine;
    }
    List<String> texts = new ArrayList<>();
    for (int i : asked) {
      texts.add(lines.get(i).text);
    }
    List<String> answers = stripped(translator.translate(texts));
    for (int k = 0; k < asked.size(); k++) {
      byLine.set(asked.get(k), answers.get(k));
    }
    return byLine;
  }

  /** The font the translation is measured in: the face bound, or the engine's CJK font. */
  private TextMetrics drawnIn(Face face) {
    return target.isCjk() ? TextMetrics.cjk(cjkFont()) : TextMetrics.of(face);
  }

  /** Translations without surrounding space; null for none or a blank one. */
  private static List<String> stripped(List<String> translations) {
    List<String> out = new ArrayList<>();
    for (String t : translations) {
      out.add(t == null || t.isBlank() ? null : t.strip());
    }
    return out;
  }

  private static List<String> nonNull(List<String> texts) {
    List<String> kept = new ArrayList<>();
    for (String text : texts) {
      if (text != null) {
        kept.add(text);
      }
    }
    return kept;
  }

  /** The renderer's own font for CJK translations (the host binds none for them). */
  private String cjkFont() {
    return target.engine.equals("zh-CHS") ? "NoriChinese-Medium.ttf" : "NotoSansCJK-Regular.ttc";
  }

  private static List<String> texts(List<RecognizedLine> lines, Block block) {
    List<String> texts = new ArrayList<>();
    for (int i : block.lines) {
      texts.add(lines.get(i).text);
    }
    return texts;
  }
}
