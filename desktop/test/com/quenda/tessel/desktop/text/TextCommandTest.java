package com.quenda.tessel.desktop.text;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.CommandLine;
import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import java.io.ByteArrayInputStream;
import java.io.ByteArrayOutputStream;
import java.io.PrintStream;
import java.nio.charset.StandardCharsets;
import java.util.List;
import org.junit.jupiter.api.Test;

/** The text mode's contract: a line out per line in, in order, whatever the input. */
class TextCommandTest {
  private final ByteArrayOutputStream out = new ByteArrayOutputStream();
  private final ByteArrayOutputStream err = new ByteArrayOutputStream();

  private ExitStatus run(byte[] input) throws HostException {
    CommandLine command = CommandLine.parse(new String[] {"text", "--from", "en", "--to", "es"});
    return TextCommand.run(command, new ByteArrayInputStream(input),
        new PrintStream(out, true, StandardCharsets.UTF_8),
        new PrintStream(err, true, StandardCharsets.UTF_8));
  }

  private List<String> lines() {
    return List.of(out.toString(StandardCharsets.UTF_8).split("\n", -1));
  }

  @Test
  void oneLineOutPerLineInWithMemoryAndCase() throws HostException {
    byte[] input = ("NO ENTRY\n\nlost property.\nplugh\nLeave the building in case of fire\n"
        + "Guides wait at the main entrance.\nClosed On Sunday\n")
                       .getBytes(StandardCharsets.UTF_8);
    assertEquals(ExitStatus.OK, run(input));
    List<String> lines = lines();
    assertEquals(8, lines.size(), lines.toString());
    assertEquals("PROHIBIDO EL PASO", lines.get(0));
    assertEquals("", lines.get(1));
    assertEquals("objetos perdidos.", lines.get(2));
    assertEquals("plugh", lines.get(3), "untranslatable: the original");
    assertTrue(lines.get(4).endsWith("en caso de incendio"), lines.get(4));
    // A feminine phrase of the memory takes its article; a title's day keeps its capital.
    assertTrue(lines.get(5).endsWith(" en la entrada principal."), lines.get(5));
    assertEquals("Cerrado el domingo", lines.get(6));
    assertEquals("", lines.get(7));
  }

  @Test
  void badInputGetsAnErrorOrATranslationAndNoLineIsLost() throws HostException {
    byte[] invalid = {'W', 'a', 'i', 't', (byte) 0xC3, '\n'};
    String longLine = "Please wait here. ".repeat(5556).substring(0, 100_000);
    byte[] rest = ("Do not\0touch\n" + longLine + "\nNo smoking").getBytes(StandardCharsets.UTF_8);
    byte[] input = new byte[invalid.length + rest.length];
    System.arraycopy(invalid, 0, input, 0, invalid.length);
    System.arraycopy(rest, 0, input, invalid.length, rest.length);
    assertEquals(ExitStatus.NOT_AN_IMAGE, run(input));
    List<String> lines = lines();
    assertEquals(5, lines.size(), "three lines and an unterminated last one");
    assertEquals("", lines.get(0));
    assertEquals("translate: line 1 of standard input is not UTF-8; skipped\n",
        err.toString(StandardCharsets.UTF_8));
    assertEquals("No tocar", lines.get(1));
    assertTrue(lines.get(2).length() > 50_000, "the long line is translated whole");
    assertEquals("Prohibido fumar", lines.get(3));
  }

  @Test
  void charactersApertiumReservesComeBackAsWritten() throws HostException {
    String line = "Room [B] \\ 2/3 <staff> {7} ^x$";
    assertEquals(ExitStatus.OK, run((line + "\n").getBytes(StandardCharsets.UTF_8)));
    String out = lines().get(0);
    for (String kept : List.of("[B]", "\\", "2/3", "<", ">", "{7}", "^x$")) {
      assertTrue(out.contains(kept), kept + " in " + out);
    }
  }
}
