package com.quenda.tessel.soak;

import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import com.quenda.tessel.desktop.engine.OverlayDrawer;
import com.quenda.tessel.desktop.scenes.BundledInputs;
import com.quenda.tessel.desktop.scenes.CameraSequence;
import com.quenda.tessel.desktop.scenes.SceneLine;
import com.quenda.tessel.desktop.typeset.Face;
import java.util.ArrayList;
import java.util.List;
import java.util.Objects;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.imgproc.Imgproc;

/**
 * Soak of the engine through its JNI entries, as the desktop host drives them (a measuring
 * program, not a test): a hand-held camera sweeping back and forth over the station scene; on
 * every frame track, every 10th frame erase at the tracked places, on every frame draw and read
 * back. Every 150 frames a new tracking run starts on the lines' known rectangles, as a new OCR
 * result would start it. Prints, on standard error, the process's resident memory after warm-up,
 * at the end and at its peak, the growth after warm-up, and per-step frame times.
 *
 * <p>Usage: {@code soak [--frames N] [--warmup N]}; exit status 1 when memory grew more than 2 %
 * after warm-up.
 */
public final class Soak {
  private static final int ERASE_EVERY = 10;
  private static final int RUN_LENGTH = 150;
  // One sweep of the bundled camera; the soak runs it forwards and backwards.
  private static final int SWEEP = 301;
  private static final double GROWTH_LIMIT_PERCENT = 2;

  private Soak() {}

  public static void main(String[] args) throws HostException {
    int frames = option(args, "--frames", 10_000);
    int warmup = option(args, "--warmup", Math.min(500, frames / 2));
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    CameraSequence camera = BundledInputs.cameraSequence(SWEEP);

    StepTimes times =
        new StepTimes("track", "erase", "start run (track+erase)", "draw + read back", "total");
    long warmKib = 0;
    ResidentMemory.Arenas warmArenas = null;
    long peakKib = 0;
    int peakFrame = 0;
    int runs = 0;
    int linesDrawn = 0;
    Mat rgba = new Mat();
    TrackedLines lines = null;
    try (OverlayDrawer drawer =
             new OverlayDrawer((int) camera.frameSize().width, (int) camera.frameSize().height)) {
      drawer.setLanguage(Language.of("es"), Face.SANS);
      for (int k = 0; k < frames; k++) {
        int view = sweep(k);
        Mat rgb = camera.frame(view);
        long start = System.nanoTime();
        if (k % RUN_LENGTH == 0) {
          if (lines != null) {
            lines.close();
          }
          lines = new TrackedLines(rgb, inView(camera.truth(view)), 1000L * runs++);
          times.add("start run (track+erase)", millis(start));
        } else {
          lines.track(rgb);
          long tracked = System.nanoTime();
          times.add("track", millis(start, tracked));
          if (k % ERASE_EVERY == 0) {
            lines.erase(rgb);
            times.add("erase", millis(tracked));
          }
        }
        long drawStart = System.nanoTime();
        Imgproc.cvtColor(rgb, rgba, Imgproc.COLOR_RGB2RGBA);
        var overlays = lines.overlays();
        linesDrawn += overlays.texts.length;
        drawer.draw(rgba, overlays).release();
        times.add("draw + read back", millis(drawStart));
        times.add("total", millis(start));
        rgb.release();

        long kib = ResidentMemory.kib();
        if (k == warmup - 1) {
          warmKib = kib;
          warmArenas = ResidentMemory.mallocArenas();
        }
        if (kib > peakKib) {
          peakKib = kib;
          peakFrame = k;
        }
        if ((k + 1) % 1000 == 0) {
          System.err.printf("soak: frame %d, resident %.1f MiB%n", k + 1, kib / 1024.0);
        }
      }
    } finally {
      if (lines != null) {
        lines.close();
      }
      rgba.release();
      camera.scene().release();
    }
    long endKib = ResidentMemory.kib();
    double growth = 100.0 * (endKib - warmKib) / warmKib;
    System.err.printf("soak: %d frames of %dx%d, %d tracking runs, %.1f lines drawn per frame%n",
        frames, (int) camera.frameSize().width, (int) camera.frameSize().height, runs,
        (double) linesDrawn / frames);
    System.err.printf(
        "  resident memory (VmRSS of the whole JVM; Java heap fixed: %s)%n", heapNote());
    row("after warm-up (frame " + warmup + ")", warmKib);
    row("at the end", endKib);
    row("peak (frame " + (peakFrame + 1) + ")", peakKib);
    System.err.printf("    %-28s %+9.1f MiB (%+.2f %%, limit %.0f %%)%n", "growth after warm-up",
        (endKib - warmKib) / 1024.0, growth, GROWTH_LIMIT_PERCENT);
    ResidentMemory.Arenas endArenas = ResidentMemory.mallocArenas();
    if (endArenas.count() > 0) {
      System.err.printf("    %-28s %+9.1f MiB (%d arenas after warm-up, %d at the end)%n",
          "of which in malloc arenas", (endArenas.kib() - warmArenas.kib()) / 1024.0,
          warmArenas.count(), endArenas.count());
    }
    System.err.print(times.table());
    System.exit(growth > GROWTH_LIMIT_PERCENT ? 1 : 0);
  }

  /** Frame index of the camera for soak frame k: forwards through the sweep, then backwards. */
  private static int sweep(int k) {
    int period = 2 * (SWEEP - 1);
    int t = k % period;
    return t < SWEEP ? t : period - t;
  }

  private static List<SceneLine> inView(List<SceneLine> truth) {
    List<SceneLine> lines = new ArrayList<>(truth);
    lines.removeIf(Objects::isNull);
    return lines;
  }

  private static void row(String label, long kib) {
    System.err.printf("    %-28s %9.1f MiB%n", label, kib / 1024.0);
  }

  private static String heapNote() {
    Runtime runtime = Runtime.getRuntime();
    return String.format(
        "%d MiB committed of %d MiB", runtime.totalMemory() >> 20, runtime.maxMemory() >> 20);
  }

  private static double millis(long start) {
    return millis(start, System.nanoTime());
  }

  private static double millis(long start, long end) {
    return (end - start) / 1e6;
  }

  private static int option(String[] args, String name, int fallback) {
    for (int i = 0; i + 1 < args.length; i++) {
      if (args[i].equals(name)) {
        return Integer.parseInt(args[i + 1]);
      }
    }
    return fallback;
  }
}
