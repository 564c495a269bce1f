package com.quenda.tessel.utils;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.testing.NativeLog;
import com.quenda.tessel.testing.OpenCvHost;
import java.util.List;
import java.util.Random;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.BeforeEach;
import org.junit.jupiter.api.Test;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

class ResolutionJNITest {
  private NativeLog log;

  @BeforeAll
  static void loadOpenCv() {
    OpenCvHost.load();
  }

  @BeforeEach
  void markLog() {
    log = new NativeLog();
  }

  /** A camera-like RGBA frame: overlapping discs of random colour with sharp edges. */
  private static Mat texturedFrame(int width, int height, long seed) {
    Random random = new Random(seed);
    Mat frame = new Mat(height, width, CvType.CV_8UC4, new Scalar(128, 128, 128, 255));
    for (int i = 0; i < width * height / 30; ++i) {
      // Radii distributed as r^-3 between 2 and 90 px, like the edges of a natural scene.
      double u = random.nextDouble();
      double radius = 1.0 / Math.sqrt(0.25 - u * (0.25 - 1.0 / (90.0 * 90.0)));
      Scalar colour =
          new Scalar(random.nextInt(256), random.nextInt(256), random.nextInt(256), 255);
      Point centre = new Point(random.nextInt(width), random.nextInt(height));
      Imgproc.circle(
          frame, centre, (int) Math.round(radius), colour, Imgproc.FILLED, Imgproc.LINE_8);
    }
    return frame;
  }

  private static Mat enlargedTwice(Mat frame) {
    Mat small = new Mat();
    Mat large = new Mat();
    Imgproc.resize(frame, small, new Size(), 0.5, 0.5, Imgproc.INTER_AREA);
    Imgproc.resize(small, large, frame.size(), 0, 0, Imgproc.INTER_CUBIC);
    return large;
  }

  private static Mat toRgb(Mat rgba) {
    Mat rgb = new Mat();
    Imgproc.cvtColor(rgba, rgb, Imgproc.COLOR_RGBA2RGB);
    return rgb;
  }

  @Test
  void sharpRgbaFrameReadsFullResolutionAndEnlargedOneHalf() {
    Mat sharp = texturedFrame(1280, 720, 1);
    double full = ResolutionJNI.ImgResEstimate(sharp.getNativeObjAddr());
    double half = ResolutionJNI.ImgResEstimate(enlargedTwice(sharp).getNativeObjAddr());
    assertTrue(full >= 0.95, "sharp frame read " + full);
    assertEquals(0.5, half, 0.125, "frame enlarged twice");
    assertTrue(log.messages('E').isEmpty(), log.lines().toString());
  }

  @Test
  void rgbFrameReadsLikeItsRgbaFrame() {
    Mat rgba = new Mat();
    Imgproc.GaussianBlur(texturedFrame(1280, 720, 2), rgba, new Size(0, 0), 2.0);
    double fromRgba = ResolutionJNI.ImgResEstimate(rgba.getNativeObjAddr());
    double fromRgb = ResolutionJNI.ImgResEstimate(toRgb(rgba).getNativeObjAddr());
    assertEquals(fromRgba, fromRgb, 0.0);
    assertTrue(fromRgba > 0.0 && fromRgba < 0.4, "blurred frame read " + fromRgba);
  }

  @Test
  void blankFrameHoldsNoDetail() {
    Mat blank = new Mat(720, 1280, CvType.CV_8UC4, new Scalar(40, 80, 160, 255));
    assertEquals(ResolutionJNI.NO_DETAIL, ResolutionJNI.ImgResEstimate(blank.getNativeObjAddr()));
    assertTrue(log.messages('E').isEmpty(), log.lines().toString());
  }

  private void assertNotMeasured(long address, String message) {
    log.mark();
    assertEquals(ResolutionJNI.NOT_MEASURED, ResolutionJNI.ImgResEstimate(address), message);
    assertEquals(List.of(message), log.messages('E'));
  }

  @Test
  void badInputIsNotMeasuredAndLogged() {
    assertNotMeasured(0L, "ImgResEstimate: null image address");
    assertNotMeasured(new Mat().getNativeObjAddr(), "ImgResEstimate: empty image");
    assertNotMeasured(new Mat(60, 80, CvType.CV_8UC4, new Scalar(1, 2, 3, 4)).getNativeObjAddr(),
        "ImgResEstimate: image 80x60 is too small (needs at least 96 pixels on each side)");
    assertNotMeasured(
        new Mat(720, 1280, CvType.CV_16UC4, new Scalar(1, 2, 3, 4)).getNativeObjAddr(),
        "ImgResEstimate: unsupported image type CV_16UC4 (need 8-bit RGBA, RGB or grey)");
  }
}
