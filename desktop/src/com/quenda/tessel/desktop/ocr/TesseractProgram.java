package com.quenda.tessel.desktop.ocr;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import java.io.ByteArrayOutputStream;
import java.io.IOException;
import java.io.InputStream;
import java.nio.charset.StandardCharsets;
import java.util.ArrayList;
import java.util.List;
import java.util.concurrent.TimeUnit;

/**
 * The {@code tesseract} program, run as a child process so that a crash or a hang in it cannot
 * take the host down: every run has a time limit, after which the child is killed.
 *
 * <p>OMP_THREAD_LIMIT=1: the recogniser's OpenMP threads only fight each other on a two-core
 * machine, and one line strip is too small to share out.
 */
final class TesseractProgram {
  static final String PROGRAM = "tesseract";

  private final String program;
  private final long timeoutMillis;

  TesseractProgram(String program, long timeoutMillis) {
    this.program = program;
    this.timeoutMillis = timeoutMillis;
  }

  /** The installed languages, or a MISSING_OCR_DATA failure if the program cannot be started. */
  List<String> languages() throws HostException {
    String out = run(List.of("--list-langs"));
    List<String> langs = new ArrayList<>();
    for (String line : out.split("\n")) {
      String l = line.trim();
      if (!l.isEmpty() && !l.startsWith("List of available languages")) {
        langs.add(l);
      }
    }
    return langs;
  }

  /** Runs the program with {@code args} and returns its standard output. */
  String run(List<String> args) throws HostException {
    List<String> command = new ArrayList<>();
    command.add(program);
    command.addAll(args);
    ProcessBuilder pb = new ProcessBuilder(command);
    pb.environment().put("OMP_THREAD_LIMIT", "1");
    Process p;
    try {
      p = pb.start();
    } catch (IOException e) {
      throw new HostException(ExitStatus.MISSING_OCR_DATA,
          "cannot run the OCR program '" + program + "': install the Debian package tesseract-ocr",
          e);
    }
    Drain out = new Drain(p.getInputStream());
    Drain err = new Drain(p.getErrorStream());
    out.start();
    err.start();
    try {
      if (!p.waitFor(timeoutMillis, TimeUnit.MILLISECONDS)) {
        p.destroyForcibly();
        p.waitFor(5, TimeUnit.SECONDS);
        throw new HostException(ExitStatus.CHILD_FAILED,
            "the OCR program '" + program + "' did not finish within " + timeoutMillis
                + " ms and was stopped");
      }
      out.join();
      err.join();
    } catch (InterruptedException e) {
      p.destroyForcibly();
      Thread.currentThread().interrupt();
      throw new HostException(ExitStatus.CHILD_FAILED, "interrupted while running OCR", e);
    }
    if (p.exitValue() != 0) {
      throw new HostException(ExitStatus.CHILD_FAILED,
          "the OCR program failed (exit status " + p.exitValue() + ") running "
              + String.join(" ", command) + ": " + lastLine(err.text()));
    }
    return out.text();
  }

  private static String lastLine(String text) {
    String[] lines = text.trim().split("\n");
    return lines.length == 0 ? "" : lines[lines.length - 1];
  }

  /** Reads a child's stream to the end so that the child never blocks on a full pipe. */
  private static final class Drain extends Thread {
    private final InputStream in;
    private final ByteArrayOutputStream bytes = new ByteArrayOutputStream();

    Drain(InputStream in) {
      this.in = in;
      setDaemon(true);
    }

    @Override
    public void run() {
      try (InputStream s = in) {
        s.transferTo(bytes);
      } catch (IOException e) {
        // The child died; what was read so far is all there is.
      }
    }

    String text() {
      return bytes.toString(StandardCharsets.UTF_8);
    }
  }
}
