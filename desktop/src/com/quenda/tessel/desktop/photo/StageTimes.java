package com.quenda.tessel.desktop.photo;

import java.util.LinkedHashMap;
import java.util.Map;

/** Milliseconds spent per stage of one image, in the order the stages run. */
public final class StageTimes {
  public static final String[] STAGES = {"ocr", "translate", "erase", "draw"};

  private final Map<String, Double> millis = new LinkedHashMap<>();
  private final long start = System.nanoTime();
  private long stageStart = start;

  /** Ends the running stage as {@code stage}. */
  void end(String stage) {
    long now = System.nanoTime();
    millis.merge(stage, (now - stageStart) / 1e6, Double::sum);
    stageStart = now;
  }

  public double of(String stage) {
    return millis.getOrDefault(stage, 0.0);
  }

  /** Every stage and the total, for the JSON report. */
  Map<String, Object> json(double totalMillis) {
    Map<String, Object> json = new LinkedHashMap<>();
    for (String stage : STAGES) {
      json.put(stage, of(stage));
    }
    json.put("total", totalMillis);
    return json;
  }

  double sinceStart() {
    return (System.nanoTime() - start) / 1e6;
  }
}
