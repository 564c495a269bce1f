package com.quenda.tessel.desktop.ocr;

import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.scenes.Scene;
import com.quenda.tessel.desktop.scenes.Scenes;
import java.io.IOException;
import java.lang.management.ManagementFactory;
import java.lang.management.ThreadMXBean;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.Arrays;
import java.util.List;
import org.opencv.core.Core;

/**
 * Measuring program: reads the bundled scenes, tilted-sign scenes and turned pages, and prints
 * per scene the words found, the worst rectangle errors and the median time of {@code read()}:
 * wall clock, this JVM thread's CPU time, and the CPU time of the OCR program's runs (Linux only,
 * from the process's reaped-children times).
 *
 * <p>Run: {@code java -cp ocr_desktop.jar:ocr_host.jar:opencv.jar -Djava.library.path=/usr/lib/jni
 * com.quenda.tessel.desktop.ocr.ReadingMeasure [runs]}
 */
public final class ReadingMeasure {
  private ReadingMeasure() {}

  public static void main(String[] args) throws HostException {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    int runs = args.length > 0 ? Integer.parseInt(args[0]) : 5;
    List<Scene> scenes = new ArrayList<>();
    for (String name : Scenes.names()) {
      scenes.add(Scenes.bundled(name));
    }
    double[][] tilts = {{-25, -17, -9, -2}, {3, 10, 18, 25}, {-21, -5, 14, 22}, {-12, 7, -23, 16}};
    for (int i = 0; i < tilts.length; i++) {
      scenes.add(Scenes.tiltedSigns(300 + i, tilts[i]));
    }
    scenes.add(renamed(Scenes.page(180), "page-180"));
    scenes.add(renamed(Scenes.page(90), "page-90"));
    ThreadMXBean cpu = ManagementFactory.getThreadMXBean();
    int words = 0;
    int found = 0;
    System.out.printf("%-12s %5s %7s %8s %8s %9s %9s%n", "scene", "lines", "words", "centre",
        "angle", "wall ms", "cpu ms");
    try (PhotoReader reader = new PhotoReader("eng")) {
      for (Scene s : scenes) {
        reader.read(s.rgb); // warm-up
        double[] wall = new double[runs];
        double[] thread = new double[runs];
        double[] child = new double[runs];
        List<RecognizedLine> lines = List.of();
        for (int r = 0; r < runs; r++) {
          long c0 = cpu.getCurrentThreadCpuTime();
          double k0 = childrenCpuMillis();
          long t0 = System.nanoTime();
          lines = reader.read(s.rgb);
          wall[r] = (System.nanoTime() - t0) / 1e6;
          thread[r] = (cpu.getCurrentThreadCpuTime() - c0) / 1e6;
          child[r] = childrenCpuMillis() - k0;
        }
        int w = 0;
        int f = 0;
        double centre = 0;
        double angle = 0;
        for (LineMatch m : LineMatch.match(s.lines, lines)) {
          w += m.truthWords();
          f += m.wordsFound();
          if (m.read != null) {
            centre = Math.max(centre, m.centreError());
            angle = Math.max(angle, m.angleError());
          }
        }
        words += w;
        found += f;
        System.out.printf("%-12s %2d/%-2d %3d/%-3d %6.2fpx %7.2f° %8.0f %8.0f %8.0f%n", s.name,
            lines.size(), s.lines.size(), f, w, centre, angle, median(wall), median(thread),
            median(child));
        s.release();
      }
    }
    System.out.printf("words found: %d of %d (%.1f%%)%n", found, words, 100.0 * found / words);
  }

  private static Scene renamed(Scene s, String name) {
    return new Scene(name, s.rgb, s.lines);
  }

  /** User and system time of the reaped child processes, at the usual 100 ticks a second. */
  private static double childrenCpuMillis() {
    try {
      String stat = Files.readString(Path.of("/proc/self/stat"));
      String[] f = stat.substring(stat.lastIndexOf(')') + 2).split(" ");
      // After the command name: state is field 3, cutime 16 and cstime 17.
      return (Long.parseLong(f[13]) + Long.parseLong(f[14])) * 10.0;
    } catch (IOException | RuntimeException e) {
      return Double.NaN;
    }
  }

  private static double median(double[] v) {
    double[] c = v.clone();
    Arrays.sort(c);
    return c[c.length / 2];
  }
}
