package com.quenda.tessel.desktop.photo;

import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import com.quenda.tessel.desktop.Progress;
import com.quenda.tessel.desktop.engine.Eraser;
import com.quenda.tessel.desktop.engine.OverlayDrawer;
import com.quenda.tessel.desktop.engine.Overlays;
import com.quenda.tessel.desktop.engine.Rects;
import com.quenda.tessel.desktop.ocr.PhotoReader;
import com.quenda.tessel.desktop.ocr.RecognizedLine;
import com.quenda.tessel.desktop.translate.Translator;
import com.quenda.tessel.desktop.typeset.Face;
import com.quenda.tessel.desktop.typeset.Typesetter;
import java.util.ArrayList;
import java.util.LinkedHashMap;
import java.util.List;
import java.util.Map;
import org.opencv.core.Mat;
import org.opencv.core.RotatedRect;
import org.opencv.imgproc.Imgproc;

/**
 * Translates one photo in place, in the order a phone host works on a frame: read the text lines
 * (OCR), translate them block by block and typeset each translation over its block, erase the
 * translated lines through the engine's inpainting bridge, and draw the frame with the patches and
 * the translations through its renderer bridge.
 */
public final class PhotoJob {
  private final PhotoReader reader;
  private final Translator translator;
  private final Language target;

  public PhotoJob(PhotoReader reader, Translator translator, Language target) {
    this.reader = reader;
    this.translator = translator;
    this.target = target;
  }

  /** The photo translated; the caller releases the result's images. */
  public PhotoResult run(PhotoInput input, Progress progress) throws HostException {
    Mat rgb = input.decode();
    try {
      return translate(input, rgb, progress);
    } catch (HostException | RuntimeException | Error e) {
      rgb.release(); // only a result takes the decoded image over
      throw e;
    }
  }

  private PhotoResult translate(PhotoInput input, Mat rgb, Progress progress) throws HostException {
    StageTimes times = new StageTimes();

    progress.show(input.name + ": reading the text");
    List<RecognizedLine> lines = reader.read(rgb);
    times.end("ocr");

    progress.step(input.name + ": translating " + lines.size() + " lines");
    Typesetter.Typeset typeset = new Typesetter(translator, target).run(rgb, lines);
    times.end("translate");

    // Lines of blocks that failed to translate stay as they are: neither erased nor drawn over.
    List<Integer> shown = new ArrayList<>();
    List<RotatedRect> eraseRects = new ArrayList<>();
    for (int i = 0; i < lines.size(); i++) {
      if (typeset.lines().get(i).text() != null) {
        shown.add(i);
        eraseRects.add(typeset.lines().get(i).eraseRect());
      }
    }
    progress.step(input.name + ": erasing " + shown.size() + " lines");
    Eraser.Patches patches = Eraser.erase(rgb, eraseRects);
    times.end("erase");

    progress.step(input.name + ": drawing");
    Mat drawn;
    try {
      drawn = shown.isEmpty() ? rgb.clone() : draw(rgb, typeset, shown, patches);
    } finally {
      patches.release();
    }
    times.end("draw");
    progress.step(input.name + ": writing");

    List<LineResult> results = new ArrayList<>();
    for (int i = 0, k = 0; i < lines.size(); i++) {
      boolean translated = typeset.lines().get(i).text() != null;
      results.add(LineResult.of(lines.get(i), typeset, i, translated ? patches.colors[k++] : 0));
    }
    return new PhotoResult(input, rgb, drawn, results, typeset.blocks(), times);
  }

  /**
   * Draws the shown lines over the frame, one pass per face: the renderer draws a frame's texts
   * in the one font bound to the language, so each pass binds a face and draws its lines over
   * what the passes before drew.
   */
  private Mat draw(Mat rgb, Typesetter.Typeset typeset, List<Integer> shown, Eraser.Patches patches)
      throws HostException {
    Map<Face, List<Integer>> byFace = new LinkedHashMap<>();
    for (int k = 0; k < shown.size(); k++) {
      Face face = typeset.blocks().get(typeset.lines().get(shown.get(k)).block()).face();
      byFace.computeIfAbsent(face == null ? Face.SANS : face, f -> new ArrayList<>()).add(k);
    }
    try (OverlayDrawer drawer = new OverlayDrawer(rgb.cols(), rgb.rows())) {
      Mat drawn = rgb.clone();
      for (Map.Entry<Face, List<Integer>> pass : byFace.entrySet()) {
        drawer.setLanguage(target, pass.getKey());
        Mat rgba = new Mat();
        Imgproc.cvtColor(drawn, rgba, Imgproc.COLOR_RGB2RGBA);
        drawn.release();
        drawn = drawer.draw(rgba, overlays(typeset, shown, pass.getValue(), patches));
        rgba.release();
      }
      return drawn;
    }
  }

  /** The overlays of the shown lines numbered {@code picked} (indices into {@code shown}). */
  private static Overlays overlays(Typesetter.Typeset typeset, List<Integer> shown,
      List<Integer> picked, Eraser.Patches patches) {
    int n = picked.size();
    String[] texts = new String[n];
    List<RotatedRect> textRects = new ArrayList<>();
    double[] patchRects = new double[5 * n];
    long[] ids = new long[n];
    long[] addresses = new long[n];
    int[] colors = new int[n];
    long[] allAddresses = patches.addresses();
    for (int j = 0; j < n; j++) {
      int k = picked.get(j);
      Typesetter.SetLine line = typeset.lines().get(shown.get(k));
      texts[j] = line.text();
      textRects.add(line.textRect());
      System.arraycopy(patches.patchRects, 5 * k, patchRects, 5 * j, 5);
      ids[j] = k;
      addresses[j] = allAddresses[k];
      colors[j] = patches.colors[k];
    }
    return new Overlays(texts, patchRects, Rects.pack(textRects), ids, addresses, colors, null);
  }
}
