package com.quenda.tessel.desktop.photo;

import java.io.PrintStream;
import java.nio.file.Path;

/** Totals over a run, printed at its end. */
final class PhotoSummary {
  private int photos;
  private int found;
  private int translated;
  private final double[] stageMillis = new double[StageTimes.STAGES.length];
  private double totalMillis;

  void add(PhotoResult result) {
    ++photos;
    found += result.lines.size();
    translated += result.translatedCount();
    for (int s = 0; s < stageMillis.length; s++) {
      stageMillis[s] += result.times.of(StageTimes.STAGES[s]);
    }
    totalMillis += result.totalMillis;
  }

  void print(PrintStream out, Path directory) {
    out.printf("%d %s: %d lines found, %d translated, %d kept as they were; written to %s%n",
        photos, photos == 1 ? "photo" : "photos", found, translated, found - translated, directory);
    StringBuilder stages = new StringBuilder();
    for (int s = 0; s < stageMillis.length; s++) {
      stages.append(String.format("%s %.0f ms, ", StageTimes.STAGES[s], stageMillis[s]));
    }
    out.printf("time: %stotal %.0f ms%n", stages, totalMillis);
  }
}
