package com.quenda.tessel.desktop.typeset;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.scenes.Scene;
import com.quenda.tessel.desktop.scenes.SceneLine;
import com.quenda.tessel.desktop.scenes.Scenes;
import java.util.List;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.opencv.core.Core;
import org.opencv.core.Mat;

/** Serif or sans, bold or regular, read from printed lines. */
class FaceDetectorTest {
  private static final String TEXT = "Tickets are sold at the main entrance";

  @BeforeAll
  static void loadOpenCv() {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
  }

  @Test
  void facesAreToldApartAtSmallAndLargeSizes() throws Exception {
    for (float size : new float[] {16, 22, 34, 60}) {
      assertEquals(Face.SERIF, detect(PrintedPage.NOTO + "NotoSerif-Regular.ttf", size));
      assertEquals(Face.SERIF, detect(PrintedPage.DEJAVU + "DejaVuSerif.ttf", size));
      assertEquals(Face.SERIF_BOLD, detect(PrintedPage.NOTO + "NotoSerif-Bold.ttf", size));
      assertEquals(Face.SANS, detect(PrintedPage.NOTO + "NotoSans-Regular.ttf", size));
      assertEquals(Face.SANS, detect(PrintedPage.DEJAVU + "DejaVuSans.ttf", size));
      assertEquals(Face.SANS_BOLD, detect(PrintedPage.NOTO + "NotoSans-Bold.ttf", size));
      assertEquals(Face.SANS_BOLD, detect(PrintedPage.DEJAVU + "DejaVuSans-Bold.ttf", size));
      assertEquals(Face.SERIF_BOLD, detect(PrintedPage.DEJAVU + "DejaVuSerif-Bold.ttf", size));
    }
  }

  @Test
  void theMeasuresSeparateTheFacesWithRoomToSpare() throws Exception {
    for (float size : new float[] {16, 30}) {
      FaceDetector.Strokes serif = measure(PrintedPage.NOTO + "NotoSerif-Regular.ttf", size);
      FaceDetector.Strokes serifBold = measure(PrintedPage.NOTO + "NotoSerif-Bold.ttf", size);
      FaceDetector.Strokes sans = measure(PrintedPage.NOTO + "NotoSans-Regular.ttf", size);
      FaceDetector.Strokes sansBold = measure(PrintedPage.NOTO + "NotoSans-Bold.ttf", size);
      for (FaceDetector.Strokes s : List.of(serif, serifBold)) {
        assertTrue(s.serifReach() > 2 * FaceDetector.SERIF_REACH, size + ": " + s);
      }
      for (FaceDetector.Strokes s : List.of(sans, sansBold)) {
        assertTrue(s.serifReach() < FaceDetector.SERIF_REACH / 2, size + ": " + s);
      }
      for (FaceDetector.Strokes s : List.of(serifBold, sansBold)) {
        assertTrue(s.stem() > 1.08 * FaceDetector.BOLD_STEM, size + ": " + s);
      }
      for (FaceDetector.Strokes s : List.of(serif, sans)) {
        assertTrue(s.stem() < FaceDetector.BOLD_STEM / 1.08, size + ": " + s);
      }
    }
  }

  @Test
  void photographedSignsAndPagesAreToldApart() {
    // Signs in a bold sans with tails on "t", "u" and "a", tilted and blurred; a serif page.
    for (String name : List.of("street", "station", "shop", "page")) {
      Scene scene = Scenes.bundled(name);
      Face expected = name.equals("page") ? Face.SERIF : Face.SANS_BOLD;
      for (SceneLine line : scene.lines) {
        assertEquals(expected, FaceDetector.detect(scene.rgb, List.of(line.rect)), line.text);
      }
      scene.release();
    }
  }

  @Test
  void linesTooSmallToTellOrWithoutInkReadAsSans() throws Exception {
    assertEquals(Face.SANS, detect(PrintedPage.NOTO + "NotoSerif-Regular.ttf", 7));
    PrintedPage blank = new PrintedPage(400, 100);
    Mat rgb = blank.rgb();
    assertEquals(Face.SANS,
        FaceDetector.detect(rgb,
            List.of(new org.opencv.core.RotatedRect(
                new org.opencv.core.Point(200, 50), new org.opencv.core.Size(300, 30), 0))));
  }

  private static Face detect(String font, float size) throws Exception {
    PrintedPage page = new PrintedPage(1400, 200);
    page.line(PrintedPage.font(font, size), Align.LEFT, 40, 120, TEXT);
    return FaceDetector.detect(page.rgb(), List.of(page.lines.get(0).rect));
  }

  private static FaceDetector.Strokes measure(String font, float size) throws Exception {
    PrintedPage page = new PrintedPage(1400, 200);
    page.line(PrintedPage.font(font, size), Align.LEFT, 40, 120, TEXT);
    return FaceDetector.measure(page.rgb(), page.lines.get(0).rect);
  }
}
