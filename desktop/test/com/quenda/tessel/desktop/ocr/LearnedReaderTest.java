package com.quenda.tessel.desktop.ocr;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertThrows;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import java.io.IOException;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.List;
import java.util.stream.Stream;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;

/**
 * The bridge to the learned reader in a real JVM with the real models: what it gives back, and
 * that every misuse ends in a Java exception with a message instead of a crash.
 */
class LearnedReaderTest {
  private static Path models;

  @BeforeAll
  static void setUp() throws HostException {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    models = LearnedReader.modelDir();
  }

  @Test
  void readsALineWithItsRectangleAndConfidence() throws HostException {
    Mat rgb = TextPictures.lines(900, 200, "Tickets are sold at the counter");
    try (LearnedReader reader = new LearnedReader(models, LearnedReader.Script.LATIN, 960, true)) {
      List<LearnedReader.Line> lines = reader.read(rgb);
      assertEquals(1, lines.size(), lines.toString());
      LearnedReader.Line line = lines.get(0);
      assertEquals("Tickets are sold at the counter", line.text());
      assertTrue(line.confidence() > 0.8 && line.confidence() <= 1, line.toString());
      // The text spans x 60..about 660, its letters y 60..100.
      assertEquals(0, line.rect().angle, 2);
      assertEquals(80, line.rect().center.y, 6);
      assertTrue(line.rect().size.width > 560 && line.rect().size.width < 680, line.toString());

      // Only detecting: the same line, no text.
      try (LearnedReader detector =
               new LearnedReader(models, LearnedReader.Script.LATIN, 960, false)) {
        List<LearnedReader.Line> found = detector.read(rgb);
        assertEquals(1, found.size());
        assertEquals("", found.get(0).text());
        assertEquals(line.rect().center.x, found.get(0).rect().center.x, 1);
      }
    }
    rgb.release();
  }

  @Test
  void anUprightCropOfAnUpsideDownLineStandsTheRightWayUp() throws HostException {
    Mat rgb = TextPictures.lines(900, 200, "Tickets are sold at the counter");
    Mat turned = TextPictures.upsideDown(rgb);
    try (LearnedReader reader = new LearnedReader(models, LearnedReader.Script.LATIN, 960, true)) {
      LearnedReader.Line line = reader.read(turned).get(0);
      assertEquals("Tickets are sold at the counter", line.text());
      assertEquals(180, Math.abs(line.rect().angle), 3, line.toString());
      Mat crop = LearnedReader.uprightCrop(turned, line.rect(), 48);
      assertEquals(48, crop.rows());
      assertTrue(crop.cols() > 10 * 48, "aspect kept: " + crop);
      // Upright, the line's first letter ("T") is at the left: more ink in the left tenth than
      // in the right tenth, where the last letters are short.
      Mat grey = new Mat();
      org.opencv.imgproc.Imgproc.cvtColor(crop, grey, org.opencv.imgproc.Imgproc.COLOR_RGB2GRAY);
      int tenth = crop.cols() / 10;
      assertTrue(ink(grey.colRange(0, tenth)) > 0
              && ink(grey.colRange(0, tenth))
                  > 0.5 * ink(grey.colRange(crop.cols() - tenth, crop.cols())),
          "crop turned the wrong way");
      crop.release();
      grey.release();
    }
    rgb.release();
    turned.release();
  }

  private static double ink(Mat greyStrip) {
    return 255 * greyStrip.total() - Core.sumElems(greyStrip).val[0];
  }

  @Test
  void misuseEndsInJavaExceptionsWithMessages() throws HostException {
    LearnedReader reader = new LearnedReader(models, LearnedReader.Script.LATIN, 960, true);
    IllegalArgumentException noImage =
        assertThrows(IllegalArgumentException.class, () -> LearnedReader.read(1, 0));
    // A handle is checked before the image: the non-zero handle above is never used.
    assertEquals("the text reader is closed",
        assertThrows(IllegalStateException.class, () -> LearnedReader.read(0, 0)).getMessage());
    assertEquals("no image: the Mat's native address is 0", noImage.getMessage());

    Mat grey = new Mat(100, 100, CvType.CV_8UC1, new Scalar(200));
    Mat deep = new Mat(100, 100, CvType.CV_16UC3, new Scalar(200, 200, 200));
    for (Mat bad : List.of(new Mat(), grey, deep)) {
      IllegalArgumentException e =
          assertThrows(IllegalArgumentException.class, () -> reader.read(bad), bad.toString());
      assertTrue(!e.getMessage().isEmpty(), bad.toString());
    }
    assertThrows(IllegalArgumentException.class,
        () -> LearnedReader.uprightCrop(0, new double[] {1, 2, 3, 4, 5}, 48, new Mat().nativeObj));
    assertEquals("a line's rectangle is 5 numbers: cx, cy, w, h, angle",
        assertThrows(IllegalArgumentException.class,
            ()
                -> LearnedReader.uprightCrop(
                    grey.nativeObj, new double[] {1, 2}, 48, new Mat().nativeObj))
            .getMessage());

    // Tiny pictures are no text, not a failure.
    Mat dot = new Mat(1, 1, CvType.CV_8UC3, new Scalar(0, 0, 0));
    assertEquals(List.of(), reader.read(dot));

    reader.close();
    reader.close(); // twice is harmless
    assertEquals("the text reader is closed",
        assertThrows(IllegalStateException.class, () -> reader.read(dot)).getMessage());
    grey.release();
    deep.release();
    dot.release();
  }

  @Test
  void aMissingOrBrokenModelNamesTheFileAndTheSetup(@TempDir Path dir) throws IOException {
    Path none = dir.resolve("none");
    HostException missing = assertThrows(
        HostException.class, () -> new LearnedReader(none, LearnedReader.Script.LATIN, 960, true));
    assertEquals(ExitStatus.MISSING_OCR_DATA, missing.status);
    assertTrue(missing.getMessage().startsWith("the text reader cannot load its models: "),
        missing.getMessage());
    assertTrue(missing.getMessage().contains(none.toString()), missing.getMessage());
    assertTrue(missing.getMessage().endsWith(" (run scripts/setup.sh to install them)"),
        missing.getMessage());

    // The models copied, each overwritten with text: the first one loaded is named.
    Path broken = Files.createDirectory(dir.resolve("broken"));
    try (Stream<Path> files = Files.list(models)) {
      for (Path f : files.toList()) {
        Path copy = Files.copy(f, broken.resolve(f.getFileName()));
        if (f.getFileName().toString().endsWith(".onnx")) {
          Files.writeString(copy, "not a model\n");
        }
      }
    }
    HostException corrupt = assertThrows(HostException.class,
        () -> new LearnedReader(broken, LearnedReader.Script.LATIN, 960, true));
    assertEquals(ExitStatus.MISSING_OCR_DATA, corrupt.status);
    assertTrue(
        corrupt.getMessage().matches(".*" + broken + "/[^ ]+\\.onnx.*"), corrupt.getMessage());
  }

  @Test
  void optionsOutOfRangeAreRefused() {
    assertThrows(IllegalArgumentException.class,
        () -> new LearnedReader(models, LearnedReader.Script.LATIN, 0, true));
    IllegalArgumentException scene = assertThrows(IllegalArgumentException.class,
        () -> new LearnedReader(models, LearnedReader.Script.LATIN, 960, 5, true, 1));
    assertTrue(scene.getMessage().contains("scene_long_side"), scene.getMessage());
    // And a rectangle somewhere off the picture crops to something, not a crash.
    Mat rgb = new Mat(50, 50, CvType.CV_8UC3, new Scalar(255, 255, 255));
    Mat crop = LearnedReader.uprightCrop(
        rgb, new RotatedRect(new Point(500, 500), new Size(40, 10), 30), 48);
    assertEquals(48, crop.rows());
    crop.release();
    rgb.release();
  }
}
