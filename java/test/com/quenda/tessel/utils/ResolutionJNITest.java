package com.quenda.tessel.utils;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.testing.NativeLog;
import com.quenda.tessel.testing.OpenCvHost;
import java.lang.ref.Reference;
import java.util.List;
import java.util.Random;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

class ResolutionJNITest {
  private final NativeLog log = new NativeLog();

  @BeforeAll
  static void loadOpenCv() {
    OpenCvHost.load();
  }

  /** A camera-like 1280 x 720 RGBA frame: overlapping discs of random colour with sharp edges. */
  private static Mat texturedFrame(long seed) {
    Random random = new Random(seed);
    Mat frame = new Mat(720, 1280, CvType.CV_8UC4, new Scalar(128, 128, 128, 255));
    for (int i = 0; i < 1280 * 720 / 30; ++i) {
      // Radii distributed as r^-3 between 2 and 90 px, like the edges of a natural scene.
      double radius = 1.0 / Math.sqrt(0.25 - random.nextDouble() * (0.25 - 1.0 / (90.0 * 90.0)));
      Scalar colour =
          new Scalar(random.nextInt(256), random.nextInt(256), random.nextInt(256), 255);
      Point centre = new Point(random.nextInt(1280), random.nextInt(720));
      Imgproc.circle(
          frame, centre, (int) Math.round(radius), colour, Imgproc.FILLED, Imgproc.LINE_8);
    }
    return frame;
  }

  private static double estimate(Mat frame) {
    double estimate = ResolutionJNI.ImgResEstimate(frame.getNativeObjAddr());
    // The engine reads the matrix by address only: it must outlive the call.
    Reference.reachabilityFence(frame);
    return estimate;
  }

  @Test
  void rgbaAndRgbFramesAreMeasured() {
    Mat sharp = texturedFrame(1);
    assertTrue(estimate(sharp) >= 0.95, "sharp frame read " + estimate(sharp));
    Mat rgba = new Mat();
    Mat rgb = new Mat();
    Imgproc.GaussianBlur(sharp, rgba, new Size(0, 0), 2.0);
    Imgproc.cvtColor(rgba, rgb, Imgproc.COLOR_RGBA2RGB);
    double blurred = estimate(rgba);
    assertTrue(blurred > 0.0 && blurred < 0.4, "blurred frame read " + blurred);
    assertEquals(blurred, estimate(rgb), 0.0);
    Mat blank = new Mat(720, 1280, CvType.CV_8UC4, new Scalar(40, 80, 160, 255));
    assertEquals(ResolutionJNI.NO_DETAIL, estimate(blank));
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
    Mat empty = new Mat();
    Mat small = new Mat(60, 80, CvType.CV_8UC4, new Scalar(1, 2, 3, 4));
    Mat wide = new Mat(720, 1280, CvType.CV_16UC4, new Scalar(1, 2, 3, 4));
    assertNotMeasured(empty.getNativeObjAddr(), "ImgResEstimate: empty image");
    assertNotMeasured(small.getNativeObjAddr(),
        "ImgResEstimate: image 80x60 is too small (needs at least 96 pixels on each side)");
    assertNotMeasured(wide.getNativeObjAddr(),
        "ImgResEstimate: unsupported image type CV_16UC4 (need 8-bit RGBA, RGB or grey)");
    for (Mat mat : new Mat[] {empty, small, wide}) {
      Reference.reachabilityFence(mat);
    }
  }
}
