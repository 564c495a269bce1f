package com.quenda.tessel.desktop.translate;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertNotNull;
import static org.junit.jupiter.api.Assertions.assertThrows;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import java.nio.charset.StandardCharsets;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.Arrays;
import java.util.List;
import java.util.Map;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;

/**
 * A user's own translations: the phrase table matches what OCR reads however it spaced, cased or
 * punctuated the line, refuses a malformed table with the line to fix, and, in front of Apertium,
 * wins for the phrases it lists while Apertium translates the rest.
 */
class PhraseTableTest {
  @TempDir Path dir;

  Path table(String... rows) throws Exception {
    return Files.writeString(
        dir.resolve("phrases.tsv"), String.join("\n", rows) + "\n", StandardCharsets.UTF_8);
  }

  @Test
  void linesMatchOnLettersAndDigitsWithoutCase() throws Exception {
    PhraseTable phrases = PhraseTable.read(table("# sign phrases", "", "Way out\t Salida ",
        "Open 9-5!\tAbierto de 9 a 5", "Café\tCafetería"));
    assertEquals(Arrays.asList("Salida", "Salida", "Abierto de 9 a 5", "Cafetería", null, null),
        phrases.translate(
            List.of("WAY  OUT", "way out.", "open 9 5", "  CAFÉ ", "Way outside", "Open 95")));
    assertEquals("phrase table phrases.tsv", phrases.name());
  }

  @Test
  void aMalformedOrMissingTableIsRefusedWithTheLineToFix() throws Exception {
    Path noTab = table("Way out\tSalida", "# fine", "No smoking  Prohibido fumar");
    HostException e = assertThrows(HostException.class, () -> PhraseTable.read(noTab));
    assertEquals(ExitStatus.USAGE, e.status);
    assertEquals(noTab + ":3: expected 'source<TAB>translation'", e.getMessage());

    Path emptyTranslation = table("Way out\t");
    e = assertThrows(HostException.class, () -> PhraseTable.read(emptyTranslation));
    assertEquals(emptyTranslation + ":1: expected 'source<TAB>translation'", e.getMessage());

    Path emptySource = table("\tSalida");
    assertThrows(HostException.class, () -> PhraseTable.read(emptySource));

    Path missing = dir.resolve("none.tsv");
    e = assertThrows(HostException.class, () -> PhraseTable.read(missing));
    assertEquals(ExitStatus.NO_INPUT, e.status);
    assertEquals("cannot read the phrase table " + missing, e.getMessage());
  }

  /** A back-end that knows a fixed set of lines and records what it was asked. */
  static final class Knows implements Translator {
    final Map<String, String> known;
    final List<List<String>> asked = new ArrayList<>();
    boolean closed;

    Knows(Map<String, String> known) {
      this.known = known;
    }

    @Override
    public List<String> translate(List<String> lines) {
      asked.add(List.copyOf(lines));
      List<String> out = new ArrayList<>();
      for (String line : lines) {
        out.add(known.get(line));
      }
      return out;
    }

    @Override
    public String name() {
      return "knows " + known.size();
    }

    @Override
    public void close() {
      closed = true;
    }
  }

  @Test
  void eachLineTakesTheFirstAnswerAndLaterBackEndsAreAskedOnlyTheRest() throws Exception {
    Knows first = new Knows(Map.of("b", "B1"));
    Knows second = new Knows(Map.of("a", "A2", "b", "B2"));
    Knows third = new Knows(Map.of("c", "C3"));
    FirstThatKnows chain = new FirstThatKnows(List.of(first, second, third));

    assertEquals(
        Arrays.asList("A2", "B1", "C3", null), chain.translate(List.of("a", "b", "c", "d")));
    assertEquals(List.of(List.of("a", "b", "c", "d")), first.asked);
    assertEquals(List.of(List.of("a", "c", "d")), second.asked);
    assertEquals(List.of(List.of("c", "d")), third.asked);

    // Once every line is answered, nobody further is asked.
    chain.translate(List.of("b"));
    assertEquals(1, second.asked.size());
    assertEquals("knows 1, then knows 2, then knows 1", chain.name());
    chain.close();
    assertTrue(first.closed && second.closed && third.closed);
  }

  @Test
  void aTableInFrontOfApertiumOverridesItForItsPhrasesOnly() throws Exception {
    Path phrases = table("Way out\tPor aquí se sale");
    try (
        Translator translator = Translators.create(Language.of("en"), Language.of("es"), phrases)) {
      List<String> out = translator.translate(List.of("WAY OUT", "Fresh coffee"));
      assertEquals("Por aquí se sale", out.get(0));
      assertNotNull(out.get(1), "Apertium translates what the table lacks");
      assertTrue(translator.name().startsWith("phrase table phrases.tsv, then apertium "),
          translator.name());
    }
  }
}
