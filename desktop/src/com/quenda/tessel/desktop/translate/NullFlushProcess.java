package com.quenda.tessel.desktop.translate;

import com.quenda.tessel.desktop.ChildProcess;
import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import java.io.ByteArrayOutputStream;
import java.io.IOException;
import java.io.InputStream;
import java.io.OutputStream;
import java.io.PrintStream;
import java.nio.charset.StandardCharsets;
import java.util.List;
import java.util.concurrent.BlockingQueue;
import java.util.concurrent.LinkedBlockingQueue;
import java.util.concurrent.TimeUnit;

/**
 * A filter program kept running for the whole run, asked one text at a time: each input ends with
 * a NUL byte, and the program answers it with one NUL-terminated output (Apertium's null-flush
 * mode). Starting Apertium's pipeline costs far more than translating a line, so it is started
 * once per language pair instead of once per call.
 *
 * <p>A program that dies, closes its output or does not answer within the time limit is stopped
 * (with everything it started), started again with a one-line message on standard error, and
 * asked once more; a second failure is an error, never a hang.
 */
final class NullFlushProcess implements AutoCloseable {
  private static final Object END = new Object();

  private final String name;
  private final List<String> command;
  private final long timeoutMillis;
  private final PrintStream log;
  private volatile Process process;
  private BlockingQueue<Object> answers;
  /** What the running program wrote on standard error (its last 4 KiB); one per start. */
  private StringBuilder lastError = new StringBuilder();
  private Thread errorReader;
  private final Thread shutdownHook = new Thread(this::stop);
  private boolean hooked;

  /** {@code name} names the program in messages ("apertium eng-spa"). */
  NullFlushProcess(String name, List<String> command, long timeoutMillis, PrintStream log) {
    this.name = name;
    this.command = List.copyOf(command);
    this.timeoutMillis = timeoutMillis;
    this.log = log;
  }

  /** The program's answer to {@code input}. */
  synchronized String ask(String input) throws HostException {
    String failure;
    try {
      return askOnce(input);
    } catch (Failure e) {
      failure = e.getMessage();
    }
    stop();
    log.println("translate: " + name + " " + failure + "; starting it again");
    try {
      return askOnce(input);
    } catch (Failure e) {
      // What the program said before it is stopped, not the shell's word on the stopping.
      String said = lastErrorLine(process);
      stop();
      throw new HostException(
          ExitStatus.CHILD_FAILED, name + " " + e.getMessage() + " again after a restart" + said);
    }
  }

  /** The running program's process, started when needed (tests stop it to simulate a crash). */
  synchronized Process process() throws HostException {
    if (process == null || !process.isAlive()) {
      start();
    }
    return process;
  }

  @Override
  public synchronized void close() {
    stop();
    if (hooked) {
      try {
        Runtime.getRuntime().removeShutdownHook(shutdownHook);
      } catch (IllegalStateException e) {
        // Already shutting down: the hook runs anyway.
      }
      hooked = false;
    }
  }

  private String askOnce(String input) throws Failure, HostException {
    if (process != null && !process.isAlive()) {
      throw new Failure("stopped" + exitDescription(process));
    }
    Process running = process();
    BlockingQueue<Object> queue = answers;
    try {
      OutputStream stdin = running.getOutputStream();
      stdin.write(input.replace('\0', ' ').getBytes(StandardCharsets.UTF_8));
      stdin.write(0);
      stdin.flush();
    } catch (IOException e) {
      throw new Failure("stopped" + exitDescription(running));
    }
    Object answer;
    try {
      answer = queue.poll(timeoutMillis, TimeUnit.MILLISECONDS);
    } catch (InterruptedException e) {
      Thread.currentThread().interrupt();
      throw new HostException(ExitStatus.INTERNAL, "interrupted while " + name + " ran");
    }
    if (answer == null) {
      throw new Failure("did not answer within " + timeoutMillis + " ms");
    }
    if (answer == END) {
      throw new Failure("stopped" + exitDescription(running));
    }
    return (String) answer;
  }

  private void start() throws HostException {
    stop();
    try {
      ProcessBuilder builder = new ProcessBuilder(command);
      ChildProcess.withoutPreload(builder);
      process = builder.start();
    } catch (IOException e) {
      throw new HostException(ExitStatus.MISSING_TRANSLATION,
          "cannot run " + command.get(0) + ": install the Debian package apertium");
    }
    answers = new LinkedBlockingQueue<>();
    lastError = new StringBuilder();
    readAnswers(process.getInputStream(), answers);
    errorReader = readErrors(process.getErrorStream(), lastError);
    if (!hooked) {
      Runtime.getRuntime().addShutdownHook(shutdownHook);
      hooked = true;
    }
  }

  /**
   * Stops the program and every program it started (Apertium's pipeline is a dozen). Not
   * synchronized: the shutdown hook must not wait for a call that is waiting for an answer.
   */
  private void stop() {
    Process running = process;
    process = null;
    if (running == null) {
      return;
    }
    running.descendants().forEach(ProcessHandle::destroyForcibly);
    running.destroyForcibly();
    try {
      running.getOutputStream().close();
    } catch (IOException e) {
      // Gone already.
    }
  }

  private static void readAnswers(InputStream stream, BlockingQueue<Object> queue) {
    Thread reader = new Thread(() -> {
      ByteArrayOutputStream answer = new ByteArrayOutputStream();
      try (InputStream in = stream) {
        for (int b = in.read(); b >= 0; b = in.read()) {
          if (b == 0) {
            queue.add(answer.toString(StandardCharsets.UTF_8));
            answer.reset();
          } else {
            answer.write(b);
          }
        }
      } catch (IOException e) {
        // The process is gone.
      }
      queue.add(END);
    }, "translator output");
    reader.setDaemon(true);
    reader.start();
  }

  private static Thread readErrors(InputStream stream, StringBuilder lastError) {
    Thread reader = new Thread(() -> {
      byte[] buffer = new byte[4096];
      try (InputStream in = stream) {
        for (int n = in.read(buffer); n >= 0; n = in.read(buffer)) {
          synchronized (lastError) {
            lastError.append(new String(buffer, 0, n, StandardCharsets.UTF_8));
            if (lastError.length() > 4096) {
              lastError.delete(0, lastError.length() - 4096);
            }
          }
        }
      } catch (IOException e) {
        // The process is gone.
      }
    }, "translator errors");
    reader.setDaemon(true);
    reader.start();
    return reader;
  }

  /** The last line {@code running} wrote on standard error, all of it read if it has exited. */
  private String lastErrorLine(Process running) {
    if (running != null && !running.isAlive()) {
      try {
        errorReader.join(1000);
      } catch (InterruptedException e) {
        Thread.currentThread().interrupt();
      }
    }
    StringBuilder errors = lastError;
    synchronized (errors) {
      String[] lines = errors.toString().strip().split("\n");
      String last = lines[lines.length - 1].strip();
      return last.isEmpty() ? "" : ": " + last;
    }
  }

  private static String exitDescription(Process process) {
    try {
      if (process.waitFor(200, TimeUnit.MILLISECONDS)) {
        return " (exit " + process.exitValue() + ")";
      }
    } catch (InterruptedException e) {
      Thread.currentThread().interrupt();
    }
    return "";
  }

  /** One failed attempt, described for the message. */
  private static final class Failure extends Exception {
    private static final long serialVersionUID = 1L;

    Failure(String message) {
      super(message);
    }
  }
}
