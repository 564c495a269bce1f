package com.quenda.tessel.desktop.translate;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertFalse;
import static org.junit.jupiter.api.Assertions.assertNull;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import java.io.ByteArrayOutputStream;
import java.io.PrintStream;
import java.nio.charset.StandardCharsets;
import java.util.List;
import java.util.regex.Pattern;
import org.junit.jupiter.api.AfterAll;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;

/**
 * The real Apertium with the editing rules and case, without the memory, so that each rule is
 * seen by its own output. Only the words the rules decide are pinned, not the dictionary's
 * choices around them.
 */
class SignTranslationTest {
  private static final ByteArrayOutputStream log = new ByteArrayOutputStream();
  private static ApertiumTranslator spanish;

  @BeforeAll
  static void start() throws HostException {
    spanish = new ApertiumTranslator(Language.of("en"), Language.of("es"), SignMemory.EMPTY,
        ApertiumTranslator.TIMEOUT_MILLIS, new PrintStream(log, true, StandardCharsets.UTF_8));
  }

  @AfterAll
  static void stop() {
    spanish.close();
  }

  private static String es(String text) throws HostException {
    return spanish.translate(List.of(text)).get(0);
  }

  @Test
  void politeRequestsUseThePoliteFormulaAndUsted() throws HostException {
    assertEquals("Por favor, mantenga la puerta cerrada", es("Please keep the door closed"));
    assertTrue(es("Wait here, please.").startsWith("Por favor, espere"), es("Wait here, please."));
  }

  @Test
  void aParagraphIsTranslatedSentenceBySentence() throws HostException {
    assertEquals(List.of("Children under twelve do not pay.", "Please keep the door closed."),
        ApertiumTranslator.sentences(
            "Children under twelve do not pay. Please keep the door closed."));
    // The request's rule sees its sentence whole even when a block holds it after another one.
    String paragraph = es("The museum is open every day. Please keep the door closed.");
    assertTrue(paragraph.endsWith(". Por favor, mantenga la puerta cerrada."), paragraph);
    // A sentence nobody can translate stands as written between translated ones.
    String named = es("Zorbly Quaxen. Please keep the door closed.");
    assertTrue(named.startsWith("Zorbly Quaxen. Por favor, mantenga"), named);
  }

  @Test
  void commandsToTheReaderAreInfinitivesNeverFamiliar() throws HostException {
    assertEquals("No tocar", es("Do not touch"));
    assertTrue(es("Wait here").startsWith("Esperar "), es("Wait here"));
    String bags = es("Keep your bags with you at all times");
    assertTrue(bags.startsWith("Mantener sus "), bags);
    Pattern familiar = Pattern.compile(
        "\\b(vuestr[oa]s?|vosotr[oa]s|os|tus?|ti|contigo|mantén|mantened|tienes)\\b");
    for (String text : List.of(bags, es("You must show your ticket"), es("Take your coat"))) {
      assertFalse(familiar.matcher(text.toLowerCase()).find(), text);
    }
  }

  @Test
  void prohibitionsAndRestrictions() throws HostException {
    assertEquals("Prohibido correr", es("No running"));
    assertEquals("Prohibidos los perros", es("No dogs"));
    assertTrue(es("Members only").startsWith("Solo "), es("Members only"));
  }

  @Test
  void signUsageTheDictionaryMisses() throws HostException {
    assertEquals("No entrar", es("Do not enter"));
    assertTrue(es("Children under 12 go free.").contains(" menores de 12 años "),
        es("Children under 12 go free."));
    assertTrue(
        es("Kids under 3 eat for free").endsWith(" gratis"), es("Kids under 3 eat for free"));
    assertTrue(es("Dogs are not allowed in the park.").startsWith("No se admiten perros en "),
        es("Dogs are not allowed in the park."));
    assertTrue(es("Visitors must wear a badge.").contains(" deben "));
    assertTrue(es("The lift is broken.").contains("ascensor"), es("The lift is broken."));
  }

  @Test
  void notices() throws HostException {
    assertTrue(es("The garden is open today.").contains(" está abierto "),
        es("The garden is open today."));
    assertTrue(es("The bar is on the roof.").contains(" está en "), es("The bar is on the roof."));
    assertTrue(es("Maps are sold at the desk.").startsWith("Los mapas se venden "),
        es("Maps are sold at the desk."));
    assertEquals("Andén 4", es("Platform 4"));
    String split = es("Slippery floor, please hold the rail");
    assertTrue(split.contains(", por favor, ") && !split.contains("omplacer"), split);
    assertEquals("ABIERTO HASTA LAS SEIS", es("OPEN UNTIL SIX"));
  }

  @Test
  void catalanAndGalicianReadersAreAddressedFormallyToo() throws HostException {
    Pattern familiar = Pattern.compile("\\b(vostres?|teus?|tu|vos[oa]s?|contigo|ti)\\b");
    for (String to : List.of("ca", "gl")) {
      try (ApertiumTranslator translator = new ApertiumTranslator(Language.of("en"),
               Language.of(to), SignMemory.EMPTY, ApertiumTranslator.TIMEOUT_MILLIS,
               new PrintStream(log, true, StandardCharsets.UTF_8))) {
        List<String> out = translator.translate(
            List.of("Keep your bags with you", "You must show your ticket.", "Please wait here"));
        for (String text : out) {
          assertFalse(familiar.matcher(text.toLowerCase()).find(), to + ": " + text);
        }
        assertTrue(out.get(2).startsWith(to.equals("ca") ? "Si us plau, " : "Por favor, "), to);
      }
    }
  }

  @Test
  void numbersAndTimesAreKeptAsWritten() throws HostException {
    String hours = es("Open 9am to 5:30pm");
    assertTrue(hours.contains("9am") && hours.contains("5:30pm"), hours);
    assertTrue(es("Platform 12").contains("12"), es("Platform 12"));
  }

  @Test
  void caseOfTheOriginalIsKept() throws HostException {
    assertEquals("PROHIBIDO CORRER", es("NO RUNNING"));
    String title = es("Natural History Museum Opening Times");
    assertTrue(Character.isUpperCase(title.charAt(0)), title);
    assertEquals(title.substring(1), title.substring(1).toLowerCase(), "Spanish: sentence case");
    assertTrue(Character.isLowerCase(es("wait here").charAt(0)));
    // Names Apertium knows keep their capital in a title read in sentence case.
    String names = es("Visit Madrid And Barcelona");
    assertTrue(names.contains("Madrid") && names.contains("Barcelona"), names);
  }

  @Test
  void textsAreTranslatedApartAndUnknownOnesAreNull() throws HostException {
    List<String> out = spanish.translate(List.of("Exit", "Entrance", "plugh xyzzy"));
    assertFalse(out.get(0).toLowerCase().contains("entrada"), out.toString());
    assertTrue(out.get(1).toLowerCase().contains("entrada"), out.toString());
    assertNull(out.get(2));
  }
}
