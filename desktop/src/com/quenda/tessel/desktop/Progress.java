package com.quenda.tessel.desktop;

import java.io.IOException;
import java.io.PrintStream;
import java.nio.file.Files;
import java.nio.file.Path;

/**
 * A progress bar on the terminal for work that takes longer than a second: nothing is shown
 * before the first second has passed, so quick runs stay quiet; redrawn in place on standard
 * error and cleared when the work is done. Off when asked (--quiet) or when standard error is not
 * a terminal (a log file would fill with carriage returns).
 */
public final class Progress {
  private static final long SHOW_AFTER_NANOS = 1_000_000_000L;
  private static final int BAR_WIDTH = 30;

  private final PrintStream err;
  private final boolean enabled;
  private final long start = System.nanoTime();
  private final int total;
  private int done;
  private boolean drawn;

  /** Progress over {@code total} steps. */
  public Progress(int total, boolean quiet, PrintStream err) {
    this.total = Math.max(total, 1);
    this.err = err;
    this.enabled = !quiet && standardErrorIsTerminal();
  }

  /**
   * Whether descriptor 2 is a terminal. Not System.console(): that also asks for standard output,
   * which the launcher sends to a file (the engine's tracker prints there).
   */
  static boolean standardErrorIsTerminal() {
    try {
      String device = Files.readSymbolicLink(Path.of("/proc/self/fd/2")).toString();
      return device.startsWith("/dev/pts/") || device.startsWith("/dev/tty");
    } catch (IOException | UnsupportedOperationException | SecurityException e) {
      return false;
    }
  }

  /** One more step is done; {@code what} names the one that starts now. */
  public void step(String what) {
    ++done;
    show(what);
  }

  /** Names what is running now without counting a step. */
  public void show(String what) {
    if (!enabled || System.nanoTime() - start < SHOW_AFTER_NANOS) {
      return;
    }
    int filled = (int) Math.round((double) BAR_WIDTH * Math.min(done, total) / total);
    String line = String.format("\r[%s%s] %3d%% %s", "#".repeat(filled),
        ".".repeat(BAR_WIDTH - filled), 100 * Math.min(done, total) / total, what);
    err.print(line.length() > 100 ? line.substring(0, 100) : line + "\033[K");
    err.flush();
    drawn = true;
  }

  /** Clears the bar, so that what is printed next starts on a clean line. */
  public void finish() {
    if (drawn) {
      err.print("\r\033[K");
      err.flush();
      drawn = false;
    }
  }

  /** A message on its own line, the bar redrawn below it. */
  public void message(String text) {
    boolean wasDrawn = drawn;
    finish();
    err.println(text);
    if (wasDrawn) {
      show("");
    }
  }
}
