package com.quenda.tessel.desktop.bench;

import com.quenda.tessel.desktop.CommandLine;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import com.quenda.tessel.desktop.Progress;
import com.quenda.tessel.desktop.ocr.PhotoReader;
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
import java.io.PrintStream;
import java.nio.charset.StandardCharsets;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.Arrays;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.imgcodecs.Imgcodecs;
import org.opencv.imgproc.Imgproc;

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
    PhotoReader reader = new PhotoReader(en.tesseract);
    Translator translator = Translators.create(en, es, null);

    photo(dir, reader, translator, es, runs);
    // Ten seconds, so that live most frames come after the first keyframe's result.
    BundledInputs.writeVideo(BundledInputs.cameraSequence(300), dir.resolve("camera.mp4").toFile());
    for (boolean live : new boolean[] {false, true}) {
      video(dir, live);
    }
  }

  private static void photo(
      Path dir, PhotoReader reader, Translator translator, Language to, int runs) throws Exception {
    Scene page = Scenes.bundled("page");
    Path input = dir.resolve("page.png");
    Mat bgr = new Mat();
    Imgproc.cvtColor(page.rgb, bgr, Imgproc.COLOR_RGB2BGR);
    Imgcodecs.imwrite(input.toString(), bgr);
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
        live ? String.format("; keyframe to overlay %s ms", result.latencies) : "");
  }

  private static double median(double[] values) {
    double[] sorted = values.clone();
    Arrays.sort(sorted);
    return sorted[sorted.length / 2];
  }
}
