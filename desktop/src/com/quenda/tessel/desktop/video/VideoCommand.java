package com.quenda.tessel.desktop.video;

import com.quenda.tessel.desktop.CommandLine;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Json;
import com.quenda.tessel.desktop.OutputFiles;
import com.quenda.tessel.desktop.Progress;
import com.quenda.tessel.desktop.ocr.PhotoReader;
import com.quenda.tessel.desktop.translate.Translator;
import com.quenda.tessel.desktop.translate.Translators;
import java.io.PrintStream;

/**
 * The video mode: the source opened and the tools checked before anything is written; every frame
 * translated; the video, its preview and its report renamed into place only when the last frame is
 * in.
 */
public final class VideoCommand {
  /** Milliseconds added to every OCR run, to try the loop with a slow OCR (tests). */
  public static final String OCR_DELAY_PROPERTY = "translate.extraOcrMillis";

  private VideoCommand() {}

  public static VideoResult run(CommandLine command, PrintStream out, PrintStream err)
      throws HostException {
    // Offline, a keyframe holds its frame up: read on every core. Live, it is read beside the
    // frames being drawn.
    try (FrameSource source = FrameSources.open(command.inputs.get(0));
         PhotoReader reader = command.live
             ? PhotoReader.forLiveVideo(command.from.tesseract)
             : new PhotoReader(command.from.tesseract, PhotoReader.ALL_CORES);
         Translator translator =
             Translators.create(command.from, command.to, command.translations)) {
      VideoJob job = new VideoJob(
          reader, translator, command.to, command.live, Long.getLong(OCR_DELAY_PROPERTY, 0));
      return run(job, source, command, out, err);
    }
  }

  /** Runs {@code job} on {@code source} and writes its files (tests give their own source). */
  public static VideoResult run(VideoJob job, FrameSource source, CommandLine command,
      PrintStream out, PrintStream err) throws HostException {
    Progress progress = new Progress(source.frameCountHint(), command.quiet, err);
    try (OutputFiles files = new OutputFiles(command.out);
         VideoSink sink = new VideoSink(files, source.name(), source.fps(), command.live)) {
      VideoResult result;
      try {
        result = job.run(source, sink, progress);
      } finally {
        progress.finish();
      }
      sink.finish();
      files.text(source.name() + ".json",
          Json.write(result.json(sink.videoName(), sink.codecName(), command.live)));
      files.commit();
      print(result, sink, command, out);
      return result;
    }
  }

  private static void print(
      VideoResult result, VideoSink sink, CommandLine command, PrintStream out) {
    out.printf("%d frames, %d keyframes; written to %s/%s (%s) with a preview%n", result.frames,
        result.keyframes.size(), command.out, sink.videoName(), sink.codecName());
    out.printf("%.1f output frames per second; per frame median (p95): track %.1f (%.1f) ms, "
            + "draw %.1f (%.1f) ms, encode %.1f (%.1f) ms%n",
        result.outputFps, result.medianMillis("track"), result.p95Millis("track"),
        result.medianMillis("draw"), result.p95Millis("draw"), result.medianMillis("encode"),
        result.p95Millis("encode"));
    out.printf("per keyframe median: ocr %.0f ms, translate %.0f ms, erase %.0f ms%n",
        result.medianMillis("ocr"), result.medianMillis("translate"), result.medianMillis("erase"));
    if (command.live && !result.latencies.isEmpty()) {
      out.printf("keyframe to overlay: %s ms%n",
          result.latencies.stream().map(l -> String.format("%.0f", l)).toList());
    }
  }
}
