package com.quenda.tessel.desktop.ocr;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertNull;

import com.quenda.tessel.desktop.ocr.TsvPages.Word;
import java.util.List;
import java.util.Map;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.opencv.core.Core;

/** The rules applied to the OCR program's output, without running it. */
class ReadingRulesTest {
  @BeforeAll
  static void loadOpenCv() {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
  }

  @Test
  void tsvWordsAreFiledByStripAndEverythingElseSkipped() {
    String tsv = "level\tpage_num\tblock_num\tpar_num\tline_num\tword_num\tleft\ttop\twidth\theight"
        + "\tconf\ttext\n"
        + "Page 1 : /tmp/x/line000.png\n"
        + "1\t1\t0\t0\t0\t0\t0\t0\t381\t68\t-1\t\n"
        + "4\t1\t1\t1\t1\t0\t14\t14\t354\t41\t-1\t\n"
        + "5\t1\t1\t1\t1\t1\t14\t16\t251\t39\t96.09\tEmergency\n"
        + "5\t1\t1\t1\t1\t2\t283\t14\t85\t32\t91.5\texit\n"
        + "Page 3 : /tmp/x/line002.png\n"
        + "5\t3\t1\t1\t1\t1\t10\t12\t40\t30\t95\t \n"
        + "5\t3\t1\t1\t1\t2\t60\t12\t80\t30\t88\tclosed\n";
    Map<Integer, List<Word>> pages = TsvPages.parse(tsv);
    assertEquals(List.of(new Word("Emergency", 96.09, 14, 251), new Word("exit", 91.5, 283, 85)),
        pages.get(1));
    assertNull(pages.get(2));
    assertEquals(List.of(new Word("closed", 88, 60, 80)), pages.get(3));
  }

  @Test
  void junkAtTheEdgesIsTrimmedButStillCountsAgainstTheLine() {
    TextFilter.Reading plate = TextFilter.accept(
        List.of(w("|", 40), w("Staff", 96), w("only", 95), w("j\\", 30), w("»", 60)));
    assertEquals("Staff only", plate.text());
    assertEquals((40 + 96 + 95 + 30 + 60) / 5.0, plate.confidence(), 1e-9);

    // An upside-down line: one confident fragment among garbage is not a reading.
    assertNull(TextFilter.accept(List.of(w("NOA", 91), w("Jo", 20), w("9AjoM}", 30))));
    // Two-letter readings of texture need to be sure; symbols alone are never text.
    assertNull(TextFilter.accept(List.of(w("ee", 78))));
    assertEquals("No", TextFilter.accept(List.of(w("No", 93))).text());
    assertNull(TextFilter.accept(List.of(w("—", 95), w("=", 95))));
    assertNull(TextFilter.accept(List.of(w("a", 95), w("1", 95), w("&", 95))));
  }

  private static Word w(String text, double confidence) {
    return new Word(text, confidence, 0, 10);
  }
}
