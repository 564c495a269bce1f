package com.quenda.tessel.tracking;

import static org.junit.jupiter.api.Assertions.assertArrayEquals;
import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertNotEquals;
import static org.junit.jupiter.api.Assertions.assertNull;
import static org.junit.jupiter.api.Assertions.assertThrows;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.testing.NativeLog;
import com.quenda.tessel.testing.OpenCvHost;
import java.lang.ref.Reference;
import java.util.ArrayList;
import java.util.List;
import org.junit.jupiter.api.AfterEach;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.function.Executable;
import org.opencv.core.Core;
import org.opencv.core.CvException;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Rect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

class TrackingJNITest {
  /** A wide region over texture: enough features to track the frame. */
  private static final double[] WIDE = {320, 160, 260, 50, 0};

  private final List<Long> handles = new ArrayList<>();

  @BeforeAll
  static void loadOpenCv() {
    OpenCvHost.load();
  }

  @AfterEach
  void releaseTrackers() {
    handles.forEach(TrackingJNI::releaseTracker);
  }

  private long start(Mat frame, double[] rects) {
    long handle = TrackingJNI.initializeTracker(frame.getNativeObjAddr(), rects);
    // A matrix the engine reads only by address must outlive the call.
    Reference.reachabilityFence(frame);
    assertNotEquals(0L, handle);
    handles.add(handle);
    return handle;
  }

  private static double[] update(long handle, Mat frame) {
    double[] rects = TrackingJNI.updateTracker(handle, frame.getNativeObjAddr());
    Reference.reachabilityFence(frame);
    return rects;
  }

  /** 640 x 480 RGB frame of smoothed noise, with a flat grey band at the bottom. */
  private static Mat texturedFrame(int seed) {
    Core.setRNGSeed(seed);
    Mat frame = new Mat(480, 640, CvType.CV_8UC3);
    Core.randu(frame, 0, 256);
    Imgproc.GaussianBlur(frame, frame, new Size(0, 0), 1.5);
    Core.normalize(frame, frame, 0, 255, Core.NORM_MINMAX);
    frame.submat(new Rect(0, 400, 640, 80)).setTo(new Scalar(128, 128, 128));
    return frame;
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
  void rectanglesGoInAndComeBackAsFiveValuesEach() {
    Mat frame = texturedFrame(3);
    // Twelve values: two rectangles, the last two values ignored. The second
    // rectangle's 10.9 x 20.7 arrives as 10 x 20.
    long handle = start(frame, new double[] {320, 160, 260, 50, 0, 300, 300, 10.9, 20.7, 0, 9, 9});
    assertEquals(0.0, TrackingJNI.getCoverageLeft(handle), 0.0);
    assertArrayEquals(
        new double[] {320, 160, 260, 50, 0, 300, 300, 10, 20, 0}, update(handle, frame), 0.1);
    assertEquals(1.0, TrackingJNI.getCoverageLeft(handle), 1e-3);
  }

  @Test
  void failedUpdatesComeBackAsZeroRectangles() {
    Mat frame = texturedFrame(5);
    // Both regions on the flat band: no feature to track.
    long handle = start(frame, new double[] {200, 440, 100, 30, 0, 450, 440, 80, 20, 5});
    NativeLog log = new NativeLog();
    for (int update = 0; update < 2; ++update) {
      assertArrayEquals(new double[10], update(handle, frame));
    }
    assertTrue(log.messages('W').contains("OcrTracker::UpdateTracker Failure: Nothing to track"),
        String.join("\n", log.lines()));
  }

  @Test
  void trackerWithoutRectanglesAnswersWithEmptyArrays() {
    Mat frame = texturedFrame(6);
    NativeLog log = new NativeLog();
    for (double[] rects : new double[][] {new double[0], {1, 2, 3, 4}, null}) {
      assertArrayEquals(new double[0], update(start(frame, rects), frame));
    }
    assertEquals(3,
        log.messages('W')
            .stream()
            .filter("OcrTrackerRotRect::StartTracker: Input array is empty" ::equals)
            .count());
  }

  @Test
  void frameAccuracyAndBlurReadTheHostsMats() {
    Mat red = new Mat(20, 30, CvType.CV_8UC4, new Scalar(200, 10, 40, 255));
    Mat green = new Mat(20, 30, CvType.CV_8UC4, new Scalar(10, 200, 40, 255));
    assertEquals(-1.0 / 65535.0,
        TrackingJNI.calculateFrameAccuracy(red.getNativeObjAddr(), green.getNativeObjAddr()),
        1e-12);
    Mat dot = new Mat(5, 5, CvType.CV_8UC4, new Scalar(0, 0, 0, 255));
    dot.put(2, 2, 255, 255, 255, 255);
    assertEquals(Math.sqrt((1020.0 * 1020.0 + 4 * 255.0 * 255.0) / 25.0),
        TrackingJNI.calculateBlur(dot.getNativeObjAddr()), 1e-9);
    Reference.reachabilityFence(red);
    Reference.reachabilityFence(green);
    Reference.reachabilityFence(dot);
  }

  @Test
  void measuringAtAddressZeroIsTheHostsBugAndReachesItAsAnException() {
    Mat frame = new Mat(20, 30, CvType.CV_8UC4, new Scalar(9, 9, 9, 255));
    long address = frame.getNativeObjAddr();
    assertEquals("calculateBlur: no matrix at address 0",
        assertThrows(IllegalArgumentException.class, () -> TrackingJNI.calculateBlur(0))
            .getMessage());
    for (long[] pair : new long[][] {{0, address}, {address, 0}, {0, 0}}) {
      assertEquals("calculateFrameAccuracy: no matrix at address 0",
          assertThrows(IllegalArgumentException.class,
              () -> TrackingJNI.calculateFrameAccuracy(pair[0], pair[1]))
              .getMessage());
    }
    // The JVM lives on and the measures still answer for real matrices.
    assertEquals(1.0, TrackingJNI.calculateFrameAccuracy(address, address), 0.0);
    assertEquals(0.0, TrackingJNI.calculateBlur(address), 0.0);
    Reference.reachabilityFence(frame);
  }

  /** Checks that the call raised OpenCV's own error, word for word as OpenCV worded it. */
  private static void openCvError(Executable call, String detail) {
    String message = assertThrows(CvException.class, call).getMessage();
    assertTrue(message.startsWith("OpenCV(") && message.contains(detail), message);
  }

  @Test
  void openCvErrorsReachTheHostAsExceptionsAndTheEngineCarriesOn() {
    NativeLog log = new NativeLog();
    // Too small to refine corners in, and no image at all.
    Mat tiny = texturedFrame(2).submat(new Rect(0, 0, 10, 10)).clone();
    Mat empty = new Mat();
    openCvError(
        ()
            -> TrackingJNI.initializeTracker(tiny.getNativeObjAddr(), new double[] {5, 5, 8, 8, 0}),
        "in function 'cornerSubPix'");
    openCvError(()
                    -> TrackingJNI.initializeTracker(empty.getNativeObjAddr(), WIDE),
        "!_src.empty() in function 'cvtColor'");
    // Both measures convert colour frames: two channels are none.
    Mat twoChannelMat = new Mat(20, 30, CvType.CV_8UC2, new Scalar(1, 2));
    long twoChannels = twoChannelMat.getNativeObjAddr();
    String channels = "Invalid number of channels in input image";
    openCvError(() -> TrackingJNI.calculateFrameAccuracy(twoChannels, twoChannels), channels);
    openCvError(() -> TrackingJNI.calculateBlur(twoChannels), channels);
    // The engine handles none of them itself: no warning, no error logged.
    assertEquals(List.of(), log.messages('W'));
    assertEquals(List.of(), log.messages('E'));

    // A running tracker fed a frame it cannot use keeps working on the next.
    Mat frame = texturedFrame(7);
    long handle = start(frame, WIDE);
    assertThrows(CvException.class, () -> update(handle, new Mat()));
    assertArrayEquals(WIDE, update(handle, frame), 0.1);
    Mat gray = new Mat(20, 30, CvType.CV_8UC4, new Scalar(9, 9, 9, 255));
    assertEquals(1.0,
        TrackingJNI.calculateFrameAccuracy(gray.getNativeObjAddr(), gray.getNativeObjAddr()), 0.0);
    for (Mat mat : new Mat[] {tiny, empty, twoChannelMat, gray}) {
      Reference.reachabilityFence(mat);
    }
  }
}
