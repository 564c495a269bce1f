package com.quenda.tessel.soak;

import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.engine.Eraser;
import com.quenda.tessel.desktop.engine.Overlays;
import com.quenda.tessel.desktop.engine.Rects;
import com.quenda.tessel.desktop.scenes.SceneLine;
import com.quenda.tessel.tracking.TrackingJNI;
import java.lang.ref.Reference;
import java.util.ArrayList;
import java.util.List;
import org.opencv.core.Mat;
import org.opencv.core.RotatedRect;

/**
 * One tracking run over the soak's frames, as a phone host keeps it between two OCR results: the
 * engine's tracker on the lines' known rectangles, each line's place in the latest frame (null
 * once lost) and its latest patch and text colour. Every run gets new line ids, so the renderer's
 * caches drop the previous run's objects and build new ones.
 */
final class TrackedLines implements AutoCloseable {
  // Translations drawn in place of the lines; accents on purpose, for the string conversion.
  private static final String[] TEXTS = {"Salida de emergencia", "Andén 3: trenes al centro",
      "Prohibido fumar", "Información y billetes", "Por favor, no pasar"};

  private final long tracker;
  private final long firstId;
  private final String[] texts;
  private final RotatedRect[] places;
  private final Mat[] patches;
  private final int[] colors;

  /** Starts tracking {@code lines} (all inside the frame) on {@code rgb}, and erases them. */
  TrackedLines(Mat rgb, List<SceneLine> lines, long firstId) throws HostException {
    int n = lines.size();
    this.firstId = firstId;
    texts = new String[n];
    places = new RotatedRect[n];
    patches = new Mat[n];
    colors = new int[n];
    for (int i = 0; i < n; i++) {
      texts[i] = TEXTS[(int) ((firstId + i) % TEXTS.length)];
      places[i] = lines.get(i).rect;
    }
    tracker = TrackingJNI.initializeTracker(rgb.getNativeObjAddr(), Rects.pack(List.of(places)));
    erase(rgb);
  }

  /** Moves every line into {@code rgb}; returns how many are still in view. */
  int track(Mat rgb) {
    double[] rects = TrackingJNI.updateTracker(tracker, rgb.getNativeObjAddr());
    // The engine reads the frame by address only: it must outlive the call.
    Reference.reachabilityFence(rgb);
    int inView = 0;
    for (int i = 0; i < places.length; i++) {
      boolean lost = rects == null || rects[5 * i + 2] == 0 || rects[5 * i + 3] == 0;
      places[i] = lost ? null : Rects.at(rects, i);
      inView += lost ? 0 : 1;
    }
    return inView;
  }

  /** Cuts new patches from {@code rgb} at the lines' tracked places. */
  void erase(Mat rgb) throws HostException {
    List<Integer> visible = visible();
    List<RotatedRect> rects = new ArrayList<>();
    visible.forEach(i -> rects.add(places[i]));
    Eraser.Patches erased = Eraser.erase(rgb, rects);
    for (int j = 0; j < visible.size(); j++) {
      int i = visible.get(j);
      if (patches[i] != null) {
        patches[i].release();
      }
      patches[i] = erased.overlays.get(j);
      colors[i] = erased.colors[j];
    }
  }

  /** What the renderer draws: every line in view that has a patch, at its tracked place. */
  Overlays overlays() {
    List<Integer> drawn = new ArrayList<>();
    for (int i : visible()) {
      if (patches[i] != null) {
        drawn.add(i);
      }
    }
    int n = drawn.size();
    String[] drawnTexts = new String[n];
    long[] ids = new long[n];
    long[] addresses = new long[n];
    int[] drawnColors = new int[n];
    List<RotatedRect> rects = new ArrayList<>();
    for (int j = 0; j < n; j++) {
      int i = drawn.get(j);
      drawnTexts[j] = texts[i];
      ids[j] = firstId + i;
      addresses[j] = patches[i].getNativeObjAddr();
      drawnColors[j] = colors[i];
      rects.add(places[i]);
    }
    double[] textRects = Rects.pack(rects);
    return new Overlays(
        drawnTexts, Eraser.enlarged(textRects), textRects, ids, addresses, drawnColors, null);
  }

  int size() {
    return places.length;
  }

  private List<Integer> visible() {
    List<Integer> visible = new ArrayList<>();
    for (int i = 0; i < places.length; i++) {
      if (places[i] != null) {
        visible.add(i);
      }
    }
    return visible;
  }

  @Override
  public void close() {
    TrackingJNI.releaseTracker(tracker);
    for (Mat patch : patches) {
      if (patch != null) {
        patch.release();
      }
    }
  }
}
