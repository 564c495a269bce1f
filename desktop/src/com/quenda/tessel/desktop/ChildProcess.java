package com.quenda.tessel.desktop;

import java.io.ByteArrayOutputStream;
import java.io.IOException;
import java.io.InputStream;
import java.io.OutputStream;
import java.nio.charset.StandardCharsets;
import java.util.List;
import java.util.Map;
import java.util.concurrent.TimeUnit;

/**
 * Runs an external program (OCR, translation) to completion: standard input written from a
 * string, standard output and error collected, a time limit after which it is killed. The tools
 * run in their own processes so that a crash or a hang in one of them cannot take the host down.
 */
public final class ChildProcess {
  /** What a finished program left. */
  public static final class Result {
    public final int exitCode;
    public final String stdout;
    public final String stderr;

    Result(int exitCode, String stdout, String stderr) {
      this.exitCode = exitCode;
      this.stdout = stdout;
      this.stderr = stderr;
    }

    /** The last non-empty line of standard error, for a one-line report. */
    public String lastErrorLine() {
      String[] lines = stderr.strip().split("\n");
      return lines.length == 0 ? "" : lines[lines.length - 1].strip();
    }
  }

  private ChildProcess() {}

  /**
   * Runs {@code command} with {@code input} on its standard input (UTF-8) and the extra
   * environment variables; throws IOException when it cannot be started (not installed), and
   * CHILD_FAILED naming the {@code role} of the program ("OCR", "translation") when it has not
   * finished after {@code timeoutMillis}, counted from its start: a child that stops reading its
   * input is stopped in time too. Stopping it kills every process it started (a launcher script's
   * pipeline), not just the first.
   */
  public static Result run(String role, List<String> command, String input,
      Map<String, String> environment, long timeoutMillis) throws IOException, HostException {
    ProcessBuilder builder = withoutPreload(new ProcessBuilder(command));
    builder.environment().putAll(environment);
    Process process = builder.start();
    ByteArrayOutputStream out = new ByteArrayOutputStream();
    ByteArrayOutputStream err = new ByteArrayOutputStream();
    // Every pipe on its own thread: a child blocked on a full pipe would never exit, and a child
    // that never reads would block the writer.
    Thread outReader = drain(process.getInputStream(), out);
    Thread errReader = drain(process.getErrorStream(), err);
    feed(process.getOutputStream(), input.getBytes(StandardCharsets.UTF_8));
    try {
      if (!process.waitFor(timeoutMillis, TimeUnit.MILLISECONDS)) {
        killWithDescendants(process);
        throw new HostException(ExitStatus.CHILD_FAILED,
            String.format("the %s program '%s' did not finish within %d ms and was stopped", role,
                command.get(0), timeoutMillis));
      }
      outReader.join();
      errReader.join();
    } catch (InterruptedException e) {
      killWithDescendants(process);
      Thread.currentThread().interrupt();
      throw new HostException(ExitStatus.INTERNAL, "interrupted while " + command.get(0) + " ran");
    }
    return new Result(process.exitValue(), out.toString(StandardCharsets.UTF_8),
        err.toString(StandardCharsets.UTF_8));
  }

  /**
   * Drops a library preloaded into the host (a sanitizer's runtime in checked builds) from a
   * child's environment: the child is not ours to check, and would be slowed or stopped by it.
   */
  public static ProcessBuilder withoutPreload(ProcessBuilder builder) {
    builder.environment().keySet().removeAll(
        List.of("LD_PRELOAD", "ASAN_OPTIONS", "UBSAN_OPTIONS"));
    return builder;
  }

  /** Kills the process and everything it started, children first so that none is orphaned. */
  private static void killWithDescendants(Process process) {
    process.descendants().forEach(ProcessHandle::destroyForcibly);
    process.destroyForcibly();
    try {
      process.waitFor();
    } catch (InterruptedException e) {
      Thread.currentThread().interrupt();
    }
  }

  private static void feed(OutputStream stdin, byte[] input) {
    Thread writer = new Thread(() -> {
      try (OutputStream in = stdin) {
        in.write(input);
      } catch (IOException e) {
        // The child closed its input early or was stopped; its exit status and error output
        // tell why.
      }
    });
    writer.setDaemon(true);
    writer.start();
  }

  private static Thread drain(InputStream stream, ByteArrayOutputStream sink) {
    Thread reader = new Thread(() -> {
      try (InputStream in = stream) {
        in.transferTo(sink);
      } catch (IOException e) {
        // The process is gone; what was read so far is all there is.
      }
    });
    reader.setDaemon(true);
    reader.start();
    return reader;
  }
}
