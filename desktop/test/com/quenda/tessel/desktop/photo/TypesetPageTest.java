package com.quenda.tessel.desktop.photo;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.TranslateMain;
import com.quenda.tessel.desktop.Upright;
import com.quenda.tessel.desktop.scenes.Scenes;
import java.io.ByteArrayOutputStream;
import java.io.PrintStream;
import java.nio.charset.StandardCharsets;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.List;
import java.util.regex.Matcher;
import java.util.regex.Pattern;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;
import org.opencv.imgcodecs.Imgcodecs;
import org.opencv.imgproc.Imgproc;

/**
 * The bundled museum page translated end to end: its ten lines are one paragraph, translated
 * whole and set back flush left in a serif face, each line starting where the English did.
 */
class TypesetPageTest {
  @TempDir static Path dir;
  static String json;
  static Mat before;
  static Mat after;

  @BeforeAll
  static void translateThePage() throws Exception {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    Path input = dir.resolve("page.png");
    Scenes.bundled("page").writePng(input);
    Path out = dir.resolve("out");
    ByteArrayOutputStream err = new ByteArrayOutputStream();
    ExitStatus status = TranslateMain.run(
        new String[] {"photo", input.toString(), "--to", "es", "--out", out.toString()},
        new PrintStream(new ByteArrayOutputStream(), true, StandardCharsets.UTF_8),
        new PrintStream(err, true, StandardCharsets.UTF_8));
    assertEquals(ExitStatus.OK, status, err.toString(StandardCharsets.UTF_8));
    json = Files.readString(out.resolve("page.json"));
    before = read(input);
    after = read(out.resolve("page.png"));
  }

  @Test
  void thePageIsOneParagraphTranslatedWholeAndReportedSo() {
    String blocks = json.substring(json.indexOf("\"blocks\""));
    assertEquals(1, count(blocks, "\"source\""), blocks);
    // Sentences run on across the lines.
    assertTrue(
        blocks.contains("every day from nine to five. Tickets are sold at the main"), blocks);
    assertTrue(blocks.contains("\"align\": \"left\""), blocks);
    assertTrue(blocks.contains("\"face\": \"serif\""), blocks);
    String lines = json.substring(0, json.indexOf("\"blocks\""));
    assertEquals(10, count(lines, "\"block\": 0,"), lines);
    assertEquals(10, count(lines, "\"align\": \"left\""), lines);
    assertEquals(10, count(lines, "\"face\": \"serif\""), lines);
    for (String ratio : values(lines, "size_ratio")) {
      double r = Double.parseDouble(ratio);
      assertTrue(r > 0.7 && r < 1.2, "size ratio " + r);
    }
  }

  @Test
  void eachTranslatedLineStartsWhereTheOriginalStarted() {
    List<RotatedRect> rects = rects(json.substring(0, json.indexOf("\"blocks\"")));
    assertEquals(10, rects.size());
    for (RotatedRect rect : rects) {
      double was = firstInk(before, rect);
      double now = firstInk(after, rect);
      assertTrue(Math.abs(now - was) <= 0.3 * rect.size.height,
          "line at y " + Math.round(rect.center.y) + " starts at " + now + ", was " + was);
    }
  }

  /** The first column of dark ink along the line's band, from its left end less a margin. */
  private static double firstInk(Mat rgb, RotatedRect rect) {
    double margin = 2 * rect.size.height;
    Mat band = Upright.cut(rgb, rect.center, rect.angle, 1,
        new Size(Math.round(rect.size.width + 2 * margin), Math.round(rect.size.height)),
        Imgproc.INTER_LINEAR);
    Mat grey = new Mat();
    Imgproc.cvtColor(band, grey, Imgproc.COLOR_RGB2GRAY);
    for (int x = 0; x < grey.cols(); x++) {
      for (int y = 0; y < grey.rows(); y++) {
        if (grey.get(y, x)[0] < 110) {
          return x - margin;
        }
      }
    }
    return Double.NaN;
  }

  private static List<RotatedRect> rects(String lines) {
    List<RotatedRect> rects = new ArrayList<>();
    Matcher m = Pattern.compile("\"rect\": \\[([^\\]]*)\\]").matcher(lines);
    while (m.find()) {
      String[] v = m.group(1).split(",\\s*");
      rects.add(new RotatedRect(new Point(Double.parseDouble(v[0]), Double.parseDouble(v[1])),
          new Size(Double.parseDouble(v[2]), Double.parseDouble(v[3])), Double.parseDouble(v[4])));
    }
    return rects;
  }

  private static List<String> values(String json, String key) {
    List<String> values = new ArrayList<>();
    Matcher m = Pattern.compile("\"" + key + "\": ([0-9.]+)").matcher(json);
    while (m.find()) {
      values.add(m.group(1));
    }
    return values;
  }

  private static int count(String text, String part) {
    int n = 0;
    for (int i = text.indexOf(part); i >= 0; i = text.indexOf(part, i + 1)) {
      n++;
    }
    return n;
  }

  private static Mat read(Path png) {
    Mat bgr = Imgcodecs.imread(png.toString());
    Imgproc.cvtColor(bgr, bgr, Imgproc.COLOR_BGR2RGB);
    return bgr;
  }
}
