package com.quenda.tessel.inpainting;

import static org.junit.jupiter.api.Assertions.assertArrayEquals;
import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertThrows;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.testing.NativeLog;
import com.quenda.tessel.testing.OpenCvHost;
import java.lang.ref.Reference;
import java.util.Arrays;
import java.util.List;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.opencv.core.Core;
import org.opencv.core.CvException;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.MatOfDouble;
import org.opencv.core.MatOfPoint;
import org.opencv.core.Point;
import org.opencv.core.Scalar;
import org.opencv.imgproc.Imgproc;

class InpaintingJNITest {
  private static final int SENTINEL_COLOR = 7;
  private static final double[] ONE_RECT = {125, 68, 168, 40, 0};
  private static Mat frame;
  private final NativeLog log = new NativeLog();
  private final Mat[] outputs = {sentinelMat(), sentinelMat()};

  /** Light grey frame, RGB, with two dark words. */
  @BeforeAll
  static void drawFrame() {
    OpenCvHost.load();
    frame = new Mat(360, 640, CvType.CV_8UC3, new Scalar(215, 212, 205));
    Imgproc.putText(frame, "Bahnhof", new Point(60, 80), Imgproc.FONT_HERSHEY_SIMPLEX, 1.2,
        new Scalar(25, 25, 30), 3, Imgproc.LINE_AA);
    Imgproc.putText(frame, "Ausgang", new Point(300, 280), Imgproc.FONT_HERSHEY_SIMPLEX, 1.2,
        new Scalar(25, 25, 30), 3, Imgproc.LINE_AA);
  }

  private static Mat sentinelMat() {
    return new Mat(2, 2, CvType.CV_8UC1, new Scalar(42));
  }

  private long[] addresses(int count) {
    return Arrays.stream(outputs).limit(count).mapToLong(Mat::getNativeObjAddr).toArray();
  }

  private static int[] sentinelColors(int count) {
    int[] colors = new int[count];
    Arrays.fill(colors, SENTINEL_COLOR);
    return colors;
  }

  @Test
  void erasesEveryLineIntoTheHostsMatsAndPacksTheTextColours() {
    // Boxes around the two words, enlarged as the host does.
    double[] rects = {125, 68, 168, 40, 0, 370, 268, 180, 40, 0};
    int[] colors = sentinelColors(2);

    assertEquals(0,
        InpaintingJNI.InpaintingRotRectImg(frame.getNativeObjAddr(), addresses(2), rects, colors));

    for (int i = 0; i < 2; i++) {
      assertEquals(CvType.CV_8UC4, outputs[i].type());
      assertEquals(40, outputs[i].rows());
      assertEquals(i == 0 ? 168 : 180, outputs[i].cols());
      assertEquals(0xFF, colors[i] >>> 24, "alpha byte on top");
      int red = colors[i] & 0xFF;
      int green = (colors[i] >> 8) & 0xFF;
      int blue = (colors[i] >> 16) & 0xFF;
      assertTrue(
          red < 90 && green < 90 && blue < 90, "dark text, got " + Integer.toHexString(colors[i]));
      // Opaque over the text.
      Mat alpha = new Mat();
      Core.extractChannel(outputs[i], alpha, 3);
      assertEquals(255.0, Core.minMaxLoc(alpha).maxVal);
    }
    List<String> info = log.messages('I');
    assertTrue(info.contains("Inpainting_Process: Start JNI"));
    assertTrue(info.contains("Inpainting_Process: Start vector images, call inpaintRotImg"));
    assertTrue(info.contains("Inpainting_Process: num_results 2 "));
    assertTrue(info.contains("Inpainting_Process: finish fontcolor. "));
    assertTrue(log.messages('E').isEmpty(), "errors: " + log.messages('E'));
  }

  /** A refused call returns -1, logs `message` as an error and leaves every output alone. */
  private void assertRefused(
      String message, long image, long[] addresses, double[] rects, int[] colors) {
    log.mark();
    assertEquals(-1, InpaintingJNI.InpaintingRotRectImg(image, addresses, rects, colors), message);
    assertTrue(
        log.messages('E').contains(message), "missing '" + message + "' in " + log.messages('E'));
    for (Mat output : outputs) {
      assertTrue(output.rows() == 2 && output.cols() == 2 && output.get(0, 0)[0] == 42,
          "an output matrix was written: " + message);
    }
    if (colors != null) {
      assertArrayEquals(sentinelColors(colors.length), colors, "a colour was written: " + message);
    }
  }

  @Test
  void refusesMissingAndMismatchedArraysInValidationOrder() {
    long image = frame.getNativeObjAddr();
    String outputMismatch = " Inpainting_Process: output matrices array is null or the number of"
        + " output matrices doesn't match the number of rectangles";
    String colourMismatch =
        " Inpainting_Process: number of rectangles doesn't match number of font color values";

    assertRefused(" Inpainting_Process: No rectangles passed for inpainting in Java call", image,
        addresses(1), null, sentinelColors(1));
    // HotSpot hands out an empty array in place, which the entry refuses.
    assertRefused(" Inpainting_Process: Error in copy rectangles in Java call", image, new long[0],
        new double[0], new int[0]);
    assertRefused(colourMismatch, image, addresses(1), ONE_RECT, null);
    // The colour count is checked before the output addresses.
    assertRefused(colourMismatch, image, null, ONE_RECT, sentinelColors(2));
    assertRefused(outputMismatch, image, null, ONE_RECT, sentinelColors(1));
    assertRefused(outputMismatch, image, addresses(2), ONE_RECT, sentinelColors(1));
    assertRefused(" Inpainting_Process: output matrix 0 has no native address", image,
        new long[] {0}, ONE_RECT, sentinelColors(1));
  }

  @Test
  void refusesRequestsThePipelineCannotServe() {
    String emptyImage = " Inpainting_Process: Error in input of inpainting. Empty data.";

    // Seven values: one rectangle for the entry, but not a multiple of five.
    assertRefused(" Inpainting_Process: Error in rotate_recs.size 7", frame.getNativeObjAddr(),
        addresses(1), new double[] {125, 68, 168, 40, 0, 1, 2}, sentinelColors(1));
    assertTrue(log.messages('E').contains("Error in Java call of Inpainting"));

    Mat rgba = new Mat(100, 100, CvType.CV_8UC4, new Scalar(1, 2, 3, 4));
    assertRefused(" Inpainting_Process: Error in type of convert RGBA to RGB.",
        rgba.getNativeObjAddr(), addresses(1), ONE_RECT, sentinelColors(1));
    Mat empty = new Mat();
    assertRefused(emptyImage, empty.getNativeObjAddr(), addresses(1), ONE_RECT, sentinelColors(1));
    assertRefused(emptyImage, 0L, addresses(1), ONE_RECT, sentinelColors(1));
    // The engine reads matrices by address only: they must outlive the calls.
    Reference.reachabilityFence(rgba);
    Reference.reachabilityFence(empty);
  }

  @Test
  void aFrameBelow4x4SucceedsWithEmptyOverlaysAndBlackText() {
    Mat tiny = new Mat(3, 3, CvType.CV_8UC3, new Scalar(90, 90, 90));
    int[] colors = sentinelColors(2);
    double[] rects = {1, 1, 2, 2, 0, 2, 2, 1, 1, 0};
    assertEquals(0,
        InpaintingJNI.InpaintingRotRectImg(tiny.getNativeObjAddr(), addresses(2), rects, colors));
    assertTrue(outputs[0].empty() && outputs[1].empty());
    assertArrayEquals(new int[] {0xFF000000, 0xFF000000}, colors);
    assertTrue(log.messages('E').contains(" Inpainting_Process: input image size is too small "));
    Reference.reachabilityFence(tiny);
  }

  @Test
  void measuresColourStatisticsOfHalfScaleRectangles() {
    Mat image = new Mat(120, 160, CvType.CV_8UC3);
    Core.setRNGSeed(3);
    Core.randu(image, 0, 256);
    // (100, 100, 40, 20, 0) at full resolution is (50, 50, 20, 10) here; the
    // second rectangle lies outside the image; the last two values are ignored.
    double[] rects = {100, 100, 40, 20, 0, 1000, 1000, 40, 40, 0, 5, 5};
    double[] means = new double[6];
    double[] deviations = new double[6];
    assertEquals(
        0, InpaintingJNI.CalculateMeansStdDevs(image.getNativeObjAddr(), rects, means, deviations));
    Reference.reachabilityFence(image);

    Mat mask = Mat.zeros(image.size(), CvType.CV_8UC1);
    Imgproc.fillConvexPoly(mask,
        new MatOfPoint(new Point(40, 45), new Point(60, 45), new Point(60, 55), new Point(40, 55)),
        new Scalar(255));
    MatOfDouble mean = new MatOfDouble();
    MatOfDouble deviation = new MatOfDouble();
    Core.meanStdDev(image, mean, deviation, mask);
    for (int c = 0; c < 3; c++) {
      assertEquals(mean.toArray()[c], means[c], 1e-9);
      assertEquals(deviation.toArray()[c], deviations[c], 1e-9);
      assertEquals(0.0, means[3 + c]);
      assertEquals(0.0, deviations[3 + c]);
    }
  }

  @Test
  void refusesColourStatisticsArraysOfTheWrongLength() {
    long image = frame.getNativeObjAddr();
    double[] rects = {20, 20, 10, 10, 0};
    double[] four = {-1, -1, -1, -1};
    assertEquals(-1, InpaintingJNI.CalculateMeansStdDevs(image, rects, four, four.clone()));
    assertTrue(
        log.messages('E').contains("Color_Adjustment: Number of rects and means don't match"));

    log.mark();
    double[] three = {-1, -1, -1};
    double[] five = {-1, -1, -1, -1, -1};
    assertEquals(-1, InpaintingJNI.CalculateMeansStdDevs(image, rects, three, five));
    assertTrue(
        log.messages('E').contains("Color_Adjustment: Number of rects and std_devs don't match"));
    assertArrayEquals(new double[] {-1, -1, -1}, three);
    assertArrayEquals(new double[] {-1, -1, -1, -1, -1}, five);

    assertEquals(
        0, InpaintingJNI.CalculateMeansStdDevs(image, new double[4], new double[0], new double[0]));
  }

  @Test
  void openCvErrorsInTheStatisticsReachTheHostAndTheNextCallWorks() {
    // OpenCV has no statistics for half floats.
    Mat halfFloats = Mat.zeros(120, 160, CvType.CV_16FC3);
    double[] rects = {100, 100, 40, 20, 0};
    CvException error = assertThrows(CvException.class,
        ()
            -> InpaintingJNI.CalculateMeansStdDevs(
                halfFloats.getNativeObjAddr(), rects, new double[3], new double[3]));
    assertTrue(error.getMessage().startsWith("OpenCV("), error.getMessage());
    assertTrue(error.getMessage().contains("in function 'meanStdDev'"), error.getMessage());
    assertEquals(List.of(), log.messages('E'));

    double[] means = new double[3];
    assertEquals(0,
        InpaintingJNI.CalculateMeansStdDevs(frame.getNativeObjAddr(), rects, means, new double[3]));
    assertArrayEquals(new double[] {215, 212, 205}, means, 1e-9);
    Reference.reachabilityFence(halfFloats);
  }
}
