package com.quenda.tessel.desktop.ocr;

import com.quenda.tessel.desktop.ChildProcess;
import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import java.io.IOException;
import java.util.ArrayList;
import java.util.List;
import java.util.Map;

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
    ChildProcess.Result result;
    try {
      result = ChildProcess.run("OCR", command, "", Map.of("OMP_THREAD_LIMIT", "1"), timeoutMillis);
    } catch (IOException e) {
      throw new HostException(ExitStatus.MISSING_OCR_DATA,
          "cannot run the OCR program '" + program + "': install the Debian package tesseract-ocr",
          e);
    }
    if (result.exitCode != 0) {
      throw new HostException(ExitStatus.CHILD_FAILED,
          "the OCR program failed (exit status " + result.exitCode + ") running "
              + String.join(" ", command) + ": " + result.lastErrorLine());
    }
    return result.stdout;
  }
}
