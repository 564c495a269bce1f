package com.quenda.tessel.desktop.translate;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertNull;
import static org.junit.jupiter.api.Assertions.assertThrows;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import java.io.IOException;
import java.nio.charset.StandardCharsets;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.List;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;

/** The memory's matching: case, punctuation, segments inside text, whole words; its errors. */
class SignMemoryTest {
  @TempDir Path dir;

  private SignMemory memory(String units) throws IOException, HostException {
    Path file = dir.resolve("en-es.tmx");
    Files.writeString(file,
        "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<tmx version=\"1.4\">\n<header srclang=\"en\"/>\n"
            + "<body>\n" + units + "</body>\n</tmx>\n",
        StandardCharsets.UTF_8);
    return SignMemory.read(file, "en", "es");
  }

  private static String unit(String en, String es) {
    return "<tu><tuv xml:lang=\"en\"><seg>" + en + "</seg></tuv><tuv xml:lang=\"es\"><seg>" + es
        + "</seg></tuv></tu>\n";
  }

  @Test
  void wholeTextIgnoresCaseAndPunctuation() throws Exception {
    SignMemory memory = memory(unit("No barbecues", "Prohibido hacer barbacoas"));
    for (String text :
        List.of("NO BARBECUES", "No barbecues.", "no barbecues", " No  barbecues!")) {
      assertEquals("Prohibido hacer barbacoas", memory.whole(text), text);
    }
    assertNull(memory.whole("No barbecues here"));
  }

  @Test
  void findsSegmentsInsideTextOnWholeWordsOnly() throws Exception {
    SignMemory memory = memory(unit("in case of flood", "en caso de inundación")
        + unit("flood", "inundación") + unit("case of", "caja de"));
    String text = "Leave IN CASE OF FLOOD by the stairs";
    List<SignMemory.Match> found = memory.find(text);
    assertEquals(1, found.size(), "the longest segment wins, overlaps are not matched twice");
    assertEquals("IN CASE OF FLOOD", text.substring(found.get(0).start, found.get(0).end));
    // A one-word segment is a whole sign only; parts of words never match.
    assertTrue(memory.find("flood warning").isEmpty());
    assertTrue(memory.find("staircase offers").isEmpty());
    assertTrue(memory.find("in case, of flood").isEmpty(), "punctuation splits a segment");
  }

  @Test
  void fileThatDoesNotParseIsNamedWithItsLine() throws Exception {
    HostException e = assertThrows(HostException.class,
        () -> memory(unit("Exit", "Salida") + "<tu><tuv xml:lang=\"en\"><seg>Open</tuv></tu>\n"));
    assertEquals(ExitStatus.USAGE, e.status);
    assertTrue(e.getMessage().startsWith(dir.resolve("en-es.tmx") + ":6: "), e.getMessage());
    HostException noLanguage =
        assertThrows(HostException.class, () -> memory("<tu><tuv><seg>Open</seg></tuv></tu>\n"));
    assertTrue(
        noLanguage.getMessage().contains(":5: a tuv without xml:lang"), noLanguage.getMessage());
  }

  @Test
  void bundledMemoriesParse() throws Exception {
    Path directory = Path.of(System.getProperty("translate.memory"));
    for (String to : List.of("es", "ca", "gl")) {
      SignMemory memory = SignMemory.read(directory.resolve("en-" + to + ".tmx"), "en", to);
      assertTrue(memory.size() >= (to.equals("es") ? 300 : 30), to + ": " + memory.size());
    }
  }
}
