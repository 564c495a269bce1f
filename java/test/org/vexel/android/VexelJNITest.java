package org.vexel.android;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertFalse;
import static org.junit.jupiter.api.Assertions.assertNull;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.testing.NativeLog;
import com.quenda.tessel.testing.OpenCvHost;
import java.nio.ByteBuffer;
import java.util.List;
import org.junit.jupiter.api.MethodOrderer;
import org.junit.jupiter.api.Order;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.TestMethodOrder;
import org.junit.jupiter.params.ParameterizedTest;
import org.junit.jupiter.params.provider.ValueSource;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;

/**
 * The bridge in a real JVM, drawing with the real kit on headless surfaces. Most frames show a
 * 320x180 camera image letterboxed into a 320x240 window (rows 30 to 209). The camera image
 * carries a marker where the text stands, so the expected place on screen comes from the drawn
 * background, not from the engine's own mapping.
 */
@TestMethodOrder(MethodOrderer.OrderAnnotation.class)
class VexelJNITest {
  private static int count(Mat mask) {
    return Core.countNonZero(mask);
  }

  @Test
  @Order(1) // before any renderer exists in this JVM
  void callsBeforeInitialisationAreHarmless() {
    OpenCvHost.load();
    NativeLog log = new NativeLog();
    double[] rect = {1, 1, 2, 2, 0};
    VexelJNI.renderOneFrame(new Mat(4, 4, CvType.CV_8UC4).getNativeObjAddr(), new String[] {"Exit"},
        rect, rect, new long[] {1}, new long[] {0}, null, null, null);
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
    try (OverlayScene scene = new OverlayScene(320, 240, 320, 180)) {
      VexelJNI.setOrientation(orientation);
      // The image as the host holds it under the orientation, with an off-centre, turned
      // rectangle, so that a wrong turn or flip puts it elsewhere.
      boolean quarterTurn = orientation % 180 != 0;
      int width = quarterTurn ? 180 : 320;
      int height = quarterTurn ? 320 : 180;
      RotatedRect rect =
          new RotatedRect(new Point(width * 0.4, height * 0.55), new Size(130, 32), 12);
      Mat image = OverlayScene.imageWithMarker(width, height, rect);
      NativeLog log = new NativeLog();
      OverlayScene.renderEmpty(image);
      Mat marker = OverlayScene.marker(scene.pixels());
      int markerPixels = count(marker);
      assertTrue(markerPixels > 1500, "marker visible before: " + markerPixels);

      OverlayScene.renderText(image, "EXIT 42", rect);
      Mat after = scene.pixels();
      Mat red = OverlayScene.red(after);
      Mat patch = OverlayScene.near(after, OverlayScene.PATCH, 30);
      assertEquals(0, count(OverlayScene.marker(after)), "marker visible");
      assertTrue(count(red) > 100, "text drawn in its colour: " + count(red));
      assertEquals(0, OverlayScene.outside(red, marker, 4), "text outside its rectangle");
      int covered = markerPixels - OverlayScene.outside(marker, patch, 0);
      assertTrue(covered > markerPixels / 2, "patch covers the marker: " + covered);
      assertEquals(0, OverlayScene.outside(patch, marker, 10), "patch spills");
      // The bars stay transparent, the image away from the text is untouched.
      assertEquals(0, after.get(5, 5)[3]);
      assertEquals(255, OverlayScene.near(after, OverlayScene.BACKGROUND, 8).get(120, 3)[0]);
      assertEquals(List.of(), log.messages('E'));
    }
  }

  @Test
  void anEmptyFrameClearsTheTextsAndStillDrawsTheNewImage() {
    try (OverlayScene scene = new OverlayScene(320, 240, 320, 180)) {
      RotatedRect rect = new RotatedRect(new Point(160, 90), new Size(140, 30), 0);
      OverlayScene.renderText(OverlayScene.imageWithMarker(320, 180, rect), "EXIT", rect);
      assertTrue(VexelJNI.getRenderTranslate());
      long frames = scene.surface.getFrameCount();
      OverlayScene.renderEmpty(new Mat(180, 320, CvType.CV_8UC4, OverlayScene.MARKER));
      assertFalse(VexelJNI.getRenderTranslate());
      assertEquals(frames + 1, scene.surface.getFrameCount());
      Mat shown = scene.pixels();
      assertEquals(0, count(OverlayScene.red(shown)));
      assertEquals(0, count(OverlayScene.near(shown, OverlayScene.PATCH, 30)));
      assertEquals(255, OverlayScene.near(shown, OverlayScene.MARKER, 8).get(120, 160)[0]);
    }
  }

  @Test
  void chineseTextIsDrawnWithItsDefaultFont() {
    try (OverlayScene scene = new OverlayScene(320, 240, 320, 180)) {
      VexelJNI.setTranslationLanguage("zh-CHS");
      RotatedRect rect = new RotatedRect(new Point(160, 90), new Size(120, 40), 0);
      NativeLog log = new NativeLog();
      OverlayScene.renderText(OverlayScene.imageWithMarker(320, 180, rect), "安全出口", rect);
      int red = count(OverlayScene.red(scene.pixels()));
      assertTrue(red > 150, "CJK glyphs drawn: " + red);
      assertEquals(List.of(), log.messages('E'));
    }
  }

  @Test
  void anUnreadableTextAndMissingArraysDoNotStopTheFrame() {
    try (OverlayScene scene = new OverlayScene(160, 90, 160, 90)) {
      NativeLog log = new NativeLog();
      double[] rects = {80, 45, 100, 24, 0, 80, 45, 100, 24, 0};
      VexelJNI.renderOneFrame(
          new Mat(90, 160, CvType.CV_8UC4, OverlayScene.BACKGROUND).getNativeObjAddr(),
          new String[] {null, "EXIT"}, rects, rects, null, null, null, null, null);
      assertEquals(List.of("Vexel: GetStringUTFChars failed."), log.messages('E'));
      // The second text is drawn in the default colour, opaque black, across its middle row.
      Mat dark = OverlayScene.inRange(scene.pixels(), new Scalar(0), new Scalar(39, 39, 255, 255));
      int black = count(dark.submat(45, 46, 40, 120));
      assertTrue(black > 3, "black text drawn: " + black);
    }
  }

  @Test
  void aSecondInitialisationAfterShutDownDrawsAgain() {
    for (int round = 0; round < 2; ++round) {
      try (OverlayScene scene = new OverlayScene(160, 90, 160, 90)) {
        RotatedRect rect = new RotatedRect(new Point(80, 45), new Size(96, 24), 0);
        OverlayScene.renderText(OverlayScene.imageWithMarker(160, 90, rect), "EXIT", rect);
        int red = count(OverlayScene.red(scene.pixels()));
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
}
