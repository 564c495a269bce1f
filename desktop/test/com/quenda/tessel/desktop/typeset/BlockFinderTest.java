package com.quenda.tessel.desktop.typeset;

import static org.junit.jupiter.api.Assertions.assertEquals;

import java.awt.Font;
import java.util.ArrayList;
import java.util.List;
import org.junit.jupiter.api.Test;

/** Blocks and their alignment on printed pages whose paragraphs are known. */
class BlockFinderTest {
  @Test
  void paragraphsSignsAndNotesComeOutAsPrinted() throws Exception {
    Font serif = PrintedPage.font(PrintedPage.NOTO + "NotoSerif-Regular.ttf", 28);
    Font heading = PrintedPage.font(PrintedPage.NOTO + "NotoSans-Bold.ttf", 48);
    PrintedPage page = new PrintedPage(1600, 1200);
    page.line(heading, Align.LEFT, 60, 80, "Opening hours");
    page.paragraph(serif, Align.LEFT, 60, 160, 40, "The museum is open every day",
        "from nine in the morning until five", "in the afternoon, and on Sundays", "until noon.");
    page.paragraph(serif, Align.CENTRE, 1200, 160, 42, "EMERGENCY", "EXIT");
    page.paragraph(serif, Align.RIGHT, 1540, 700, 38, "Tickets are sold at the",
        "counter by the main door", "only.");
    page.line(heading, Align.CENTRE, 400, 1000, "No parking");

    List<Block> blocks = BlockFinder.find(page.lines);

    // In reading order: by each block's first line, top to bottom.
    assertEquals(List.of("Opening hours | centre", "EMERGENCY / EXIT | centre",
                     "The museum is open every day / from nine in the morning until five / in the "
                         + "afternoon, and on Sundays / until noon. | left",
                     "Tickets are sold at the / counter by the main door / only. | right",
                     "No parking | centre"),
        describe(page, blocks));
  }

  @Test
  void twoColumnsSideBySideAreTwoBlocks() throws Exception {
    Font sans = PrintedPage.font(PrintedPage.NOTO + "NotoSans-Regular.ttf", 24);
    PrintedPage page = new PrintedPage(1400, 600);
    page.paragraph(sans, Align.LEFT, 50, 100, 34, "Left column, first line", "and its second",
        "and its third line");
    page.paragraph(
        sans, Align.LEFT, 720, 100, 34, "Right column begins here", "going on", "to its end");

    assertEquals(List.of("Left column, first line / and its second / and its third line | left",
                     "Right column begins here / going on / to its end | left"),
        describe(page, BlockFinder.find(page.lines)));
  }

  @Test
  void aGapWiderThanTheParagraphsPitchStartsANewBlock() throws Exception {
    Font sans = PrintedPage.font(PrintedPage.NOTO + "NotoSans-Regular.ttf", 24);
    PrintedPage page = new PrintedPage(900, 600);
    page.paragraph(
        sans, Align.LEFT, 50, 100, 34, "First paragraph, line one", "line two", "line three");
    page.paragraph(sans, Align.LEFT, 50, 100 + 2 * 34 + 60, 34, "Second paragraph", "ends here");

    assertEquals(List.of("First paragraph, line one / line two / line three | left",
                     "Second paragraph / ends here | left"),
        describe(page, BlockFinder.find(page.lines)));
  }

  @Test
  void alignmentIsReadFromTheLinesEdges() {
    double h = 30;
    // Flush left and flush right but the last line: justified.
    assertEquals(Align.JUSTIFIED,
        Align.detect(new double[] {100, 101, 99, 100}, new double[] {900, 902, 899, 500}, h));
    assertEquals(
        Align.LEFT, Align.detect(new double[] {100, 104, 98}, new double[] {900, 640, 820}, h));
    assertEquals(
        Align.RIGHT, Align.detect(new double[] {200, 420, 130}, new double[] {900, 905, 897}, h));
    assertEquals(
        Align.CENTRE, Align.detect(new double[] {300, 200, 400}, new double[] {700, 800, 601}, h));
    // Two lines of one length: flush left, as most text is set.
    assertEquals(Align.LEFT, Align.detect(new double[] {100, 102}, new double[] {600, 601}, h));
    assertEquals(Align.CENTRE, Align.detect(new double[] {100}, new double[] {600}, h));
  }

  /** Each block as its lines' texts and its alignment. */
  private static List<String> describe(PrintedPage page, List<Block> blocks) {
    List<String> out = new ArrayList<>();
    for (Block block : blocks) {
      out.add(String.join(" / ", page.texts(block.lines)) + " | " + block.align.label);
    }
    return out;
  }
}
