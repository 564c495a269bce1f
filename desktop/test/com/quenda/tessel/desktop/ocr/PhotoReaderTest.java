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
