package com.quenda.tessel.desktop.photo;

import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import com.quenda.tessel.desktop.Progress;
import com.quenda.tessel.desktop.engine.Eraser;
import com.quenda.tessel.desktop.engine.FontChoice;
import com.quenda.tessel.desktop.engine.OverlayDrawer;
import com.quenda.tessel.desktop.engine.Overlays;
import com.quenda.tessel.desktop.engine.Rects;
import com.quenda.tessel.desktop.engine.TextPlacement;
import com.quenda.tessel.desktop.ocr.PhotoReader;
import com.quenda.tessel.desktop.ocr.RecognizedLine;
import com.quenda.tessel.desktop.translate.Translator;
import java.util.ArrayList;
import java.util.List;
import org.opencv.core.Mat;
import org.opencv.core.RotatedRect;
import org.opencv.imgproc.Imgproc;

/**
 * Translates one photo in place, in the order a phone host works on a frame: read the text lines
 * (OCR), translate them, erase the translated ones through the engine's inpainting bridge, and
 * draw the frame with the patches and the translations through its renderer bridge.
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
    List<String> translations = translator.translate(texts(lines));
    times.end("translate");

    // Lines that failed to translate stay as they are: neither erased nor drawn over.
    List<RecognizedLine> shown = new ArrayList<>();
    List<String> shownTranslations = new ArrayList<>();
    for (int i = 0; i < lines.size(); i++) {
      if (translations.get(i) != null) {
        shown.add(lines.get(i));
        shownTranslations.add(translations.get(i));
      }
    }
    progress.step(input.name + ": erasing " + shown.size() + " lines");
    Eraser.Patches patches = Eraser.erase(rgb, rects(shown));
    times.end("erase");

    progress.step(input.name + ": drawing");
    Mat drawn;
    try {
      drawn = shown.isEmpty() ? rgb.clone() : draw(rgb, shown, shownTranslations, patches);
    } finally {
      patches.release();
    }
    times.end("draw");
    progress.step(input.name + ": writing");

    List<LineResult> results = new ArrayList<>();
    for (int i = 0, k = 0; i < lines.size(); i++) {
      boolean translated = translations.get(i) != null;
      results.add(
          new LineResult(lines.get(i), translations.get(i), translated ? patches.colors[k++] : 0));
    }
    return new PhotoResult(input, rgb, drawn, results, times);
  }

  private Mat draw(Mat rgb, List<RecognizedLine> shown, List<String> translations,
      Eraser.Patches patches) throws HostException {
    int n = shown.size();
    long[] ids = new long[n];
    List<RotatedRect> textRects = new ArrayList<>();
    for (int i = 0; i < n; i++) {
      ids[i] = i;
      textRects.add(
          TextPlacement.textRect(shown.get(i).rect, shown.get(i).text, translations.get(i)));
    }
    Overlays overlays = new Overlays(translations.toArray(new String[0]), patches.patchRects,
        Rects.pack(textRects), ids, patches.addresses(), patches.colors, null);
    try (OverlayDrawer drawer = new OverlayDrawer(rgb.cols(), rgb.rows())) {
      drawer.setLanguage(target, FontChoice.weightOf(StrokeWeight.medianRatio(rgb, rects(shown))));
      Mat rgba = new Mat();
      Imgproc.cvtColor(rgb, rgba, Imgproc.COLOR_RGB2RGBA);
      Mat drawn = drawer.draw(rgba, overlays);
      rgba.release();
      return drawn;
    }
  }

  private static List<String> texts(List<RecognizedLine> lines) {
    List<String> texts = new ArrayList<>();
    for (RecognizedLine line : lines) {
      texts.add(line.text);
    }
    return texts;
  }

  private static List<RotatedRect> rects(List<RecognizedLine> lines) {
    List<RotatedRect> rects = new ArrayList<>();
    for (RecognizedLine line : lines) {
      rects.add(line.rect);
    }
    return rects;
  }
}
