package com.quenda.tessel.desktop.translate;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertThrows;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import java.io.ByteArrayOutputStream;
import java.io.PrintStream;
import java.nio.charset.StandardCharsets;
import java.util.List;
import org.junit.jupiter.api.Test;

/** The long-lived translator: restarted after a kill, stopped when it hangs, never waited for. */
class NullFlushProcessTest {
  private final ByteArrayOutputStream log = new ByteArrayOutputStream();
  private final PrintStream logStream = new PrintStream(log, true, StandardCharsets.UTF_8);

  @Test
  void killedApertiumIsRestartedAndTheTextTranslated() throws Exception {
    try (ApertiumTranslator translator = new ApertiumTranslator(Language.of("en"),
             Language.of("es"), SignMemory.EMPTY, ApertiumTranslator.TIMEOUT_MILLIS, logStream)) {
      String first = translator.translate(List.of("Do not touch")).get(0);
      Process transfer = translator.pipeline().part(1).process();
      transfer.descendants().forEach(ProcessHandle::destroyForcibly);
      transfer.destroyForcibly().waitFor();
      assertEquals(first, translator.translate(List.of("Do not touch")).get(0));
      String message = log.toString(StandardCharsets.UTF_8);
      assertTrue(message.startsWith("translate: apertium eng-spa (transfer) stopped"), message);
      assertTrue(message.contains("starting it again"), message);
    }
  }

  @Test
  void programThatNeverAnswersIsStoppedWithAnError() {
    // A stand-in that reads its input and never answers.
    try (NullFlushProcess hung = new NullFlushProcess(
             "stand-in", List.of("sh", "-c", "cat > /dev/null"), 300, logStream)) {
      HostException e = assertThrows(HostException.class, () -> hung.ask("Exit"));
      assertEquals(ExitStatus.CHILD_FAILED, e.status);
      assertEquals("stand-in did not answer within 300 ms again after a restart", e.getMessage());
      assertTrue(log.toString(StandardCharsets.UTF_8)
                     .contains("translate: stand-in did not answer within 300 ms; starting it"));
    }
  }

  @Test
  void answersComeBackOnePerInputInOrder() throws HostException {
    // tr answers each NUL-terminated input at once: the stand-in for a flushing pipeline.
    try (NullFlushProcess upper = new NullFlushProcess(
             "stand-in", List.of("stdbuf", "-o0", "tr", "a-z", "A-Z"), 10_000, logStream)) {
      assertEquals("EXIT", upper.ask("exit"));
      assertEquals("A B", upper.ask("a\0b"));
      assertEquals("", upper.ask(""));
    }
  }

  @Test
  void programThatCannotStartSaysWhyOnce() {
    // A stand-in that fails at once, as Apertium does with a damaged dictionary.
    try (NullFlushProcess broken = new NullFlushProcess("stand-in",
             List.of("sh", "-c", "echo 'cannot open dictionary' >&2; exit 3"), 10_000, logStream)) {
      HostException e = assertThrows(HostException.class, () -> broken.ask("Exit"));
      assertEquals(ExitStatus.CHILD_FAILED, e.status);
      assertTrue(e.getMessage().startsWith("stand-in stopped"), e.getMessage());
      assertTrue(
          e.getMessage().endsWith("again after a restart: cannot open dictionary"), e.getMessage());
    }
  }

  @Test
  void closingStopsEveryProgramOfThePipeline() throws Exception {
    List<ProcessHandle> programs = new java.util.ArrayList<>();
    try (ApertiumTranslator translator = new ApertiumTranslator(Language.of("en"),
             Language.of("es"), SignMemory.EMPTY, ApertiumTranslator.TIMEOUT_MILLIS, logStream)) {
      translator.translate(List.of("Exit"));
      for (int part = 0; part < 3; part++) {
        Process process = translator.pipeline().part(part).process();
        programs.add(process.toHandle());
        process.descendants().forEach(programs::add);
      }
    }
    assertTrue(programs.size() >= 3, programs.toString());
    for (ProcessHandle program : programs) {
      program.onExit().get(10, java.util.concurrent.TimeUnit.SECONDS);
      assertTrue(!program.isAlive(), program + " still runs");
    }
  }
}
