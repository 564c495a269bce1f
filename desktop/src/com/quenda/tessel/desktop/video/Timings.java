package com.quenda.tessel.desktop.video;

import java.util.ArrayList;
import java.util.Arrays;
import java.util.LinkedHashMap;
import java.util.List;
import java.util.Map;

/** Milliseconds per stage, one sample per frame (or per keyframe), summarised as median and p95. */
final class Timings {
  private final Map<String, List<Double>> samples = new LinkedHashMap<>();

  void add(String stage, double millis) {
    samples.computeIfAbsent(stage, s -> new ArrayList<>()).add(millis);
  }

  double median(String stage) {
    return percentile(stage, 0.5);
  }

  double p95(String stage) {
    return percentile(stage, 0.95);
  }

  double max(String stage) {
    return samples.getOrDefault(stage, List.of()).stream().mapToDouble(d -> d).max().orElse(0);
  }

  /** {"stage": {"median": …, "p95": …, "count": …}, …} in the order the stages first ran. */
  Map<String, Object> json() {
    Map<String, Object> json = new LinkedHashMap<>();
    for (String stage : samples.keySet()) {
      Map<String, Object> summary = new LinkedHashMap<>();
      summary.put("median", median(stage));
      summary.put("p95", p95(stage));
      summary.put("count", samples.get(stage).size());
      json.put(stage, summary);
    }
    return json;
  }

  private double percentile(String stage, double q) {
    double[] values = samples.getOrDefault(stage, List.of()).stream().mapToDouble(d -> d).toArray();
    if (values.length == 0) {
      return 0;
    }
    Arrays.sort(values);
    return values[Math.min(values.length - 1, (int) Math.ceil(q * values.length) - 1)];
  }
}
