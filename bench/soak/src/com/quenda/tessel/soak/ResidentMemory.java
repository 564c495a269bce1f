package com.quenda.tessel.soak;

import java.io.IOException;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.List;

/** The memory of this whole process (JVM, engine and drivers) as the kernel counts it. */
final class ResidentMemory {
  private static final long ARENA_BYTES = 64L << 20;

  private ResidentMemory() {}

  /** VmRSS in kibibytes. */
  static long kib() {
    for (String line : lines("/proc/self/status")) {
      if (line.startsWith("VmRSS:")) {
        return Long.parseLong(line.replaceAll("[^0-9]", ""));
      }
    }
    throw new IllegalStateException("no VmRSS in /proc/self/status");
  }

  /** glibc's extra malloc arenas: how many, and their resident memory in kibibytes. */
  record Arenas(int count, long kib) {}

  /**
   * The extra malloc arenas glibc has made (besides the main heap): one per thread that found the
   * arenas it would use busy, up to eight per core. Threads move between them under contention, so
   * each arena's resident high-water mark rises until it has served the run's largest requests:
   * growth inside them that stops is the allocator's, not a leak. An arena is an anonymous
   * 64 MiB-aligned reservation of 64 MiB, its used part readable and writable, the rest not.
   */
  static Arenas mallocArenas() {
    if ("1".equals(System.getenv("MALLOC_ARENA_MAX"))) {
      return new Arenas(0, 0); // none made; and the long smaps need not be read
    }
    List<Mapping> maps = mappings();
    int count = 0;
    long kib = 0;
    for (int i = 0; i < maps.size(); i++) {
      Mapping m = maps.get(i);
      if (m.named || m.start % ARENA_BYTES != 0 || !m.perms.startsWith("rw")) {
        continue;
      }
      long end = m.end;
      if (i + 1 < maps.size()) {
        Mapping next = maps.get(i + 1);
        if (!next.named && next.perms.startsWith("---") && next.start == end) {
          end = next.end;
        }
      }
      if (end - m.start == ARENA_BYTES) {
        count++;
        kib += m.rssKib;
      }
    }
    return new Arenas(count, kib);
  }

  private static final class Mapping {
    long start;
    long end;
    String perms;
    boolean named;
    long rssKib;
  }

  private static List<Mapping> mappings() {
    List<Mapping> maps = new ArrayList<>();
    for (String line : lines("/proc/self/smaps")) {
      String[] fields = line.split("\\s+");
      if (fields[0].matches("[0-9a-f]+-[0-9a-f]+")) {
        Mapping m = new Mapping();
        long[] range = range(fields[0]);
        m.start = range[0];
        m.end = range[1];
        m.perms = fields[1];
        m.named = fields.length > 5;
        maps.add(m);
      } else if (fields[0].equals("Rss:") && !maps.isEmpty()) {
        maps.get(maps.size() - 1).rssKib = Long.parseLong(fields[1]);
      }
    }
    return maps;
  }

  private static long[] range(String field) {
    String[] ends = field.split("-");
    return new long[] {Long.parseUnsignedLong(ends[0], 16), Long.parseUnsignedLong(ends[1], 16)};
  }

  private static List<String> lines(String file) {
    try {
      return Files.readAllLines(Path.of(file));
    } catch (IOException e) {
      throw new IllegalStateException("cannot read " + file, e);
    }
  }
}
