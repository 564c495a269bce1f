package org.vexel.android;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertFalse;
import static org.junit.jupiter.api.Assertions.assertNull;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.testing.NativeLog;
import com.quenda.tessel.testing.OpenCvHost;
import java.lang.ref.Reference;
import java.nio.ByteBuffer;
import java.util.List;
import org.junit.jupiter.api.MethodOrderer;
import org.junit.jupiter.api.Order;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.TestMethodOrder;
import org.junit.jupiter.params.ParameterizedTest;
import org.junit.jupiter.params.provider.CsvSource;
import org.junit.jupiter.params.provider.ValueSource;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.MatOfPoint;
import org.opencv.core.Point;
import org.opencv.core.Rect;
import org.opencv.core.RotatedRect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;
import org.vexel.desktop.DirectoryAssetManager;
import org.vexel.desktop.OffscreenSurface;

/**
 * The bridge in a real JVM, drawing with the real kit on headless surfaces as a phone host drives
 * it. Most frames show a 320x180 camera image letterboxed into a 320x240 window (rows 30 to 209).
 * The camera image carries a marker where the text stands, so the expected place on screen comes
 * from the drawn background, not from the engine's own mapping.
 */
@TestMethodOrder(MethodOrderer.OrderAnnotation.class)
class VexelJNITest {
  private static final Scalar BACKGROUND = new Scalar(40, 90, 160, 255);
  // Painted into the camera image where the text stands; the patch must hide it.
  private static final Scalar MARKER = new Scalar(30, 200, 60, 255);
  private static final Scalar PATCH = new Scalar(230, 200, 40, 255);
  private static final int TEXT_COLOR = 0xFF0000FF; // opaque red, 0xAABBGGRR

  @Test
  @Order(1) // before any renderer exists in this JVM
  void callsBeforeInitialisationAreHarmless() {
    OpenCvHost.load();
    NativeLog log = new NativeLog();
    double[] rect = {1, 1, 2, 2, 0};
    Mat frame = new Mat(4, 4, CvType.CV_8UC4);
    VexelJNI.renderOneFrame(frame.getNativeObjAddr(), new String[] {"Exit"}, rect, rect,
        new long[] {1}, new long[] {0}, null, null, null);
    Reference.reachabilityFence(frame);
    VexelJNI.renderOneFrame(0, null, null, null, null, null, null, null, null);
    VexelJNI.setOrientation(90);
    VexelJNI.setTranslationLanguageFont("ja", null);
    assertFalse(VexelJNI.getRenderTranslate());
    VexelJNI.shutDown();
    assertEquals(List.of(), log.messages('E'));
    assertTrue(log.messages('I').contains("Vexel: Set renderer orientation 90."));
    assertTrue(log.messages('I').contains("Vexel: renderOneFrame image((nil) 0 0) text(0)"));
  }

  @ParameterizedTest
  @ValueSource(ints = {0, 90, 180, 270})
  void patchHidesTheTextAndTheTranslationStaysInsideItsRectangle(int orientation) {
    try (Scene scene = new Scene(320, 240, 320, 180)) {
      VexelJNI.setOrientation(orientation);
      // The image as the host holds it under the orientation, with an off-centre, turned
      // rectangle, so that a wrong turn or flip puts it elsewhere.
      boolean quarterTurn = orientation % 180 != 0;
      int width = quarterTurn ? 180 : 320;
      int height = quarterTurn ? 320 : 180;
      RotatedRect rect =
          new RotatedRect(new Point(width * 0.4, height * 0.55), new Size(130, 32), 12);
      Mat image = imageWithMarker(width, height, rect);
      NativeLog log = new NativeLog();
      renderEmpty(image);
      Mat marker = marker(scene.pixels());
      int markerPixels = count(marker);
      assertTrue(markerPixels > 1500, "marker visible before: " + markerPixels);

      renderText(image, "EXIT 42", rect);
      Mat after = scene.pixels();
      Mat red = red(after);
      Mat patch = near(after, PATCH, 30);
      assertEquals(0, count(marker(after)), "marker still visible");
      assertTrue(count(red) > 100, "text drawn in its colour: " + count(red));
      assertEquals(0, outside(red, marker, 4), "text outside its rectangle");
      int covered = markerPixels - outside(marker, patch, 0);
      assertTrue(covered > markerPixels / 2, "patch covers the marker: " + covered);
      assertEquals(0, outside(patch, marker, 10), "patch spills");
      // The bars stay transparent, the image away from the text is untouched.
      assertEquals(0, after.get(5, 5)[3]);
      assertEquals(255, near(after, BACKGROUND, 8).get(120, 3)[0]);
      assertEquals(List.of(), log.messages('E'));
    }
  }

  @Test
  void anEmptyFrameClearsTheTextsAndStillDrawsTheNewImage() {
    try (Scene scene = new Scene(320, 240, 320, 180)) {
      RotatedRect rect = new RotatedRect(new Point(160, 90), new Size(140, 30), 0);
      renderText(imageWithMarker(320, 180, rect), "EXIT", rect);
      assertTrue(VexelJNI.getRenderTranslate());
      long frames = scene.surface.getFrameCount();
      renderEmpty(new Mat(180, 320, CvType.CV_8UC4, MARKER));
      assertFalse(VexelJNI.getRenderTranslate());
      assertEquals(frames + 1, scene.surface.getFrameCount());
      Mat shown = scene.pixels();
      assertEquals(0, count(red(shown)));
      assertEquals(0, count(near(shown, PATCH, 30)));
      assertEquals(255, near(shown, MARKER, 8).get(120, 160)[0]);
    }
  }

  /** CJK text fills the height of its rectangle with its ideographs, and stays inside it. */
  @ParameterizedTest
  @CsvSource({"zh-CHS, 安全出口", "ja, 非常口"})
  void cjkTextIsDrawnWithItsDefaultFontAcrossItsRectangle(String language, String text) {
    try (Scene scene = new Scene(320, 180, 320, 180)) {
      VexelJNI.setTranslationLanguage(language);
      RotatedRect rect = new RotatedRect(new Point(160, 90), new Size(160, 40), 0);
      NativeLog log = new NativeLog();
      renderText(imageWithMarker(320, 180, rect), text, rect);
      Rect ink = Imgproc.boundingRect(red(scene.pixels()));
      assertTrue(ink.y >= 69 && ink.y + ink.height <= 111, "inside rows 70..109: " + ink);
      assertTrue(ink.height >= 34, "ideographs fill the height: " + ink);
      assertEquals(List.of(), log.messages('E'));
    }
  }

  /**
   * A Latin translation shows capitals as tall as the original's. Each original is drawn first,
   * the engine serving as printer: its ink rows are the OCR line box the translation then gets,
   * its first letter's height its capital height.
   */
  @ParameterizedTest
  @CsvSource({"EXIT, SALIDA", // capitals only: no room kept for descenders
      "Keep the door closed, Mantenga la puerta cerrada",
      "Keep, Guardar", // the original's descender, none in the translation
      "No parking, Prohibido aparcar"})
  void
  aLatinTranslationTakesTheCapitalHeightOfTheOriginal(String original, String translation) {
    try (Scene scene = new Scene(960, 160, 960, 160)) {
      // The font a desktop host binds for Latin-script languages.
      VexelJNI.setTranslationLanguageFont("es", "/system/fonts/NotoSans-Regular.ttf");
      VexelJNI.setTranslationLanguage("es");
      NativeLog log = new NativeLog();
      Mat image = new Mat(160, 960, CvType.CV_8UC4, BACKGROUND);
      renderText(image, original, new RotatedRect(new Point(480, 80), new Size(400, 40), 0));
      int[] printed = inkRows(scene.pixels());
      int lineBox = printed[1] - printed[0];
      renderText(image, translation,
          new RotatedRect(
              new Point(480, (printed[0] + printed[1]) / 2.0), new Size(940, lineBox), 0));
      int[] drawn = inkRows(scene.pixels());
      double ratio = (double) drawn[2] / printed[2];
      assertTrue(Math.abs(ratio - 1) <= 0.15,
          "capital height " + drawn[2] + " px, original " + printed[2] + " px");
      assertTrue(drawn[0] >= printed[0] - 1 && drawn[1] <= printed[1] + 1, "inside the line box");
      assertEquals(List.of(), log.messages('E'));
    }
  }

  @Test
  void anUnreadableTextAndMissingArraysDoNotStopTheFrame() {
    try (Scene scene = new Scene(160, 90, 160, 90)) {
      NativeLog log = new NativeLog();
      double[] rects = {80, 45, 100, 24, 0, 80, 45, 100, 24, 0};
      Mat frame = new Mat(90, 160, CvType.CV_8UC4, BACKGROUND);
      VexelJNI.renderOneFrame(frame.getNativeObjAddr(), new String[] {null, "EXIT"}, rects, rects,
          null, null, null, null, null);
      Reference.reachabilityFence(frame);
      assertEquals(List.of("Vexel: GetStringUTFChars failed."), log.messages('E'));
      // The second text is drawn in the default colour, opaque black, across its middle row.
      Mat dark = inRange(scene.pixels(), new Scalar(0), new Scalar(39, 39, 255, 255));
      assertTrue(count(dark.submat(45, 46, 40, 120)) > 3);
    }
  }

  @Test
  void framesWithEndlessAnglesReturnAndTheNextFrameDrawsAsUsual() {
    try (Scene scene = new Scene(160, 90, 160, 90)) {
      NativeLog log = new NativeLog();
      for (double angle : new double[] {
               Double.POSITIVE_INFINITY, Double.NEGATIVE_INFINITY, Double.NaN, 1e300, -1e17}) {
        RotatedRect rect = new RotatedRect(new Point(80, 45), new Size(96, 24), angle);
        renderText(
            imageWithMarker(160, 90, new RotatedRect(rect.center, rect.size, 0)), "EXIT", rect);
      }
      assertEquals(List.of(), log.messages('E'));
      RotatedRect rect = new RotatedRect(new Point(80, 45), new Size(96, 24), 0);
      renderText(imageWithMarker(160, 90, rect), "EXIT", rect);
      assertTrue(count(red(scene.pixels())) > 20);
    }
  }

  @Test
  void aSecondInitialisationAfterShutDownDrawsAgain() {
    for (int round = 0; round < 2; ++round) {
      try (Scene scene = new Scene(160, 90, 160, 90)) {
        RotatedRect rect = new RotatedRect(new Point(80, 45), new Size(96, 24), 0);
        renderText(imageWithMarker(160, 90, rect), "EXIT", rect);
        int red = count(red(scene.pixels()));
        assertTrue(red > 20, "round " + round + ": " + red);
      }
    }
  }

  @Test
  void getMatByteBufferLeavesTheChannelCountOutOfItsCapacity() {
    OpenCvHost.load();
    NativeLog log = new NativeLog();
    Mat rgba = new Mat(6, 8, CvType.CV_8UC4, new Scalar(0));
    ByteBuffer buffer = VexelJNI.GetMatByteBuffer(rgba.getNativeObjAddr());
    assertTrue(buffer.isDirect());
    assertEquals(48, buffer.capacity());
    buffer.put(5, (byte) 77); // the buffer is the matrix's memory
    assertEquals(77, rgba.get(0, 1)[1]);
    Mat floats = new Mat(2, 3, CvType.CV_32FC2);
    assertEquals(24, VexelJNI.GetMatByteBuffer(floats.getNativeObjAddr()).capacity());
    assertNull(VexelJNI.GetMatByteBuffer(0));
    assertTrue(log.messages('I').contains("Vexel: GetMatByteBuffer"));
  }

  /** The renderer initialised on a new offscreen surface, shut down on close. */
  private static final class Scene implements AutoCloseable {
    final OffscreenSurface surface;
    // The default fonts the build assembled.
    private final DirectoryAssetManager assets =
        new DirectoryAssetManager(System.getProperty("ocr.assets"));

    Scene(int width, int height, int imageWidth, int imageHeight) {
      OpenCvHost.load();
      surface = new OffscreenSurface(width, height);
      VexelJNI.setAssetManager(assets);
      assertTrue(VexelJNI.initFromSurface(surface, imageWidth, imageHeight));
    }

    /** The last frame drawn, RGBA, top row first. */
    Mat pixels() {
      Mat frame = new Mat(surface.getHeight(), surface.getWidth(), CvType.CV_8UC4);
      frame.put(0, 0, surface.readPixels());
      return frame;
    }

    @Override
    public void close() {
      VexelJNI.setOrientation(0); // the orientation outlives the renderer
      VexelJNI.shutDown();
      surface.close();
      assets.close();
    }
  }

  /** A camera image of the background colour with the marker two pixels inside {@code rect}. */
  private static Mat imageWithMarker(int width, int height, RotatedRect rect) {
    Mat image = new Mat(height, width, CvType.CV_8UC4, BACKGROUND);
    Point[] corners = new Point[4];
    new RotatedRect(rect.center, new Size(rect.size.width - 4, rect.size.height - 4), rect.angle)
        .points(corners);
    Imgproc.fillConvexPoly(image, new MatOfPoint(corners), MARKER);
    return image;
  }

  /** One frame with {@code text} in {@code rect} over an upright patch of the rectangle's size. */
  private static void renderText(Mat image, String text, RotatedRect rect) {
    Mat patch = new Mat((int) Math.round(rect.size.height), (int) Math.round(rect.size.width),
        CvType.CV_8UC4, PATCH);
    double[] values = {rect.center.x, rect.center.y, rect.size.width, rect.size.height, rect.angle};
    VexelJNI.renderOneFrame(image.getNativeObjAddr(), new String[] {text}, values, values,
        new long[] {1}, new long[] {patch.getNativeObjAddr()}, new double[] {1, 1, 1},
        new double[] {0, 0, 0}, new int[] {TEXT_COLOR});
    // The engine reads both matrices through their addresses only.
    Reference.reachabilityFence(image);
    Reference.reachabilityFence(patch);
  }

  private static void renderEmpty(Mat image) {
    VexelJNI.renderOneFrame(
        image.getNativeObjAddr(), new String[0], null, null, null, null, null, null, null);
    Reference.reachabilityFence(image);
  }

  /** 255 where every channel of {@code frame} lies in [low, high]. */
  private static Mat inRange(Mat frame, Scalar low, Scalar high) {
    Mat mask = new Mat();
    Core.inRange(frame, low, high, mask);
    return mask;
  }

  /** 255 where the colour lies within {@code tolerance} of {@code colour}, alpha aside. */
  private static Mat near(Mat frame, Scalar colour, int tolerance) {
    double[] c = colour.val;
    return inRange(frame, new Scalar(c[0] - tolerance, c[1] - tolerance, c[2] - tolerance, 0),
        new Scalar(c[0] + tolerance, c[1] + tolerance, c[2] + tolerance, 255));
  }

  private static Mat marker(Mat frame) {
    return inRange(frame, new Scalar(0, 151, 0, 0), new Scalar(99, 255, 119, 255));
  }

  private static Mat red(Mat frame) {
    return inRange(frame, new Scalar(181, 0, 0, 0), new Scalar(255, 79, 79, 255));
  }

  /** Rows of the red ink: first, last + 1, and the height of its leftmost letter. */
  private static int[] inkRows(Mat frame) {
    Mat mask = red(frame);
    Rect all = Imgproc.boundingRect(mask);
    Mat labels = new Mat();
    Mat stats = new Mat();
    int components = Imgproc.connectedComponentsWithStats(mask, labels, stats, new Mat());
    int first = -1;
    for (int i = 1; i < components; ++i) {
      if (stats.get(i, Imgproc.CC_STAT_AREA)[0] >= 10
          && (first < 0
              || stats.get(i, Imgproc.CC_STAT_LEFT)[0]
                  < stats.get(first, Imgproc.CC_STAT_LEFT)[0])) {
        first = i;
      }
    }
    assertTrue(first > 0, "no ink");
    return new int[] {all.y, all.y + all.height, (int) stats.get(first, Imgproc.CC_STAT_HEIGHT)[0]};
  }

  private static int count(Mat mask) {
    return Core.countNonZero(mask);
  }

  /** Pixels of {@code mask} outside {@code region} grown by {@code margin} in every direction. */
  private static int outside(Mat mask, Mat region, int margin) {
    Mat grown = new Mat();
    Imgproc.dilate(region, grown,
        Imgproc.getStructuringElement(
            Imgproc.MORPH_RECT, new Size(2 * margin + 1, 2 * margin + 1)));
    Core.subtract(mask, grown, grown);
    return count(grown);
  }
}
