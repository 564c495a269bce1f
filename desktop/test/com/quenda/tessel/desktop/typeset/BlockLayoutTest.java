package com.quenda.tessel.desktop.typeset;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertFalse;
import static org.junit.jupiter.api.Assertions.assertTrue;

import java.util.ArrayList;
import java.util.List;
import java.util.Locale;
import org.junit.jupiter.api.Test;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;

/** A block's translation typeset over its lines: one size, the original's edges kept. */
class BlockLayoutTest {
  private static final TextMetrics SANS = TextMetrics.of(Face.SANS);
  private static final List<String> ORIGINALS = List.of("The museum is open every day from nine",
      "to five, and on Sundays from ten until", "noon only.");

  /** Three lines 30 pixels tall (ascenders to descenders), flush left at x = 100. */
  private static List<RotatedRect> spans() {
    return List.of(span(100, 700, 100), span(100, 690, 145), span(100, 300, 190));
  }

  private static RotatedRect span(double left, double right, double y) {
    return new RotatedRect(new Point((left + right) / 2, y), new Size(right - left, 30), 0);
  }

  @Test
  void aParagraphIsSetAtOneSizeFlushLeftAndTheWholeTextIsKept() {
    String translation = "El museo abre todos los días de nueve a cinco, y los domingos de diez "
        + "hasta el mediodía.";
    BlockLayout.Layout layout = lay(translation, Align.LEFT, spans());

    assertTrue(layout.fits());
    assertEquals(translation, SourceText.join(texts(layout)));
    List<BlockLayout.Placed> lines = layout.lines();
    for (BlockLayout.Placed line : lines) {
      // The drawn text starts where the original's ink started.
      assertEquals(100, textLeft(line), 0.5, line.text());
      assertEquals(lines.get(0).sizeRatio(), line.sizeRatio(), 0.01 * lines.get(0).sizeRatio());
    }
    // At the original's size: the capitals as tall as the original's, within the font's rounding.
    assertEquals(1.0, lines.get(0).sizeRatio(), 0.06);
  }

  @Test
  void aLongerTranslationTakesTheLinesUnusedLengthBeforeItShrinks() {
    // Too long for the last line's own 200 pixels, not for the paragraph's 600.
    String longer = "El museo abre todos los días de nueve a cinco, y los domingos de diez hasta "
        + "el mediodía y media, salvo en fiestas.";
    BlockLayout.Layout layout = lay(longer, Align.LEFT, spans());
    assertTrue(layout.fits());
    assertEquals(1.0, layout.lines().get(0).sizeRatio(), 0.06);
    assertTrue(textRight(layout.lines().get(2)) > 300 + 20);

    // Twice as long as the paragraph holds: smaller, still one size and all of it.
    String tooLong = longer + " " + longer + " " + longer;
    BlockLayout.Layout shrunk = lay(tooLong, Align.LEFT, spans());
    assertFalse(shrunk.fits());
    assertEquals(tooLong, SourceText.join(texts(shrunk)));
    double ratio = shrunk.lines().get(0).sizeRatio();
    assertTrue(ratio < 0.8, "ratio " + ratio);
    for (BlockLayout.Placed line : shrunk.lines()) {
      assertEquals(ratio, line.sizeRatio(), 0.01 * ratio);
      assertTrue(textRight(line) <= 700 + 0.5, line.text());
    }
  }

  @Test
  void centredAndFlushRightBlocksKeepTheirEdges() {
    List<RotatedRect> centred = List.of(span(200, 600, 100), span(300, 500, 145));
    BlockLayout.Layout c = lay("SALIDA DE EMERGENCIA", Align.CENTRE, centred);
    for (int i = 0; i < 2; i++) {
      BlockLayout.Placed line = c.lines().get(i);
      assertEquals(400, (textLeft(line) + textRight(line)) / 2, 0.5);
    }
    List<RotatedRect> right = List.of(span(200, 700, 100), span(450, 700, 145));
    BlockLayout.Layout r = lay("Entradas a la venta aquí", Align.RIGHT, right);
    for (BlockLayout.Placed line : r.lines()) {
      assertEquals(700, textRight(line), 0.5, line.text());
    }
  }

  @Test
  void everyLineStandsOnTheOriginalsBaselineWhateverItsLetters() {
    // A sign in capitals whose translation has a small word: the lines in capitals only must not
    // drop to where the small letters' descenders would end.
    List<String> originals = List.of("SUMMER SCHOOL", "IN DATA ANALYSIS");
    List<RotatedRect> spans = List.of(span(100, 600, 100), span(100, 640, 150));
    BlockLayout.Layout layout = BlockLayout.lay(originals, spans,
        "ESCUELA DE VERANO EN ANÁLISIS de DATOS", Align.LEFT, 0, SANS, SANS, Locale.ROOT);
    for (int i = 0; i < 2; i++) {
      BlockLayout.Placed line = layout.lines().get(i);
      TextMetrics.Box box = SANS.fittedBox(line.text());
      double scale = BlockLayout.HEIGHT_FILL * line.textRect().size.height / box.height();
      double baseline = line.textRect().center.y + scale * (box.top() + box.bottom()) / 2;
      double originalBaseline = spans.get(i).center.y + spans.get(i).size.height / 2;
      assertEquals(originalBaseline, baseline, 1.0, line.text());
    }
  }

  @Test
  void linesTranslatedOneByOneShareOneSize() {
    List<String> perLine =
        java.util.Arrays.asList("Öffnungszeiten: Montag bis Freitag", "Notausgang", null);
    BlockLayout.Layout layout =
        BlockLayout.layLines(ORIGINALS, spans(), perLine, Align.LEFT, 0, SANS, SANS);
    assertEquals("Notausgang", layout.lines().get(1).text());
    assertEquals(null, layout.lines().get(2).text());
    assertEquals(layout.lines().get(0).sizeRatio(), layout.lines().get(1).sizeRatio(),
        0.01 * layout.lines().get(0).sizeRatio());
  }

  private static BlockLayout.Layout lay(String translation, Align align, List<RotatedRect> spans) {
    List<String> originals = ORIGINALS.subList(0, spans.size());
    return BlockLayout.lay(originals, spans, translation, align, 0, SANS, SANS, Locale.ROOT);
  }

  private static List<String> texts(BlockLayout.Layout layout) {
    List<String> texts = new ArrayList<>();
    layout.lines().forEach(l -> texts.add(l.text()));
    return texts;
  }

  /** Where the renderer starts the text: centred in its rectangle at the rectangle's height. */
  private static double textLeft(BlockLayout.Placed line) {
    return line.textRect().center.x - drawnWidth(line) / 2;
  }

  private static double textRight(BlockLayout.Placed line) {
    return line.textRect().center.x + drawnWidth(line) / 2;
  }

  private static double drawnWidth(BlockLayout.Placed line) {
    double scale =
        BlockLayout.HEIGHT_FILL * line.textRect().size.height / SANS.fittedHeight(line.text());
    return scale * SANS.width(line.text());
  }
}
