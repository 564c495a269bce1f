package com.quenda.tessel.desktop;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertFalse;
import static org.junit.jupiter.api.Assertions.assertThrows;

import java.nio.file.Files;
import java.nio.file.Path;
import java.util.List;
import java.util.Map;
import java.util.concurrent.TimeUnit;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.Timeout;
import org.junit.jupiter.api.io.TempDir;

/** The host's runner of OCR and translation programs, with programs that misbehave. */
class ChildProcessTest {
  @TempDir Path dir;

  @Test
  void inputGoesInAndBothOutputsComeBack() throws Exception {
    ChildProcess.Result result = ChildProcess.run("translation",
        List.of("sh", "-c", "tr a-z A-Z; echo warning >&2; echo last problem >&2; exit 3"),
        "hola\n", Map.of(), 60_000);
    assertEquals(3, result.exitCode);
    assertEquals("HOLA\n", result.stdout);
    assertEquals("last problem", result.lastErrorLine());
  }

  // A guard against a hang, far above the child's limit: the limit itself is not timed here.
  @Test
  @Timeout(value = 120, unit = TimeUnit.SECONDS, threadMode = Timeout.ThreadMode.SEPARATE_THREAD)
  void aChildThatNeverReadsItsInputIsStoppedAtItsLimitWithWhatItStarted() throws Exception {
    Path pidFile = dir.resolve("pid");
    // More input than a pipe holds, to a script whose pipeline never reads it.
    String input = "x".repeat(4 << 20);
    HostException stopped = assertThrows(HostException.class,
        ()
            -> ChildProcess.run("translation",
                List.of("sh", "-c", "sleep 600 & echo $! > " + pidFile + "; wait"), input, Map.of(),
                2000));
    assertEquals(ExitStatus.CHILD_FAILED, stopped.status);
    assertEquals("the translation program 'sh' did not finish within 2000 ms and was stopped",
        stopped.getMessage());
    long sleeper = Long.parseLong(Files.readString(pidFile).strip());
    ProcessHandle.of(sleeper).ifPresent(handle -> handle.onExit().join());
    assertFalse(ProcessHandle.of(sleeper).map(ProcessHandle::isAlive).orElse(false),
        "the pipeline's sleep " + sleeper + " outlived its shell");
  }
}
