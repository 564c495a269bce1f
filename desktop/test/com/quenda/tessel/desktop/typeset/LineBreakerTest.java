package com.quenda.tessel.desktop.typeset;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertNull;

import java.util.List;
import java.util.Locale;
import org.junit.jupiter.api.Test;

/** A translation broken back into a block's lines, and a block's lines joined into one text. */
class LineBreakerTest {
  // One unit per character: what a line takes is easy to see.
  private static double chars(String s) {
    return s.codePointCount(0, s.length());
  }

  @Test
  void eachLineTakesItsShareAtWordBoundariesAndTheLastMayBeShort() {
    LineBreaker breaker =
        new LineBreaker("El museo abre todos los días de nueve a cinco de la tarde.", Locale.ROOT,
            LineBreakerTest::chars);
    // Lines of 30, 30 and 10: of the text's 58 characters the breaks nearest 25 and 50 are taken.
    assertEquals(List.of("El museo abre todos los", "días de nueve a cinco de la", "tarde."),
        breaker.proportional(new double[] {30, 30, 10}));
    // Fewer words than lines: a line is left empty rather than a word broken.
    assertEquals(List.of("Salida", ""),
        new LineBreaker("Salida", Locale.ROOT, LineBreakerTest::chars)
            .proportional(new double[] {10, 10}));
  }

  @Test
  void fillingTakesAsMuchAsFitsAndSaysWhenTheTextDoesNot() {
    LineBreaker breaker = new LineBreaker(
        "Por favor mantenga esta puerta cerrada", Locale.ROOT, LineBreakerTest::chars);
    assertEquals(List.of("Por favor mantenga", "esta puerta cerrada"),
        breaker.filled(new double[] {20, 20}));
    assertNull(breaker.filled(new double[] {15, 15}));
    // A word longer than every line never fits.
    assertNull(new LineBreaker("Notausgangstür", Locale.ROOT, LineBreakerTest::chars)
                   .filled(new double[] {10, 10}));
  }

  @Test
  void textsWithoutSpacesBreakBetweenCharacters() {
    LineBreaker breaker = new LineBreaker(
        "非常口はこちらです押さないでください", new Locale("ja"), LineBreakerTest::chars);
    List<String> lines = breaker.proportional(new double[] {9, 9});
    assertEquals(List.of("非常口はこちらです", "押さないでください"), lines);
    assertEquals(List.of("非常口はこちら", "です押さないでく", "ださい"),
        breaker.filled(new double[] {7, 8, 8}));
  }

  @Test
  void rightToLeftTextsKeepTheirLogicalOrder() {
    // The first words in reading order go on the first line; the renderer lays each line out
    // right to left.
    LineBreaker breaker =
        new LineBreaker("יציאת חירום בלבד נא לא לחסום", new Locale("he"), LineBreakerTest::chars);
    assertEquals(
        List.of("יציאת חירום בלבד", "נא לא לחסום"), breaker.proportional(new double[] {16, 12}));
  }

  @Test
  void aBlocksLinesJoinIntoOneTextAndHyphenatedWordsAreMended() {
    assertEquals("The museum is open every day from nine to five.",
        SourceText.join(List.of("The museum is open every ", "day from nine to five.")));
    assertEquals("Please keep information about the exhibits",
        SourceText.join(List.of("Please keep infor-", "mation about the exhibits")));
    // A hyphen before a capital, or after a digit, belongs to the text.
    assertEquals("Monday to Friday 9- 18 North- East",
        SourceText.join(List.of("Monday to Friday 9-", "18 North-", "East")));
    assertEquals("EMERGENCY EXIT", SourceText.join(List.of("EMERGENCY", "", "EXIT")));
  }
}
