package com.quenda.tessel.testing;

import java.io.IOException;
import java.io.RandomAccessFile;
import java.nio.charset.StandardCharsets;
import java.util.ArrayList;
import java.util.List;

/**
 * Reads the engine's log lines back in a JVM test. On Linux the engine appends every message,
 * as "L/OCRAR-Native: text" (L = D, I, W or E), to the file named by OCRAR_LOG_FILE; the test
 * runner sets it per test class.
 */
public final class NativeLog {
  private final String path;
  private long mark;

  public NativeLog() {
    path = System.getenv("OCRAR_LOG_FILE");
    if (path == null || path.isEmpty()) {
      throw new IllegalStateException("OCRAR_LOG_FILE is not set; run the test through ctest");
    }
    mark = length();
  }

  /** Forgets the lines written so far. */
  public void mark() {
    mark = length();
  }

  /** Lines written since the last mark, each as "L/OCRAR-Native: text". */
  public List<String> lines() {
    List<String> lines = new ArrayList<>();
    try (RandomAccessFile file = new RandomAccessFile(path, "r")) {
      if (file.length() <= mark) {
        return lines;
      }
      file.seek(mark);
      byte[] bytes = new byte[(int) (file.length() - mark)];
      file.readFully(bytes);
      for (String line : new String(bytes, StandardCharsets.UTF_8).split("\n")) {
        if (!line.isEmpty()) {
          lines.add(line);
        }
      }
    } catch (IOException e) {
      throw new IllegalStateException("cannot read " + path, e);
    }
    return lines;
  }

  /** Messages since the last mark with the given priority letter (D, I, W, E), tag removed. */
  public List<String> messages(char priority) {
    String prefix = priority + "/OCRAR-Native: ";
    List<String> texts = new ArrayList<>();
    for (String line : lines()) {
      if (line.startsWith(prefix)) {
        texts.add(line.substring(prefix.length()));
      }
    }
    return texts;
  }

  private long length() {
    return new java.io.File(path).length();
  }
}
