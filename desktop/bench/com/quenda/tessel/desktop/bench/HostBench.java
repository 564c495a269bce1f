package com.quenda.tessel.desktop.bench;

import com.quenda.tessel.desktop.CommandLine;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import com.quenda.tessel.desktop.Progress;
import com.quenda.tessel.desktop.ocr.PhotoReader;
import com.quenda.tessel.desktop.photo.LineResult;
import com.quenda.tessel.desktop.photo.PhotoInput;
import com.quenda.tessel.desktop.photo.PhotoJob;
import com.quenda.tessel.desktop.photo.PhotoResult;
import com.quenda.tessel.desktop.photo.StageTimes;
import com.quenda.tessel.desktop.scenes.BundledInputs;
import com.quenda.tessel.desktop.scenes.Scene;
import com.quenda.tessel.desktop.scenes.Scenes;
import com.quenda.tessel.desktop.translate.Translator;
import com.quenda.tessel.desktop.translate.Translators;
import com.quenda.tessel.desktop.video.VideoCommand;
import com.quenda.tessel.desktop.video.VideoResult;
import java.io.ByteArrayOutputStream;
import java.io.IOException;
import java.io.PrintStream;
import java.nio.charset.StandardCharsets;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.Arrays;
import java.util.Collections;
import java.util.List;
import org.opencv.core.Core;

/**
 * Measures the desktop host on bundled inputs (not a test: it prints figures, on standard error):
 *
 * <ul>
 *   <li>photo: the 1280×720 page with ten lines, English to Spanish, per stage and in total,
 *       median of several runs;
 *   <li>video: the bundled 1280×720 camera sequence, 300 frames at 30 per second, offline and
 *       live: output frames per second, per-frame median and 95th percentile of tracking, drawing
 *       and encoding, and (live) the time from each keyframe to its first overlay.
 * </ul>
 */
public final class HostBench {
  private HostBench() {}

  public static void main(String[] args) throws Exception {
    int runs = args.length > 0 ? Integer.parseInt(args[0]) : 5;
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    Path dir = Files.createTempDirectory("host-bench");
    Language en = Language.of("en");
    Language es = Language.of("es");
    PhotoReader reader = new PhotoReader(en.tesseract, PhotoReader.ALL_CORES);
    Translator translator = Translators.create(en, es, null);

    photo(dir, reader, translator, es, runs);
    capitals(dir, reader, translator, es);
    // Ten seconds, so that live most frames come after the first keyframe's result.
    BundledInputs.writeVideo(BundledInputs.cameraSequence(300), dir.resolve("camera.mp4").toFile());
    for (boolean live : new boolean[] {false, true}) {
      video(dir, live);
    }
  }

  private static void photo(
      Path dir, PhotoReader reader, Translator translator, Language to, int runs) throws Exception {
    Path input = write(Scenes.bundled("page"), dir);
    PhotoJob job = new PhotoJob(reader, translator, to);
    String[] stages = {"ocr", "translate", "erase", "draw", "total"};
    double[][] millis = new double[stages.length][runs];
    int lines = 0;
    for (int r = 0; r < runs; r++) {
      PhotoResult result = job.run(PhotoInput.check(input), new Progress(1, true, System.err));
      for (int s = 0; s < StageTimes.STAGES.length; s++) {
        millis[s][r] = result.times.of(StageTimes.STAGES[s]);
      }
      millis[stages.length - 1][r] = result.totalMillis;
      lines = result.lines.size();
      result.release();
    }
    System.err.printf("photo 1280x720, %d lines, median of %d runs (ms):", lines, runs);
    for (int s = 0; s < stages.length; s++) {
      System.err.printf(" %s %.0f", stages[s], median(millis[s]));
    }
    System.err.println();
  }

  /** Drawn capital height over the original's, per translated line of the sign scenes. */
  private static void capitals(Path dir, PhotoReader reader, Translator translator, Language to)
      throws Exception {
    PhotoJob job = new PhotoJob(reader, translator, to);
    List<Double> ratios = new ArrayList<>();
    // Lines whose translation is not much longer than the original are not narrowed to fit the
    // width: those show the height fitting alone.
    List<Double> notLonger = new ArrayList<>();
    for (String name : List.of("street", "station", "shop", "page")) {
      Path input = write(Scenes.bundled(name), dir);
      PhotoResult result = job.run(PhotoInput.check(input), new Progress(1, true, System.err));
      for (LineResult line : result.lines) {
        if (!line.translated()) {
          continue;
        }
        double before = CapHeight.of(result.original, line.line.rect, line.color);
        double after = CapHeight.of(result.translated, line.line.rect, line.color);
        if (before > 0 && after > 0) {
          ratios.add(after / before);
          if (line.translation.length() <= 1.1 * line.line.text.length()) {
            notLonger.add(after / before);
          }
        }
      }
      result.release();
    }
    printRatios("all translated lines", ratios);
    printRatios("translation at most 10% longer", notLonger);
  }

  private static void printRatios(String which, List<Double> ratios) {
    if (ratios.isEmpty()) {
      return;
    }
    Collections.sort(ratios);
    long within = ratios.stream().filter(r -> Math.abs(r - 1) <= 0.15).count();
    System.err.printf("capital height drawn/original, %s: %d lines, median %.2f, "
            + "range %.2f-%.2f, %d within 15%%%n",
        which, ratios.size(), ratios.get(ratios.size() / 2), ratios.get(0),
        ratios.get(ratios.size() - 1), within);
  }

  private static Path write(Scene scene, Path dir) throws IOException {
    Path file = dir.resolve(scene.name + ".png");
    scene.writePng(file);
    scene.release();
    return file;
  }

  private static void video(Path dir, boolean live) throws HostException {
    String[] args = {"video", dir.resolve("camera.mp4").toString(), "--out",
        dir.resolve(live ? "live" : "offline").toString(), "--quiet", live ? "--live" : "--quiet"};
    PrintStream quiet = new PrintStream(new ByteArrayOutputStream(), true, StandardCharsets.UTF_8);
    VideoResult result = VideoCommand.run(CommandLine.parse(args), quiet, quiet);
    System.err.printf("video 1280x720, %d frames, %s: %.1f output fps; per frame median/p95 (ms): "
            + "track %.1f/%.1f draw %.1f/%.1f encode %.1f/%.1f whole frame %.1f/%.1f; "
            + "%d keyframes, ocr median %.0f ms%s%n",
        result.frames, live ? "live" : "offline", result.outputFps, result.medianMillis("track"),
        result.p95Millis("track"), result.medianMillis("draw"), result.p95Millis("draw"),
        result.medianMillis("encode"), result.p95Millis("encode"), result.medianMillis("frame"),
        result.p95Millis("frame"), result.keyframes.size(), result.medianMillis("ocr"),
        live ? String.format("; keyframe to overlay %s ms; drawn frame median with the worker "
                + "busy %.1f ms, idle %.1f ms",
            result.latencies, result.medianMillis("drawn frame, worker busy"),
            result.medianMillis("drawn frame, worker idle"))
             : "");
  }

  private static double median(double[] values) {
    double[] sorted = values.clone();
    Arrays.sort(sorted);
    return sorted[sorted.length / 2];
  }
}
