package com.quenda.tessel.desktop.engine;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import com.quenda.tessel.desktop.typeset.Face;
import java.lang.ref.Reference;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.imgproc.Imgproc;
import org.vexel.android.VexelJNI;
import org.vexel.desktop.DirectoryAssetManager;
import org.vexel.desktop.OffscreenSurface;

/**
 * Draws frames through the engine's renderer bridge on an offscreen surface of the frame's size
 * and reads each drawn frame back, as a phone shows it on screen. The renderer is process-wide:
 * one drawer at a time.
 */
public final class OverlayDrawer implements AutoCloseable {
  private final DirectoryAssetManager assets;
  private final OffscreenSurface surface;

  /** A renderer for frames of {@code width} x {@code height}. */
  public OverlayDrawer(int width, int height) throws HostException {
    String assetDirectory = System.getProperty("ocr.assets");
    if (assetDirectory == null || assetDirectory.isEmpty()) {
      throw new HostException(ExitStatus.INTERNAL,
          "the engine's font directory is not set (-Docr.assets); run through scripts/translate.sh");
    }
    assets = new DirectoryAssetManager(assetDirectory);
    surface = new OffscreenSurface(width, height);
    VexelJNI.setAssetManager(assets);
    VexelJNI.setOrientation(0);
    if (!VexelJNI.initFromSurface(surface, width, height)) {
      close();
      throw new HostException(ExitStatus.INTERNAL, "the engine's renderer could not start");
    }
  }

  /**
   * Texts from now on are in {@code language}, in {@code face} (CJK scripts keep the engine's
   * font). Text objects already built keep their font until they are retired.
   */
  public void setLanguage(Language language, Face face) {
    bindFont(language, FontChoice.platformFont(language, face));
  }

  private static void bindFont(Language language, String font) {
    if (font != null) {
      VexelJNI.setTranslationLanguageFont(language.engine, font);
    }
    VexelJNI.setTranslationLanguage(language.engine);
  }

  /**
   * Draws {@code rgba} (the camera frame, 8-bit RGBA as the renderer takes it) with, for each line
   * i, its patch at {@code patchRects} and {@code texts[i]} fitted into {@code textRects} in
   * {@code colors[i]}; returns the drawn frame, RGB.
   */
  public Mat draw(Mat rgba, Overlays overlays) {
    int n = overlays.texts.length;
    VexelJNI.renderOneFrame(rgba.getNativeObjAddr(), overlays.texts, overlays.patchRects,
        overlays.textRects, overlays.ids, overlays.patchAddresses, overlays.colorScales,
        new double[3 * n], overlays.colors);
    // The engine reads the frame by address only; the collector must not free it meanwhile.
    Reference.reachabilityFence(rgba);
    return readBack();
  }

  private Mat readBack() {
    Mat drawn = new Mat(surface.getHeight(), surface.getWidth(), CvType.CV_8UC4);
    drawn.put(0, 0, surface.readPixels());
    Mat rgb = new Mat();
    Imgproc.cvtColor(drawn, rgb, Imgproc.COLOR_RGBA2RGB);
    drawn.release();
    return rgb;
  }

  @Override
  public void close() {
    VexelJNI.shutDown();
    surface.close();
    assets.close();
  }
}
