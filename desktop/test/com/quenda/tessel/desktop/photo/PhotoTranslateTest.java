package com.quenda.tessel.desktop.photo;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.TranslateMain;
import com.quenda.tessel.desktop.ocr.PhotoReader;
import com.quenda.tessel.desktop.ocr.RecognizedLine;
import com.quenda.tessel.desktop.scenes.Backdrop;
import com.quenda.tessel.desktop.scenes.Scene;
import com.quenda.tessel.desktop.scenes.Scenes;
import com.quenda.tessel.desktop.scenes.SignScene;
import com.quenda.tessel.desktop.scenes.SignStyle;
import java.io.ByteArrayOutputStream;
import java.io.IOException;
import java.io.PrintStream;
import java.nio.charset.StandardCharsets;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.Arrays;
import java.util.HashSet;
import java.util.List;
import java.util.Locale;
import java.util.Set;
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
 * The photo mode end to end, as a user runs it, judged the way a reader would: OCR of the
 * translated picture no longer finds the English and does find the Spanish, where it stands. A
 * picture without text comes out unchanged; a sign nobody can translate stays as it was.
 */
class PhotoTranslateTest {
  @TempDir static Path dir;
  static Path out;
  static String err;
  static ExitStatus status;
  static Scene street;

  @BeforeAll
  static void translatePhotos() throws Exception {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    street = Scenes.bundled("street");
    write(street);
    write(new SignScene(1280, 720, Backdrop.BRICK_WALL, 5).render("wall"));
    write(new SignScene(1280, 720, Backdrop.FACADE, 9)
              .sign("Zorbly Quaxen", 640, 300, 44, 6, SignStyle.DARK_ON_WHITE)
              .render("names"));
    out = dir.resolve("out");
    ByteArrayOutputStream errBytes = new ByteArrayOutputStream();
    status =
        TranslateMain.run(new String[] {"photo", input("street"), input("wall"), input("names"),
                              "--from", "en", "--to", "es", "--out", out.toString()},
            new PrintStream(new ByteArrayOutputStream(), true, StandardCharsets.UTF_8),
            new PrintStream(errBytes, true, StandardCharsets.UTF_8));
    err = errBytes.toString(StandardCharsets.UTF_8);
  }

  @Test
  void theEnglishIsGoneAndTheSpanishReadsWhereItStood() throws Exception {
    assertEquals(ExitStatus.OK, status, err);
    String json = Files.readString(out.resolve("street.json"));
    List<String> translations =
        strings(json.substring(0, json.indexOf("\"blocks\"")), "translation");
    assertEquals(street.lines.size(), translations.size(), json);

    Mat translated = read(out.resolve("street.png"));
    Set<String> englishLeft = words(new PhotoReader("eng").read(translated));
    Set<String> spanishRead = words(new PhotoReader("spa").read(translated));
    List<String> english = new ArrayList<>();
    street.lines.forEach(line -> english.addAll(split(line.text)));
    List<String> spanish = new ArrayList<>();
    translations.forEach(t -> spanish.addAll(split(t)));
    assertTrue(share(english, englishLeft) <= 0.10, "English left: " + englishLeft);
    assertTrue(share(spanish, spanishRead) >= 0.60, "Spanish read: " + spanishRead);
    // And where it stood: a Spanish line read within line i's rectangle reads as translation i.
    List<RotatedRect> rects = rects(json);
    List<RecognizedLine> spanishLines = new PhotoReader("spa").read(translated);
    List<String> misplaced = new ArrayList<>();
    for (int i = 0; i < translations.size(); i++) {
      List<String> expected = split(translations.get(i));
      boolean found = false;
      for (RecognizedLine line : spanishLines) {
        found |= inside(line.rect.center, rects.get(i))
            && share(expected, new HashSet<>(split(line.text))) >= 0.5;
      }
      if (!found) {
        misplaced.add(translations.get(i));
      }
    }
    assertTrue(misplaced.size() <= 0.4 * translations.size(),
        "not read where their English stood: " + misplaced);

    Mat sheet = read(out.resolve("street.compare.png"));
    assertEquals(2 * translated.cols() + 8, sheet.cols());
    assertTrue(json.matches("(?s).*\"color\": \"#[0-9A-F]{6}\".*"), json);
    assertTrue(json.matches("(?s).*\"timings_ms\": \\{\\s*\"ocr\": [0-9.]+,\\s*\"translate\": "
                   + "[0-9.]+,\\s*\"erase\": [0-9.]+,\\s*\"draw\": [0-9.]+,\\s*\"total\": .*"),
        json);
  }

  @Test
  void aPictureWithoutTextIsCopiedThroughUnchanged() throws Exception {
    Mat before = read(dir.resolve("wall.png"));
    Mat after = read(out.resolve("wall.png"));
    assertEquals(0, Core.norm(before, after, Core.NORM_INF));
    assertTrue(err.contains(input("wall") + ": no text found; copied through unchanged"), err);
    assertTrue(Files.readString(out.resolve("wall.json")).contains("\"lines\": []"));
  }

  @Test
  void aLineThatCannotBeTranslatedKeepsItsText() throws Exception {
    String json = Files.readString(out.resolve("names.json"));
    assertTrue(json.contains("\"translation\": null"), json);
    assertTrue(err.contains("\"Zorbly Quaxen\" could not be translated; kept as it is"), err);
    Set<String> still = words(new PhotoReader("eng").read(read(out.resolve("names.png"))));
    assertTrue(still.contains("zorbly"), "read " + still);
  }

  private static void write(Scene scene) throws IOException {
    scene.writePng(Path.of(input(scene.name)));
  }

  private static String input(String name) {
    return dir.resolve(name + ".png").toString();
  }

  private static Mat read(Path png) {
    Mat bgr = Imgcodecs.imread(png.toString());
    Imgproc.cvtColor(bgr, bgr, Imgproc.COLOR_BGR2RGB);
    return bgr;
  }

  private static List<String> strings(String json, String key) {
    List<String> values = new ArrayList<>();
    Matcher m = Pattern.compile("\"" + key + "\": \"([^\"]*)\"").matcher(json);
    while (m.find()) {
      values.add(m.group(1));
    }
    return values;
  }

  private static List<RotatedRect> rects(String json) {
    List<RotatedRect> rects = new ArrayList<>();
    Matcher m = Pattern.compile("\"rect\": \\[([^\\]]*)\\]").matcher(json);
    while (m.find()) {
      double[] v = Arrays.stream(m.group(1).split(",")).mapToDouble(Double::parseDouble).toArray();
      rects.add(new RotatedRect(new Point(v[0], v[1]), new Size(v[2], v[3]), v[4]));
    }
    return rects;
  }

  /** Whether {@code p} lies in {@code rect}, with half a line height to spare above and below. */
  private static boolean inside(Point p, RotatedRect rect) {
    double a = Math.toRadians(rect.angle);
    double dx = p.x - rect.center.x;
    double dy = p.y - rect.center.y;
    double along = dx * Math.cos(a) + dy * Math.sin(a);
    double across = -dx * Math.sin(a) + dy * Math.cos(a);
    return Math.abs(along) <= rect.size.width / 2 && Math.abs(across) <= rect.size.height;
  }

  private static List<String> split(String text) {
    List<String> words = new ArrayList<>();
    for (String word : text.toLowerCase(Locale.ROOT).split("[^\\p{L}\\p{N}]+")) {
      if (!word.isEmpty()) {
        words.add(word);
      }
    }
    return words;
  }

  private static Set<String> words(List<RecognizedLine> lines) {
    Set<String> words = new HashSet<>();
    lines.forEach(line -> words.addAll(split(line.text)));
    return words;
  }

  private static double share(List<String> words, Set<String> found) {
    return (double) words.stream().filter(found::contains).count() / words.size();
  }
}
