package com.quenda.tessel.desktop;

import com.quenda.tessel.desktop.photo.PhotoCommand;
import com.quenda.tessel.desktop.text.TextCommand;
import com.quenda.tessel.desktop.video.VideoCommand;
import java.io.FileNotFoundException;
import java.io.FileOutputStream;
import java.io.OutputStream;
import java.io.PrintStream;
import java.nio.charset.StandardCharsets;
import org.opencv.core.Core;

/**
 * Command line entry of the desktop host. Every failure ends as one line on standard error and
 * the exit status of its class; nothing a user can feed in ends in a stack trace.
 */
public final class TranslateMain {
  private TranslateMain() {}

  public static void main(String[] args) {
    PrintStream out = new PrintStream(reportStream(), true, StandardCharsets.UTF_8);
    PrintStream err = new PrintStream(System.err, true, StandardCharsets.UTF_8);
    System.exit(run(args, out, err).code);
  }

  /**
   * Where the report goes: the descriptor the launcher names in TRANSLATE_REPORT_FD (the engine's
   * tracker prints diagnostics on standard output, which the launcher sends to a file), else
   * standard output.
   */
  private static OutputStream reportStream() {
    String fd = System.getenv("TRANSLATE_REPORT_FD");
    if (fd != null && fd.matches("\\d+")) {
      try {
        return new FileOutputStream("/dev/fd/" + fd, true);
      } catch (FileNotFoundException e) {
        // Not open after all: standard output it is.
      }
    }
    return System.out;
  }

  /** Runs one command; the exit status is returned, not taken, so that tests can call it. */
  public static ExitStatus run(String[] args, PrintStream out, PrintStream err) {
    if (args.length == 1 && (args[0].equals("--help") || args[0].equals("-h"))) {
      out.println(CommandLine.USAGE);
      return ExitStatus.OK;
    }
    try {
      CommandLine command = CommandLine.parse(args);
      if (command.mode.equals("text")) {
        return TextCommand.run(command, System.in, out, err);
      }
      System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
      if (command.mode.equals("video")) {
        VideoCommand.run(command, out, err);
      } else {
        PhotoCommand.run(command, out, err);
      }
      return ExitStatus.OK;
    } catch (HostException e) {
      err.println("translate: " + e.getMessage());
      return e.status;
    } catch (RuntimeException | LinkageError e) {
      err.println("translate: internal error: " + e);
      return ExitStatus.INTERNAL;
    }
  }
}
