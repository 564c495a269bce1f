package com.quenda.tessel.desktop.translate;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertSame;

import java.util.Set;
import org.junit.jupiter.api.Test;

/** The case rule every path shares, and the Spanish article taken into memory phrases. */
class CaseAndArticleTest {
  @Test
  void caseOfASignIsRecognised() {
    assertEquals(CaseStyle.CAPITALS, CaseStyle.of("KEEP CLEAR"));
    assertEquals(CaseStyle.CAPITALS, CaseStyle.of("EXIT 3"));
    assertEquals(CaseStyle.SENTENCE, CaseStyle.of("A"), "one letter is not a word in capitals");
    assertEquals(CaseStyle.TITLE, CaseStyle.of("Lost Property Office"));
    assertEquals(CaseStyle.TITLE, CaseStyle.of("Museum Shop and Café"), "short words may be small");
    assertEquals(CaseStyle.SENTENCE, CaseStyle.of("Lost property"));
    assertEquals(CaseStyle.SENTENCE, CaseStyle.of("Exit"), "one word is not a title");
  }

  @Test
  void caseIsPutBackForEachTarget() {
    assertEquals(
        "SALIDA DE EMERGENCIA", CaseStyle.CAPITALS.apply("Salida de emergencia", "X", "es"));
    assertEquals(
        "Objetos perdidos", CaseStyle.TITLE.apply("objetos perdidos", "Lost Property", "es"));
    assertEquals("Lost Property Office",
        CaseStyle.TITLE.apply("lost property office", "Objetos Perdidos", "en"));
    assertEquals("Fundbüro Heute", CaseStyle.TITLE.apply("Fundbüro Heute", "Lost Today", "de"));
    assertEquals(
        "prohibido fumar", CaseStyle.SENTENCE.apply("Prohibido fumar", "no smoking", "es"));
    assertEquals(
        "Prohibido fumar", CaseStyle.SENTENCE.apply("prohibido fumar", "No smoking", "es"));
  }

  @Test
  void titlesAreReadInSentenceCaseKeepingAcronymsAndDays() {
    assertEquals(
        "Lost property office", CaseStyle.TITLE.forTranslation("Lost Property Office", Set.of()));
    assertEquals(
        "Free ATM on Sundays", CaseStyle.TITLE.forTranslation("Free ATM On Sundays", Set.of()));
    assertEquals("Keep clear", CaseStyle.CAPITALS.forTranslation("KEEP CLEAR", Set.of()));
  }

  @Test
  void namesKeepTheirCapitalWhenATitleIsReadInSentenceCase() {
    assertEquals(
        "Welcome to Spain", CaseStyle.TITLE.forTranslation("Welcome To Spain", Set.of("spain")));
    assertEquals(
        "Welcome to Spain", CaseStyle.CAPITALS.forTranslation("WELCOME TO SPAIN", Set.of("spain")));
  }

  private static SignMemory.Match phrase(String text, String english, String spanish) {
    int start = text.indexOf(english);
    return new SignMemory.Match(start, start + english.length(), spanish);
  }

  @Test
  void feminineMemoryPhrasesTakeTheirArticle() {
    String text = "Meet at the main entrance";
    SignMemory.Match entrance = phrase(text, "main entrance", "Entrada principal");
    SignMemory.Match taken = SpanishArticle.takeIn(text, entrance);
    assertEquals("la entrada principal", taken.translation);
    assertEquals("Meet at ", text.substring(0, taken.start));

    String plural = "Use the ticket machines";
    assertEquals("las máquinas expendedoras",
        SpanishArticle.takeIn(plural, phrase(plural, "ticket machines", "Máquinas expendedoras"))
            .translation);
    String indefinite = "Ask a member of staff";
    assertEquals("una empleada",
        SpanishArticle.takeIn(indefinite, phrase(indefinite, "member of staff", "Empleada"))
            .translation);
  }

  @Test
  void masculineWordsAndExceptionsAreLeftToApertium() {
    String water = "Drink the drinking water";
    SignMemory.Match agua = phrase(water, "drinking water", "Agua potable");
    assertSame(agua, SpanishArticle.takeIn(water, agua), "el agua");
    String desk = "Ask at the information desk";
    SignMemory.Match info = phrase(desk, "information desk", "Mostrador de información");
    assertSame(info, SpanishArticle.takeIn(desk, info));
    String bare = "Main entrance";
    SignMemory.Match none = phrase(bare, "Main entrance", "Entrada principal");
    assertSame(none, SpanishArticle.takeIn(bare, none), "no English article, none added");
  }
}
