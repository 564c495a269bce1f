package com.quenda.tessel.desktop.translate;

import com.quenda.tessel.desktop.ChildProcess;
import com.quenda.tessel.desktop.Language;
import java.io.PrintStream;
import java.nio.charset.StandardCharsets;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.Arrays;
import java.util.List;
import java.util.Map;

/**
 * Measures translation, English to Spanish (not a test: it prints figures on standard error):
 *
 * <ul>
 *   <li>a keyframe of 10 lines, the way translation used to run (one apertium process per call,
 *       the lines apart as paragraphs) and with the pipeline kept running, in the same run: median
 *       of several calls each, and their ratio;
 *   <li>the texts of FILE (first tab-separated column, '#' lines skipped), one call per text as the
 *       text mode makes them: time from start, and after start;
 *   <li>the memory's share: lookups alone per line, and the same texts translated with and without
 *       the memory.
 * </ul>
 *
 * Usage: translate_bench [runs] [FILE]
 */
public final class TranslateBench {
  private static final List<String> KEYFRAME = List.of("Welcome to the castle", "Opening hours",
      "Tuesday to Sunday 10:00 - 18:00", "Please keep to the marked path",
      "Children must be accompanied by an adult", "No flash photography", "Audio guides available",
      "Gift shop and café on the ground floor", "Emergency exit", "Thank you for visiting");

  private TranslateBench() {}

  public static void main(String[] args) throws Exception {
    int runs = args.length > 0 ? Integer.parseInt(args[0]) : 10;
    PrintStream out = new PrintStream(System.err, true, StandardCharsets.UTF_8);
    Language en = Language.of("en");
    Language es = Language.of("es");

    double[] before = new double[runs];
    for (int r = 0; r < runs; r++) {
      long start = System.nanoTime();
      ChildProcess.run("translation", List.of("apertium", "-u", "eng-spa"),
          String.join("\n\n", KEYFRAME) + "\n", Map.of(), 120_000);
      before[r] = millis(start);
    }
    long started = System.nanoTime();
    try (ApertiumTranslator translator = new ApertiumTranslator(en, es)) {
      double startup = millis(started);
      translator.translate(KEYFRAME);
      double[] after = new double[runs];
      for (int r = 0; r < runs; r++) {
        long start = System.nanoTime();
        translator.translate(KEYFRAME);
        after[r] = millis(start);
      }
      out.printf("keyframe of 10 lines: process per call %.1f ms, kept running %.1f ms "
              + "(median of %d; %.1fx faster); pipeline start %.0f ms%n",
          median(before), median(after), runs, median(before) / median(after), startup);
    }
    if (args.length > 1) {
      texts(Path.of(args[1]), en, es, out);
    }
  }

  private static void texts(Path file, Language en, Language es, PrintStream out) throws Exception {
    List<String> texts = new ArrayList<>();
    for (String line : Files.readAllLines(file, StandardCharsets.UTF_8)) {
      if (!line.isBlank() && !line.startsWith("#")) {
        texts.add(line.split("\t")[0]);
      }
    }
    long started = System.nanoTime();
    try (ApertiumTranslator translator = new ApertiumTranslator(en, es)) {
      long afterStart = System.nanoTime();
      for (String text : texts) {
        translator.translate(List.of(text));
      }
      out.printf("%d texts one by one: %.0f ms from start, %.0f ms after start (%.1f ms a text)%n",
          texts.size(), millis(started), millis(afterStart), millis(afterStart) / texts.size());
    }
    SignMemory memory = ApertiumTranslator.memoryOf(en, es);
    long lookups = System.nanoTime();
    int rounds = 200;
    for (int r = 0; r < rounds; r++) {
      for (String text : texts) {
        memory.whole(text);
        memory.find(text);
      }
    }
    out.printf("memory of %d segments: lookups %.1f us a text%n", memory.size(),
        millis(lookups) * 1000 / rounds / texts.size());
    try (ApertiumTranslator without = new ApertiumTranslator(
             en, es, SignMemory.EMPTY, ApertiumTranslator.TIMEOUT_MILLIS, out);
         ApertiumTranslator with =
             new ApertiumTranslator(en, es, memory, ApertiumTranslator.TIMEOUT_MILLIS, out)) {
      without.translate(texts);
      with.translate(texts);
      long a = System.nanoTime();
      without.translate(texts);
      double bare = millis(a);
      long b = System.nanoTime();
      with.translate(texts);
      out.printf("the same texts without the memory %.0f ms, with it %.0f ms%n", bare, millis(b));
    }
  }

  private static double millis(long start) {
    return (System.nanoTime() - start) / 1e6;
  }

  private static double median(double[] values) {
    double[] sorted = values.clone();
    Arrays.sort(sorted);
    return sorted[sorted.length / 2];
  }
}
