package com.quenda.tessel.desktop.ocr;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertNotNull;
import static org.junit.jupiter.api.Assertions.assertThrows;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.scenes.Backdrop;
import com.quenda.tessel.desktop.scenes.Fonts;
import com.quenda.tessel.desktop.scenes.Scene;
import com.quenda.tessel.desktop.scenes.Scenes;
import com.quenda.tessel.desktop.scenes.SignScene;
import java.awt.Color;
import java.awt.Graphics2D;
import java.awt.RenderingHints;
import java.awt.image.BufferedImage;
import java.awt.image.DataBufferByte;
import java.io.IOException;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.List;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
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
          assertTrue(m.centreError() <= 3, "centre error " + m.centreError() + ": " + m);
          assertTrue(m.angleError() <= 2, "angle error " + m.angleError() + ": " + m);
        }
      }
      assertEquals(scene.lines.size(), lines.size(), "lines read in " + scene.name + ": " + lines);
      scene.release();
    }
    assertTrue(found >= 0.9 * words, found + " of " + words + " words found");
  }

  @Test
  void keepsALineWithWideWordSpacesBetweenShortLettersWhole() throws HostException {
    // Sharp, as a screenshot: between "the" and "counter" the space is wider than 0.9 of the
    // x-height, which used to cut the line in two.
    BufferedImage picture = new BufferedImage(900, 200, BufferedImage.TYPE_3BYTE_BGR);
    Graphics2D g = picture.createGraphics();
    g.setColor(Color.WHITE);
    g.fillRect(0, 0, 900, 200);
    g.setColor(Color.DARK_GRAY);
    g.setRenderingHint(
        RenderingHints.KEY_TEXT_ANTIALIASING, RenderingHints.VALUE_TEXT_ANTIALIAS_ON);
    g.setFont(Fonts.SANS.deriveFont(40f));
    g.drawString("Tickets are sold at the counter", 60, 110);
    g.dispose();
    Mat rgb = new Mat(200, 900, CvType.CV_8UC3);
    rgb.put(0, 0, ((DataBufferByte) picture.getRaster().getDataBuffer()).getData());
    Imgproc.cvtColor(rgb, rgb, Imgproc.COLOR_BGR2RGB);
    List<RecognizedLine> lines = reader.read(rgb);
    assertEquals(1, lines.size(), "lines: " + lines);
    assertEquals("Tickets are sold at the counter", lines.get(0).text);
    rgb.release();
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
        assertNotNull(m.read, "line not found on the page turned by " + turn + ": " + m);
        assertTrue(m.angleError() <= 2, "reading direction off: " + m);
        assertTrue(m.centreError() <= 3, "centre error " + m.centreError() + ": " + m);
      }
      assertTrue(found >= 0.9 * words, found + " of " + words + " words, page turned " + turn);
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
        HostException.class, () -> new PhotoReader("eng", "/nonexistent/tesseract", 5000));
    assertEquals(ExitStatus.MISSING_OCR_DATA, noProgram.status);
    assertTrue(noProgram.getMessage().endsWith("install the Debian package tesseract-ocr"),
        noProgram.getMessage());
  }

  @Test
  void aHangingOcrProgramIsStoppedAndBadPicturesRefused(@TempDir Path dir)
      throws IOException, HostException {
    Path fake = dir.resolve("tesseract");
    Files.writeString(fake,
        "#!/bin/sh\nif [ \"$1\" = --list-langs ]; then echo eng; exit 0; fi\nexec sleep 60\n");
    assertTrue(fake.toFile().setExecutable(true));
    PhotoReader hanging = new PhotoReader("eng", fake.toString(), 1000);
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
