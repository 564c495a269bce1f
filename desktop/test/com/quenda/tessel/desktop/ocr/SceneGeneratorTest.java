package com.quenda.tessel.desktop.ocr;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertThrows;

import com.quenda.tessel.desktop.scenes.Scene;
import com.quenda.tessel.desktop.scenes.SceneLine;
import com.quenda.tessel.desktop.scenes.Scenes;
import java.io.IOException;
import java.nio.file.Path;
import java.util.List;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.imgcodecs.Imgcodecs;
import org.opencv.imgproc.Imgproc;

/** The demo's input pictures: the same on every run and written as the PNGs the demo reads. */
class SceneGeneratorTest {
  @BeforeAll
  static void loadOpenCv() {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
  }

  @Test
  void bundledScenesAreReproducibleAndWrittenAsRgbPngs(@TempDir Path dir) throws IOException {
    assertEquals(List.of("street", "station", "shop", "page"), Scenes.names());
    Scene first = Scenes.bundled("street");
    Scene again = Scenes.bundled("street");
    assertEquals(0, Core.norm(first.rgb, again.rgb, Core.NORM_INF));
    assertEquals(List.of("Emergency exit", "No parking", "Tickets sold here", "Fresh coffee"),
        first.lines.stream().map((SceneLine l) -> l.text).toList());

    Path png = dir.resolve("street.png");
    first.writePng(png);
    Mat back = Imgcodecs.imread(png.toString());
    Imgproc.cvtColor(back, back, Imgproc.COLOR_BGR2RGB);
    assertEquals(0, Core.norm(first.rgb, back, Core.NORM_INF));

    IllegalArgumentException unknown =
        assertThrows(IllegalArgumentException.class, () -> Scenes.bundled("harbour"));
    assertEquals("no bundled scene 'harbour'; there are [street, station, shop, page]",
        unknown.getMessage());
  }
}
