package com.quenda.tessel.soak;

import java.util.Arrays;
import java.util.LinkedHashMap;
import java.util.Map;

/**
 * Wall time per frame of each step, in milliseconds, summarised as median, 99th percentile, max.
 */
final class StepTimes {
  private final Map<String, double[]> samples = new LinkedHashMap<>();
  private final Map<String, Integer> counts = new LinkedHashMap<>();

  /** Steps listed here come first in the table, in this order. */
  StepTimes(String... steps) {
    for (String step : steps) {
      samples.put(step, new double[1024]);
      counts.put(step, 0);
    }
  }

  void add(String step, double millis) {
    double[] values = samples.computeIfAbsent(step, s -> new double[1024]);
    int n = counts.getOrDefault(step, 0);
    if (n == values.length) {
      values = Arrays.copyOf(values, 2 * n);
      samples.put(step, values);
    }
    values[n] = millis;
    counts.put(step, n + 1);
  }

  /** One line per step, those named at construction first. */
  String table() {
    StringBuilder table = new StringBuilder(String.format(
        "  %-24s %8s %9s %9s %9s%n", "per frame (ms)", "frames", "median", "p99", "max"));
    for (Map.Entry<String, double[]> step : samples.entrySet()) {
      if (counts.get(step.getKey()) == 0) {
        continue;
      }
      double[] sorted = Arrays.copyOf(step.getValue(), counts.get(step.getKey()));
      Arrays.sort(sorted);
      table.append(String.format("  %-24s %8d %9.2f %9.2f %9.2f%n", step.getKey(), sorted.length,
          percentile(sorted, 0.5), percentile(sorted, 0.99), sorted[sorted.length - 1]));
    }
    return table.toString();
  }

  private static double percentile(double[] sorted, double q) {
    return sorted[Math.max(0, (int) Math.ceil(q * sorted.length) - 1)];
  }
}
