package com.quenda.tessel.desktop;

import com.quenda.tessel.desktop.photo.PhotoCommand;
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
    PrintStream out = new PrintStream(System.out, true, StandardCharsets.UTF_8);
    PrintStream err = new PrintStream(System.err, true, StandardCharsets.UTF_8);
    System.exit(run(args, out, err).code);
  }

  /** Runs one command; the exit status is returned, not taken, so that tests can call it. */
  public static ExitStatus run(String[] args, PrintStream out, PrintStream err) {
    if (args.length == 1 && (args[0].equals("--help") || args[0].equals("-h"))) {
      out.println(CommandLine.USAGE);
      return ExitStatus.OK;
    }
    try {
      CommandLine command = CommandLine.parse(args);
      System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
      PhotoCommand.run(command, out, err);
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
