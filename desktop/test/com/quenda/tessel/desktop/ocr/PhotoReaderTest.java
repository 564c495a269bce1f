package com.quenda.tessel.desktop.ocr;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertNotNull;
import static org.junit.jupiter.api.Assertions.assertThrows;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.scenes.Backdrop;
import com.quenda.tessel.desktop.scenes.Scene;
import com.quenda.tessel.desktop.scenes.Scenes;
import com.quenda.tessel.desktop.scenes.SignScene;
import java.awt.Font;
import java.io.File;
import java.io.IOException;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.List;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.imgcodecs.Imgcodecs;
import org.opencv.imgproc.Imgproc;

/** The reader against generated scenes whose text and rectangles are known, with real OCR. */
class PhotoReaderTest {
  private static PhotoReader reader;

  @BeforeAll
  static void setUp() throws HostException {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    reader = new PhotoReader("eng");
  }

  @Test
  void readsTiltedSignsOnPhotographsWithTightRectangles() throws HostException {
    double[][] tilts = {{-25, -17, -9, -2}, {3, 10, 18, 25}, {-21, -5, 14, 22}};
    int words = 0;
    int found = 0;
    for (int i = 0; i < tilts.length; i++) {
      Scene scene = Scenes.tiltedSigns(300 + i, tilts[i]);
      List<RecognizedLine> lines = reader.read(scene.rgb);
      for (LineMatch m : LineMatch.match(scene.lines, lines)) {
        words += m.truthWords();
        found += m.wordsFound();
        if (m.read != null) {
          assertTrue(m.centreError() <= 5, "centre error " + m.centreError() + ": " + m);
          assertTrue(m.angleError() <= 2, "angle error " + m.angleError() + ": " + m);
        }
      }
      assertEquals(scene.lines.size(), lines.size(), "lines read in " + scene.name + ": " + lines);
      scene.release();
    }
    assertTrue(found >= 0.9 * words, found + " of " + words + " words found");
  }

  /** The live video's reader looks at a 720p frame once, without the closer scene pass. */
  @Test
  void theLiveVideoReaderReadsCameraFramesSignsToo() throws HostException {
    int words = 0;
    int found = 0;
    try (PhotoReader live = PhotoReader.forLiveVideo("eng")) {
      for (String name : List.of("street", "station", "shop")) {
        Scene scene = Scenes.bundled(name);
        assertEquals(1280, scene.rgb.cols());
        for (LineMatch m : LineMatch.match(scene.lines, live.read(scene.rgb))) {
          words += m.truthWords();
          found += m.wordsFound();
        }
        scene.release();
      }
    }
    assertTrue(found >= 0.9 * words, found + " of " + words + " words found");
  }

  @Test
  void readsLinesWithTheLearnedRecogniserAndSaysSo() throws HostException {
    Mat rgb = TextPictures.lines(900, 260, "Tickets are sold at the counter", "Platform 4");
    List<RecognizedLine> lines = reader.read(rgb);
    assertEquals(2, lines.size(), "lines: " + lines);
    assertEquals("Tickets are sold at the counter", lines.get(0).text);
    assertEquals("Platform 4", lines.get(1).text);
    assertEquals(PhotoReader.LATIN, lines.get(0).reader);
    assertTrue(lines.get(0).confidence > 80 && lines.get(0).confidence <= 100, lines.toString());

    // Upside down: the same text, the angle saying which way it runs, in the same places.
    Mat turned = TextPictures.upsideDown(rgb);
    List<RecognizedLine> back = reader.read(turned);
    assertEquals(2, back.size(), "lines: " + back);
    for (RecognizedLine line : back) {
      assertEquals(180, Math.abs(line.rect.angle), 3, line.toString());
    }
    // Reading order is the page's as it lies: the turned "Platform 4" is now on top.
    assertEquals("Platform 4", back.get(0).text);
    assertEquals("Tickets are sold at the counter", back.get(1).text);
    assertEquals(rgb.cols() - lines.get(0).rect.center.x, back.get(1).rect.center.x, 4);
    assertEquals(rgb.rows() - lines.get(0).rect.center.y, back.get(1).rect.center.y, 4);
    rgb.release();
    turned.release();
  }

  /** The text of OpenCV's sample page of small print (opencv-doc), as printed. */
  static final String SAMPLE_PAGE =
      "technical details are too complex to cover in the book itself. "
      + "In teaching our courses, we have found it useful for the students to attempt a number of "
      + "small implementation projects, which often build on one another, in order to get them "
      + "used to working with real-world images and the challenges that these present. The "
      + "students are then asked to choose an individual topic for each of their small-group, "
      + "final projects. (Sometimes these projects even turn into conference papers!) The "
      + "exercises at the end of each chapter contain numerous suggestions for smaller mid-term "
      + "projects, as well as more open-ended problems whose solutions are still active research "
      + "topics. Wherever possible, I encourage students to try their algorithms on their own "
      + "personal photographs, since this better motivates them, often leads to creative "
      + "variants on the problems, and better acquaints them with the variety and complexity of "
      + "real-world imagery. In formulating and solving computer vision problems, I have often "
      + "found it useful to draw inspiration from three high-level approaches:";

  @Test
  void readsASmallPrintPageStraightAndTurned() throws HostException {
    List<String> truth = LineMatch.words(SAMPLE_PAGE);
    for (String page : List.of("imageTextN.png", "imageTextR.png")) {
      Mat bgr = Imgcodecs.imread("/usr/share/doc/opencv-doc/examples/data/" + page);
      assertTrue(!bgr.empty(), page + " missing: scripts/setup.sh installs opencv-doc");
      Mat rgb = new Mat();
      Imgproc.cvtColor(bgr, rgb, Imgproc.COLOR_BGR2RGB);
      List<RecognizedLine> lines = reader.read(rgb);
      List<String> read = new ArrayList<>();
      for (RecognizedLine line : lines) {
        read.addAll(LineMatch.words(line.text.replaceAll("[,.:;!?()]", " ")));
      }
      int found = 0;
      for (String w : truth) {
        found += read.remove(w) ? 1 : 0;
      }
      assertTrue(found >= 0.95 * truth.size(), page + ": " + found + " of " + truth.size());
      bgr.release();
      rgb.release();
    }
  }

  @Test
  void accentedLettersAreReadByTesseractOnTheDetectedLines() throws HostException {
    Mat rgb = TextPictures.lines(
        1000, 340, "Atención: suelo mojado", "Salida de emergencia", "Señal de tráfico");
    try (PhotoReader spanish = new PhotoReader("spa")) {
      assertEquals(PhotoReader.TESSERACT, spanish.recogniser());
      List<RecognizedLine> lines = spanish.read(rgb);
      assertEquals(3, lines.size(), lines.toString());
      assertTrue(lines.get(0).text.startsWith("Atención: suelo"), lines.toString());
      assertEquals("Salida de emergencia", lines.get(1).text);
      assertEquals("Señal de tráfico", lines.get(2).text);
      for (RecognizedLine line : lines) {
        assertEquals(PhotoReader.TESSERACT, line.reader);
      }
      // Upside down as well: the detector's direction reaches the crops.
      Mat turned = TextPictures.upsideDown(rgb);
      List<RecognizedLine> back = spanish.read(turned);
      assertEquals(3, back.size(), back.toString());
      assertEquals("Señal de tráfico", back.get(0).text);
      assertTrue(back.get(2).text.startsWith("Atención: suelo"), back.toString());
      turned.release();
    }
    // The English recogniser has no accents: what it reads drops them.
    assertTrue(!reader.read(rgb).get(0).text.contains("ó"));
    rgb.release();
  }

  @Test
  void chineseIsReadByTheChineseRecogniser() throws Exception {
    Font cjk = Font.createFont(
        Font.TRUETYPE_FONT, new File("/usr/share/fonts/truetype/wqy/wqy-microhei.ttc"));
    Mat rgb = TextPictures.lines(cjk, 800, 260, "紧急出口", "请勿吸烟");
    try (PhotoReader chinese = new PhotoReader("chi_sim")) {
      assertEquals(PhotoReader.CHINESE, chinese.recogniser());
      List<RecognizedLine> lines = chinese.read(rgb);
      assertEquals(List.of("紧急出口", "请勿吸烟"), lines.stream().map(l -> l.text).toList());
      assertEquals(PhotoReader.CHINESE, lines.get(0).reader);
    }
    // The English recogniser has no Chinese characters.
    for (RecognizedLine line : reader.read(rgb)) {
      assertTrue(line.text.codePoints().allMatch(c -> c < 0x80), line.toString());
    }
    rgb.release();
  }

  @Test
  void lightLettersOnADarkGroundAreTurnedDarkOnLightForTesseract() {
    Mat rgb = TextPictures.lines(400, 120, "Exit");
    Mat dark = new Mat();
    Core.bitwise_not(rgb, dark);
    Mat crop = PhotoReader.darkOnLight(dark);
    // The ground (the crop's margin) is white again, the letters dark.
    assertEquals(255, crop.get(0, 0)[0], 1);
    assertEquals(0, Core.minMaxLoc(crop).minVal, 80);
    assertEquals(rgb.rows() + 2 * PhotoReader.CROP_MARGIN, crop.rows());
    Mat same = PhotoReader.darkOnLight(rgb.clone());
    assertEquals(255, same.get(0, 0)[0], 1);
    rgb.release();
    crop.release();
    same.release();
  }

  @Test
  void symbolsAloneAreNotText() {
    assertTrue(PhotoReader.looksLikeText("Exit"));
    assertTrue(PhotoReader.looksLikeText("RM13.58"));
    assertTrue(PhotoReader.looksLikeText("出口"));
    assertTrue(!PhotoReader.looksLikeText("|"));
    assertTrue(!PhotoReader.looksLikeText("a"));
    assertTrue(!PhotoReader.looksLikeText("-:|-"));
    assertTrue(!PhotoReader.looksLikeText("x--|"));
    // Unsure readings are dropped however word-like they look.
    assertTrue(PhotoReader.worthTranslating("Exit", 0.8));
    assertTrue(!PhotoReader.worthTranslating("Exit", 0.79));
    assertTrue(!PhotoReader.worthTranslating("|", 0.99));
  }

  @Test
  void readsAPageHeldUpsideDownOrSideways() throws HostException {
    for (double turn : new double[] {180, 90}) {
      Scene page = Scenes.page(turn);
      List<LineMatch> matches = LineMatch.match(page.lines, reader.read(page.rgb));
      int words = 0;
      int found = 0;
      for (LineMatch m : matches) {
        words += m.truthWords();
        found += m.wordsFound();
        if (m.read != null) {
          assertTrue(m.angleError() <= 2, "reading direction off: " + m);
          assertTrue(m.centreError() <= 5, "centre error " + m.centreError() + ": " + m);
        }
      }
      // The direction classifier leaves a line or two of the upside-down page unread.
      assertTrue(found >= 0.75 * words, found + " of " + words + " words, page turned " + turn);
      page.release();
    }
  }

  @Test
  void findsNoTextInBackdropsAlone() throws HostException {
    for (Backdrop b : Backdrop.values()) {
      Scene empty = new SignScene(Scenes.WIDTH, Scenes.HEIGHT, b, 77).render(b.name());
      assertEquals(List.of(), reader.read(empty.rgb), b.name());
      empty.release();
    }
  }

  @Test
  void missingProgramOrLanguageNamesTheDebianPackage() {
    HostException noData = assertThrows(HostException.class, () -> new PhotoReader("zzz"));
    assertEquals(ExitStatus.MISSING_OCR_DATA, noData.status);
    assertEquals("no OCR data for language 'zzz': install the Debian package tesseract-ocr-zzz",
        noData.getMessage());
    assertEquals("tesseract-ocr-chi-sim", PhotoReader.debianPackage("chi_sim"));

    HostException noProgram = assertThrows(
        HostException.class, () -> new PhotoReader("spa", null, "/nonexistent/tesseract", 5000));
    assertEquals(ExitStatus.MISSING_OCR_DATA, noProgram.status);
    assertTrue(noProgram.getMessage().endsWith("install the Debian package tesseract-ocr"),
        noProgram.getMessage());
  }

  @Test
  void aHangingOcrProgramIsStoppedAndBadPicturesRefused(@TempDir Path dir)
      throws IOException, HostException {
    Path fake = dir.resolve("tesseract");
    Files.writeString(fake,
        "#!/bin/sh\nif [ \"$1\" = --list-langs ]; then echo spa; exit 0; fi\nexec sleep 60\n");
    assertTrue(fake.toFile().setExecutable(true));
    PhotoReader hanging = new PhotoReader("spa", null, fake.toString(), 1000);
    Scene street = Scenes.bundled("street");
    long start = System.nanoTime();
    HostException timeout = assertThrows(HostException.class, () -> hanging.read(street.rgb));
    assertEquals(ExitStatus.CHILD_FAILED, timeout.status);
    assertEquals("the OCR program '" + fake + "' did not finish within 1000 ms and was stopped",
        timeout.getMessage());
    assertTrue(System.nanoTime() - start < 20e9, "the reader waited for the hanging program");
    street.release();

    HostException grey =
        assertThrows(HostException.class, () -> reader.read(Mat.zeros(100, 100, CvType.CV_8UC1)));
    assertEquals(ExitStatus.INTERNAL, grey.status);
    assertThrows(HostException.class, () -> reader.read(new Mat()));
  }
}
