package org.vexel.android;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertFalse;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.testing.NativeLog;
import java.util.List;
import org.junit.jupiter.api.AfterAll;
import org.junit.jupiter.api.AfterEach;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.params.ParameterizedTest;
import org.junit.jupiter.params.provider.ValueSource;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;
import org.vexel.desktop.DirectoryAssetManager;

/**
 * Frames drawn through the bridge with the real kit on a headless surface. A 320x180 camera image
 * is letterboxed into a 320x240 window (rows 30 to 209). The camera image carries a marker where
 * the text stands, so the expected place on screen comes from the drawn background, not from the
 * engine's own mapping.
 */
class VexelJNIPixelTest {
  private static final int WINDOW_WIDTH = 320;
  private static final int WINDOW_HEIGHT = 240;
  private static final int IMAGE_WIDTH = 320;
  private static final int IMAGE_HEIGHT = 180;

  private static DirectoryAssetManager assets;
  private OverlayScene scene;

  @BeforeAll
  static void openAssets() {
    assets = OverlayScene.assets();
  }

  @AfterAll
  static void closeAssets() {
    assets.close();
  }

  private void open() {
    scene = new OverlayScene(WINDOW_WIDTH, WINDOW_HEIGHT);
    VexelJNI.setAssetManager(assets);
    assertTrue(VexelJNI.initFromSurface(scene.surface, IMAGE_WIDTH, IMAGE_HEIGHT));
  }

  @AfterEach
  void close() {
    if (scene != null) {
      VexelJNI.setOrientation(0); // the orientation outlives the renderer
      VexelJNI.shutDown();
      scene.close();
    }
  }

  /** The camera image and a rectangle on it as the host holds them under an orientation. */
  private static int[] imageSize(int orientation) {
    boolean quarterTurn = orientation == 90 || orientation == 270;
    return quarterTurn ? new int[] {IMAGE_HEIGHT, IMAGE_WIDTH}
                       : new int[] {IMAGE_WIDTH, IMAGE_HEIGHT};
  }

  @ParameterizedTest
  @ValueSource(ints = {0, 90, 180, 270})
  void patchHidesTheTextAndTheTranslationStaysInsideItsRectangle(int orientation) {
    open();
    VexelJNI.setOrientation(orientation);
    int[] size = imageSize(orientation);
    // Off-centre and turned, so that a wrong turn or flip puts it elsewhere.
    RotatedRect rect =
        new RotatedRect(new Point(size[0] * 0.4, size[1] * 0.55), new Size(130, 32), 12);
    Mat image = scene.imageWithMarker(size[0], size[1], rect);

    NativeLog log = new NativeLog();
    scene.renderEmpty(image);
    OverlayScene.Pixels before = scene.pixels();
    Mat marker = scene.mat(before.mask(before::isMarker));
    int markerPixels = Core.countNonZero(marker);
    assertTrue(markerPixels > 1500, "marker visible before: " + markerPixels);

    scene.renderText(image, "EXIT 42", rect, 1);
    OverlayScene.Pixels after = scene.pixels();
    byte[] near = OverlayScene.bytes(scene.mat(OverlayScene.grown(marker, 4)));
    byte[] around = OverlayScene.bytes(scene.mat(OverlayScene.grown(marker, 10)));
    byte[] inside = OverlayScene.bytes(marker);

    int patchPixels = 0;
    int redPixels = 0;
    for (int y = 0; y < WINDOW_HEIGHT; ++y) {
      for (int x = 0; x < WINDOW_WIDTH; ++x) {
        int i = y * WINDOW_WIDTH + x;
        assertFalse(after.isMarker(x, y), "marker still visible at " + x + "," + y);
        boolean red = after.isRed(x, y);
        boolean patch = after.near(x, y, OverlayScene.PATCH, 30);
        if (red) {
          ++redPixels;
          assertTrue(near[i] != 0, "text outside its rectangle at " + x + "," + y);
        }
        if (patch && inside[i] != 0) {
          ++patchPixels;
        }
        if (around[i] == 0) {
          assertFalse(patch || red, "overlay spills to " + x + "," + y);
        }
      }
    }
    assertTrue(patchPixels > markerPixels / 2, "patch covers the marker: " + patchPixels);
    assertTrue(redPixels > 100, "text drawn in its colour: " + redPixels);
    // The bars stay transparent, the image away from the text is untouched.
    assertEquals(0, after.channel(5, 5, 3));
    assertTrue(after.near(3, 120, OverlayScene.BACKGROUND, 8));
    assertEquals(List.of(), log.messages('E'));
  }

  @Test
  void anEmptyFrameClearsTheTextsAndStillDrawsTheBackground() {
    open();
    RotatedRect rect = new RotatedRect(new Point(160, 90), new Size(140, 30), 0);
    Mat image = scene.imageWithMarker(IMAGE_WIDTH, IMAGE_HEIGHT, rect);
    scene.renderText(image, "EXIT", rect, 1);
    assertTrue(VexelJNI.getRenderTranslate());
    assertFalse(scene.pixels().isMarker(160, 120));

    long frames = scene.surface.getFrameCount();
    scene.renderEmpty(image);
    assertFalse(VexelJNI.getRenderTranslate());
    assertEquals(frames + 1, scene.surface.getFrameCount());
    OverlayScene.Pixels pixels = scene.pixels();
    assertTrue(pixels.isMarker(160, 120), "background shows again where the text was");
    assertTrue(pixels.near(20, 60, OverlayScene.BACKGROUND, 8));
  }

  @Test
  void chineseTextIsDrawnWithItsDefaultFont() {
    open();
    VexelJNI.setTranslationLanguage("zh-CHS");
    RotatedRect rect = new RotatedRect(new Point(160, 90), new Size(120, 40), 0);
    Mat image = scene.imageWithMarker(IMAGE_WIDTH, IMAGE_HEIGHT, rect);
    NativeLog log = new NativeLog();
    scene.renderText(image, "安全出口", rect, 1);
    OverlayScene.Pixels pixels = scene.pixels();
    int red = Core.countNonZero(scene.mat(pixels.mask(pixels::isRed)));
    assertTrue(red > 150, "CJK glyphs drawn: " + red);
    assertEquals(List.of(), log.messages('E'));
  }

  @Test
  void aNewImageReplacesTheBackgroundEveryFrame() {
    open();
    RotatedRect rect = new RotatedRect(new Point(60, 40), new Size(60, 20), 0);
    scene.renderEmpty(scene.imageWithMarker(IMAGE_WIDTH, IMAGE_HEIGHT, rect));
    Mat plain = scene.mat(
        new Mat(IMAGE_HEIGHT, IMAGE_WIDTH, org.opencv.core.CvType.CV_8UC4, OverlayScene.PATCH));
    scene.renderEmpty(plain);
    assertTrue(scene.pixels().near(60, 70, OverlayScene.PATCH, 4));
  }
}
