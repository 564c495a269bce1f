package com.quenda.tessel.desktop.video;

import static org.junit.jupiter.api.Assertions.assertArrayEquals;
import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertNull;
import static org.junit.jupiter.api.Assertions.assertThrows;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.OutputFiles;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.List;
import javax.imageio.ImageIO;
import javax.imageio.ImageReader;
import javax.imageio.stream.ImageInputStream;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Scalar;
import org.opencv.imgcodecs.Imgcodecs;
import org.opencv.videoio.VideoCapture;

/** Frames in (numbered images, in order, of one size) and out (the video and its preview). */
class FrameSourcesAndSinkTest {
  @TempDir Path dir;

  @BeforeAll
  static void loadOpenCv() {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
  }

  /** A 64 x 48 frame of one colour, given as R, G, B. */
  static Mat plain(double r, double g, double b) {
    return new Mat(48, 64, CvType.CV_8UC3, new Scalar(r, g, b));
  }

  static void writeBgr(Path file, Mat rgb) {
    Mat bgr = new Mat();
    org.opencv.imgproc.Imgproc.cvtColor(rgb, bgr, org.opencv.imgproc.Imgproc.COLOR_RGB2BGR);
    Imgcodecs.imwrite(file.toString(), bgr);
  }

  static double[] rgbOf(Mat frame) {
    double[] mean = Core.mean(frame).val;
    return new double[] {mean[0], mean[1], mean[2]};
  }

  @Test
  void aFolderPlaysItsImagesInNumberOrderAsRgbAt30PerSecond() throws Exception {
    Path folder = Files.createDirectories(dir.resolve("clip"));
    // Written out of order; frame10 sorts after frame2 by number, not by name.
    writeBgr(folder.resolve("frame10.png"), plain(0, 0, 200));
    writeBgr(folder.resolve("frame2.png"), plain(0, 200, 0));
    writeBgr(folder.resolve("frame1.png"), plain(200, 0, 0));
    Files.writeString(folder.resolve("notes.txt"), "not a frame");
    try (FrameSource source = FrameSources.open(folder)) {
      assertEquals("clip", source.name());
      assertEquals(30, source.fps());
      assertEquals(3, source.frameCountHint());
      assertArrayEquals(new double[] {200, 0, 0}, rgbOf(source.next()), 0);
      assertArrayEquals(new double[] {0, 200, 0}, rgbOf(source.next()), 0);
      assertArrayEquals(new double[] {0, 0, 200}, rgbOf(source.next()), 0);
      assertNull(source.next());
    }
  }

  static void assertRefused(Path input, ExitStatus status, String message) {
    HostException refused = assertThrows(HostException.class, () -> {
      try (FrameSource source = FrameSources.open(input)) {
        while (source.next() != null) {
          // read to the end
        }
      }
    });
    assertEquals(status, refused.status);
    assertEquals(input + ": " + message, refused.getMessage());
  }

  @Test
  void unusableSourcesAreRefusedWithTheirStatus() throws Exception {
    assertRefused(dir.resolve("none.mp4"), ExitStatus.NO_INPUT, "no such file or folder");
    assertRefused(
        Files.createFile(dir.resolve("empty.mp4")), ExitStatus.EMPTY_IMAGE, "the file is empty");
    assertRefused(Files.writeString(dir.resolve("text.mp4"), "no video"), ExitStatus.NOT_AN_IMAGE,
        "not a video OpenCV can read");
    assertRefused(Files.createDirectories(dir.resolve("bare")), ExitStatus.EMPTY_IMAGE,
        "no frames (no images in it)");
    Path broken = Files.createDirectories(dir.resolve("broken"));
    writeBgr(broken.resolve("a1.png"), plain(1, 2, 3));
    Files.writeString(broken.resolve("a2.png"), "not a png");
    HostException refused = assertThrows(HostException.class, () -> {
      try (FrameSource source = FrameSources.open(broken)) {
        source.next();
        source.next();
      }
    });
    assertEquals(ExitStatus.NOT_AN_IMAGE, refused.status);
    assertEquals(broken.resolve("a2.png") + ": not an image OpenCV can read", refused.getMessage());
  }

  @Test
  void theVideoHoldsTheFramesGivenAndThePreviewEveryThirdOfTheFirst120() throws Exception {
    Path out = dir.resolve("out");
    String codec;
    try (OutputFiles files = new OutputFiles(out);
         VideoSink sink = new VideoSink(files, "clip", 30, false)) {
      for (int k = 0; k < 150; k++) {
        // Grey levels that rise with the frame number, inside video range (16..235).
        sink.add(plain(40 + k, 40 + k, 40 + k));
      }
      sink.finish();
      codec = sink.videoName();
      files.commit();
    }
    VideoCapture capture = new VideoCapture(out.resolve(codec).toString());
    List<Double> levels = new ArrayList<>();
    for (Mat frame = new Mat(); capture.read(frame);) {
      levels.add(Core.mean(frame).val[0]);
    }
    capture.release();
    assertEquals(150, levels.size());
    // In order and each what was given, give or take the encoder's loss.
    for (int k = 0; k < 150; k += 10) {
      assertEquals(40 + k, levels.get(k), 6.0, "frame " + k + " of " + levels);
    }
    try (ImageInputStream gif =
             ImageIO.createImageInputStream(out.resolve("clip.preview.gif").toFile())) {
      ImageReader reader = ImageIO.getImageReadersByFormatName("gif").next();
      reader.setInput(gif);
      assertEquals(40, reader.getNumImages(true));
      assertEquals(VideoSink.PREVIEW_WIDTH, reader.getWidth(0));
      assertTrue(Files.size(out.resolve("clip.preview.gif")) > 0);
    }
  }
}
