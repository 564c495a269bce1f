package org.vexel.android;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertFalse;
import static org.junit.jupiter.api.Assertions.assertNull;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.testing.NativeLog;
import com.quenda.tessel.testing.OpenCvHost;
import java.nio.ByteBuffer;
import java.util.List;
import org.junit.jupiter.api.AfterAll;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.MethodOrderer;
import org.junit.jupiter.api.Order;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.TestMethodOrder;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.vexel.desktop.DirectoryAssetManager;

/** The bridge's life from before initialisation to shut-down and back, in one JVM. */
@TestMethodOrder(MethodOrderer.OrderAnnotation.class)
class VexelJNILifecycleTest {
  private static DirectoryAssetManager assets;

  @BeforeAll
  static void openAssets() {
    OpenCvHost.load();
    assets = OverlayScene.assets();
  }

  @AfterAll
  static void closeAssets() {
    VexelJNI.shutDown();
    assets.close();
  }

  @Test
  @Order(1)
  void callsBeforeInitialisationAreHarmless() {
    NativeLog log = new NativeLog();
    Mat image = new Mat(4, 4, CvType.CV_8UC4);
    VexelJNI.renderOneFrame(image.getNativeObjAddr(), new String[] {"Exit"},
        new double[] {1, 1, 2, 2, 0}, new double[] {1, 1, 2, 2, 0}, new long[] {1}, new long[] {0},
        null, null, null);
    VexelJNI.renderOneFrame(0, null, null, null, null, null, null, null, null);
    VexelJNI.setOrientation(90);
    VexelJNI.setTranslationLanguage("ja");
    VexelJNI.setTranslationLanguageFont("ja", null);
    assertFalse(VexelJNI.getRenderTranslate());
    VexelJNI.shutDown();
    assertEquals(List.of(), log.messages('E'));
    assertTrue(log.messages('I').contains("Vexel: Set renderer orientation 90."));
    assertTrue(log.messages('I').contains("Vexel: renderOneFrame image((nil) 0 0) text(0)"));
    image.release();
  }

  @Test
  @Order(2)
  void initialisationLogsTheWindowAndTheBackground() {
    NativeLog log = new NativeLog();
    try (OffscreenScene scene = new OffscreenScene(200, 100)) {
      assertTrue(VexelJNI.initFromSurface(scene.scene.surface, 64, 48));
      List<String> info = log.messages('I');
      assertTrue(info.contains("Vexel: Init renderer 200 100."), info.toString());
      assertTrue(info.contains("Vexel: Init background 64 48."), info.toString());
      // The orientation set before initialisation was not kept.
      assertTrue(log.messages('D').contains("VexelJNI::InitBackground rotation = 0 \r"),
          log.messages('D').toString());
      VexelJNI.shutDown();
    }
  }

  @Test
  @Order(3)
  void aSecondInitialisationWorksAfterShutDownAndWithoutIt() {
    for (int round = 0; round < 3; ++round) {
      try (OffscreenScene scene = new OffscreenScene(160, 90)) {
        NativeLog log = new NativeLog();
        assertTrue(VexelJNI.initFromSurface(scene.scene.surface, 160, 90));
        if (round == 2) {
          // Initialising again on a live window shuts the old renderer down first.
          assertTrue(VexelJNI.initFromSurface(scene.scene.surface, 160, 90));
          assertTrue(log.messages('E').contains(
              "Vexel: initFromSurface called with non-null s_native_window!"));
        }
        scene.drawOneText();
        assertTrue(scene.redPixels() > 20, "round " + round);
        if (round != 1) {
          VexelJNI.shutDown();
        }
      }
    }
    VexelJNI.shutDown();
  }

  @Test
  @Order(4)
  void aSurfaceThatIsNoWindowFailsQuietly() {
    NativeLog log = new NativeLog();
    assertTrue(VexelJNI.initFromSurface("not a surface", 10, 10));
    assertTrue(log.messages('E').contains("Vexel: Init failed, s_native_window is null!"));
    try (OverlayScene empty = new OverlayScene(0, 0)) {
      assertTrue(VexelJNI.initFromSurface(empty.surface, 10, 10));
      assertTrue(log.messages('E').contains("Vexel: The size of the window is negative"));
    }
    VexelJNI.shutDown();
  }

  @Test
  @Order(5)
  void getMatByteBufferLeavesTheChannelCountOutOfItsCapacity() {
    NativeLog log = new NativeLog();
    Mat rgba = new Mat(6, 8, CvType.CV_8UC4, new Scalar(0));
    ByteBuffer buffer = VexelJNI.GetMatByteBuffer(rgba.getNativeObjAddr());
    assertTrue(buffer.isDirect());
    assertEquals(48, buffer.capacity());
    buffer.put(5, (byte) 77); // the buffer is the matrix's memory
    byte[] first = new byte[8];
    rgba.get(0, 0, first);
    assertEquals(77, first[5]);
    Mat floats = new Mat(2, 3, CvType.CV_32FC2);
    assertEquals(24, VexelJNI.GetMatByteBuffer(floats.getNativeObjAddr()).capacity());
    assertNull(VexelJNI.GetMatByteBuffer(0));
    assertTrue(log.messages('I').contains("Vexel: GetMatByteBuffer"));
    rgba.release();
    floats.release();
  }

  @Test
  @Order(6)
  void getRenderTranslateFollowsTheLastFrame() {
    try (OffscreenScene scene = new OffscreenScene(160, 90)) {
      assertTrue(VexelJNI.initFromSurface(scene.scene.surface, 160, 90));
      scene.drawOneText();
      assertTrue(VexelJNI.getRenderTranslate());
      scene.scene.renderEmpty(scene.image);
      assertFalse(VexelJNI.getRenderTranslate());
      scene.drawOneText();
      assertTrue(VexelJNI.getRenderTranslate());
      VexelJNI.shutDown();
    }
  }

  @Test
  @Order(7)
  void anUnreadableTextAndMissingArraysDoNotStopTheFrame() {
    try (OffscreenScene scene = new OffscreenScene(160, 90)) {
      assertTrue(VexelJNI.initFromSurface(scene.scene.surface, 160, 90));
      NativeLog log = new NativeLog();
      double[] rect = {80, 45, 100, 24, 0, 80, 45, 100, 24, 0};
      VexelJNI.renderOneFrame(scene.image.getNativeObjAddr(), new String[] {null, "EXIT"}, rect,
          rect, null, null, null, null, null);
      assertEquals(List.of("Vexel: GetStringUTFChars failed."), log.messages('E'));
      // The second text is drawn in the default colour, opaque black.
      OverlayScene.Pixels pixels = scene.scene.pixels();
      int dark = 0;
      for (int x = 40; x < 120; ++x) {
        if (pixels.channel(x, 45, 0) < 40 && pixels.channel(x, 45, 1) < 40) {
          ++dark;
        }
      }
      assertTrue(dark > 3, "black text drawn: " + dark);
      VexelJNI.shutDown();
    }
  }

  /** A scene with a plain camera image and one text rectangle in its middle. */
  private static final class OffscreenScene implements AutoCloseable {
    final OverlayScene scene;
    final Mat image;
    final RotatedRect rect;

    OffscreenScene(int width, int height) {
      scene = new OverlayScene(width, height);
      VexelJNI.setAssetManager(assets);
      rect = new RotatedRect(new Point(width / 2.0, height / 2.0), new Size(width * 0.6, 24), 0);
      image = scene.imageWithMarker(width, height, rect);
    }

    void drawOneText() {
      scene.renderText(image, "EXIT", rect, 1);
    }

    int redPixels() {
      OverlayScene.Pixels pixels = scene.pixels();
      int red = 0;
      for (int y = 0; y < pixels.height; ++y) {
        for (int x = 0; x < pixels.width; ++x) {
          red += pixels.isRed(x, y) ? 1 : 0;
        }
      }
      return red;
    }

    @Override
    public void close() {
      scene.close();
    }
  }
}
