package com.quenda.tessel.soak;

import java.io.IOException;
import java.nio.file.Files;
import java.nio.file.Path;

/** The resident memory of this whole process (JVM, engine and drivers) as the kernel counts it. */
final class ResidentMemory {
  private static final Path STATUS = Path.of("/proc/self/status");

  private ResidentMemory() {}

  /** VmRSS in kibibytes. */
  static long kib() {
    try {
      for (String line : Files.readAllLines(STATUS)) {
        if (line.startsWith("VmRSS:")) {
          return Long.parseLong(line.replaceAll("[^0-9]", ""));
        }
      }
    } catch (IOException e) {
      throw new IllegalStateException("cannot read " + STATUS, e);
    }
    throw new IllegalStateException("no VmRSS in " + STATUS);
  }
}
