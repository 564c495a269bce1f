package com.quenda.tessel.tracking;

import static org.junit.jupiter.api.Assertions.assertArrayEquals;
import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertNotEquals;
import static org.junit.jupiter.api.Assertions.assertNotNull;
import static org.junit.jupiter.api.Assertions.assertNull;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.testing.NativeLog;
import com.quenda.tessel.testing.OpenCvHost;
import java.util.ArrayList;
import java.util.List;
import org.junit.jupiter.api.AfterEach;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Rect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

class TrackingJNITest {
  private static final int WIDTH = 640;
  private static final int HEIGHT = 480;

  /** A wide region over texture: enough features to track the frame. */
  private static final double[] WIDE = {320, 160, 260, 50, 0};

  private final List<Mat> mats = new ArrayList<>();
  private final List<Long> handles = new ArrayList<>();

  @BeforeAll
  static void loadOpenCv() {
    OpenCvHost.load();
  }

  @AfterEach
  void releaseEverything() {
    for (long handle : handles) {
      TrackingJNI.releaseTracker(handle);
    }
    for (Mat mat : mats) {
      mat.release();
    }
  }

  private Mat keep(Mat mat) {
    mats.add(mat);
    return mat;
  }

  private long start(Mat frame, double[] rects) {
    long handle = TrackingJNI.initializeTracker(frame.getNativeObjAddr(), rects);
    assertNotEquals(0L, handle);
    handles.add(handle);
    return handle;
  }

  /** RGB frame of smoothed noise, with a flat grey band at the bottom. */
  private Mat texturedFrame(long seed) {
    Core.setRNGSeed((int) seed);
    Mat frame = keep(new Mat(HEIGHT, WIDTH, CvType.CV_8UC3));
    Core.randu(frame, 0, 256);
    Imgproc.GaussianBlur(frame, frame, new Size(0, 0), 1.5);
    Core.normalize(frame, frame, 0, 255, Core.NORM_MINMAX);
    frame.submat(new Rect(0, 400, WIDTH, 80)).setTo(new Scalar(128, 128, 128));
    return frame;
  }

  private Mat shifted(Mat frame, double dx, double dy) {
    Mat shift = keep(new Mat(2, 3, CvType.CV_64F));
    shift.put(0, 0, 1, 0, dx, 0, 1, dy);
    Mat moved = keep(new Mat());
    Imgproc.warpAffine(
        frame, moved, shift, frame.size(), Imgproc.INTER_LINEAR, Core.BORDER_REFLECT_101);
    return moved;
  }

  private static double[] concat(double[]... rects) {
    int length = 0;
    for (double[] r : rects) {
      length += r.length;
    }
    double[] all = new double[length];
    int at = 0;
    for (double[] r : rects) {
      System.arraycopy(r, 0, all, at, r.length);
      at += r.length;
    }
    return all;
  }

  private static void assertRectNear(double[] expected, double[] actual, int index, double tol) {
    for (int k = 0; k < 5; ++k) {
      assertEquals(expected[k], actual[5 * index + k], tol, "rectangle " + index + " value " + k);
    }
  }

  @Test
  void zeroHandlesAndAddressesMeanNoTracker() {
    Mat frame = texturedFrame(1);
    assertEquals(0L, TrackingJNI.initializeTracker(0, WIDE));
    long handle = start(frame, WIDE);
    assertNull(TrackingJNI.updateTracker(0, frame.getNativeObjAddr()));
    assertNull(TrackingJNI.updateTracker(handle, 0));
    assertEquals(0.0, TrackingJNI.getCoverageLeft(0), 0.0);
    assertEquals(0.0, TrackingJNI.getCoverageLeft(-1), 0.0);
    TrackingJNI.releaseTracker(0);
  }

  @Test
  void coverageIsZeroUntilTheFirstUpdate() {
    Mat frame = texturedFrame(2);
    long handle = start(frame, WIDE);
    assertEquals(0.0, TrackingJNI.getCoverageLeft(handle), 0.0);
    assertNotNull(TrackingJNI.updateTracker(handle, frame.getNativeObjAddr()));
    assertEquals(1.0, TrackingJNI.getCoverageLeft(handle), 1e-3);
  }

  @Test
  void trailingPartialRectangleIsIgnoredAndSizesAreTruncated() {
    Mat frame = texturedFrame(3);
    // Twelve values: two rectangles, the last two values ignored. The second
    // rectangle's 10.9 x 20.7 arrives as 10 x 20.
    double[] narrow = {300, 300, 10.9, 20.7, 0};
    long handle = start(frame, concat(WIDE, narrow, new double[] {999, 999}));
    double[] out = TrackingJNI.updateTracker(handle, frame.getNativeObjAddr());
    assertEquals(10, out.length);
    assertRectNear(WIDE, out, 0, 0.1);
    assertRectNear(new double[] {300, 300, 10.0, 20.0, 0}, out, 1, 0.1);
  }

  @Test
  void followsTheFrameContent() {
    Mat frame = texturedFrame(4);
    double[] tilted = {300, 300, 200, 40, 20};
    long handle = start(frame, concat(WIDE, tilted));
    double[] out = TrackingJNI.updateTracker(handle, shifted(frame, 8, -5).getNativeObjAddr());
    assertRectNear(new double[] {328, 155, 260, 50, 0}, out, 0, 0.3);
    assertRectNear(new double[] {308, 295, 200, 40, 20}, out, 1, 0.3);
  }

  @Test
  void failedUpdatesComeBackAsZeroRectangles() {
    Mat frame = texturedFrame(5);
    // Both regions on the flat band: no feature to track.
    double[] flat = concat(new double[] {200, 440, 100, 30, 0}, new double[] {450, 440, 80, 20, 5});
    long handle = start(frame, flat);
    NativeLog log = new NativeLog();
    for (int update = 0; update < 2; ++update) {
      double[] out = TrackingJNI.updateTracker(handle, frame.getNativeObjAddr());
      assertArrayEquals(new double[10], out);
    }
    assertTrue(log.messages('W').contains("OcrTracker::UpdateTracker Failure: Nothing to track"),
        String.join("\n", log.lines()));
  }

  @Test
  void trackerWithoutRectanglesAnswersWithEmptyArrays() {
    Mat frame = texturedFrame(6);
    NativeLog log = new NativeLog();
    long[] started = {
        start(frame, new double[0]), start(frame, new double[] {1, 2, 3, 4}), start(frame, null)};
    assertEquals(3,
        log.messages('W')
            .stream()
            .filter("OcrTrackerRotRect::StartTracker: Input array is empty" ::equals)
            .count());
    for (long handle : started) {
      double[] out = TrackingJNI.updateTracker(handle, frame.getNativeObjAddr());
      assertNotNull(out);
      assertEquals(0, out.length);
    }
  }

  @Test
  void handlesAreIndependent() {
    Mat frame = texturedFrame(7);
    long first = start(frame, WIDE);
    long second = start(frame, new double[] {300, 300, 200, 40, 10});
    TrackingJNI.updateTracker(first, shifted(frame, 4, 0).getNativeObjAddr());
    double[] out = TrackingJNI.updateTracker(second, shifted(frame, 0, 6).getNativeObjAddr());
    assertRectNear(new double[] {300, 306, 200, 40, 10}, out, 0, 0.3);
    TrackingJNI.releaseTracker(first);
    handles.remove(Long.valueOf(first));
    out = TrackingJNI.updateTracker(second, shifted(frame, 0, 9).getNativeObjAddr());
    assertRectNear(new double[] {300, 309, 200, 40, 10}, out, 0, 0.3);
  }

  @Test
  void frameAccuracyComparesRedGreenHistograms() {
    Mat rgba = keep(new Mat(48, 64, CvType.CV_8UC4));
    Core.setRNGSeed(8);
    Core.randu(rgba, 0, 256);
    Mat mirror = keep(new Mat());
    Core.flip(rgba, mirror, 1);
    assertEquals(1.0,
        TrackingJNI.calculateFrameAccuracy(rgba.getNativeObjAddr(), rgba.getNativeObjAddr()),
        1e-12);
    assertEquals(1.0,
        TrackingJNI.calculateFrameAccuracy(rgba.getNativeObjAddr(), mirror.getNativeObjAddr()),
        1e-12);
    Mat red = keep(new Mat(20, 30, CvType.CV_8UC4, new Scalar(200, 10, 40, 255)));
    Mat green = keep(new Mat(20, 30, CvType.CV_8UC4, new Scalar(10, 200, 40, 255)));
    assertEquals(-1.0 / 65535.0,
        TrackingJNI.calculateFrameAccuracy(red.getNativeObjAddr(), green.getNativeObjAddr()),
        1e-12);
  }

  @Test
  void blurIsTheLaplacianDeviation() {
    Mat uniform = keep(new Mat(30, 40, CvType.CV_8UC4, new Scalar(90, 120, 30, 255)));
    assertEquals(0.0, TrackingJNI.calculateBlur(uniform.getNativeObjAddr()), 0.0);
    Mat dot = keep(new Mat(5, 5, CvType.CV_8UC4, new Scalar(0, 0, 0, 255)));
    dot.put(2, 2, 255, 255, 255, 255);
    assertEquals(Math.sqrt((1020.0 * 1020.0 + 4 * 255.0 * 255.0) / 25.0),
        TrackingJNI.calculateBlur(dot.getNativeObjAddr()), 1e-9);

    Mat sharp = keep(new Mat(120, 160, CvType.CV_8UC4));
    Core.setRNGSeed(9);
    Core.randu(sharp, 0, 256);
    Mat blurred = keep(new Mat());
    Imgproc.GaussianBlur(sharp, blurred, new Size(0, 0), 2.0);
    assertTrue(TrackingJNI.calculateBlur(blurred.getNativeObjAddr())
        < 0.5 * TrackingJNI.calculateBlur(sharp.getNativeObjAddr()));
  }
}
