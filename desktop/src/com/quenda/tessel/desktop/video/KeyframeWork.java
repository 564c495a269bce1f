package com.quenda.tessel.desktop.video;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.engine.Eraser;
import com.quenda.tessel.desktop.engine.FontChoice;
import com.quenda.tessel.desktop.engine.FrameMeans;
import com.quenda.tessel.desktop.ocr.PhotoReader;
import com.quenda.tessel.desktop.ocr.RecognizedLine;
import com.quenda.tessel.desktop.photo.StrokeWeight;
import com.quenda.tessel.desktop.translate.Translator;
import java.util.ArrayList;
import java.util.HashMap;
import java.util.List;
import java.util.Locale;
import java.util.Map;
import org.opencv.core.Mat;
import org.opencv.core.RotatedRect;

/**
 * The slow half of the host loop, for one keyframe: read the text, translate what is new, erase
 * the translated lines. On a phone (and with --live) this runs off the frame path, on a worker
 * thread, while frames keep coming; it touches no renderer state.
 */
final class KeyframeWork {
  /**
   * What one keyframe gave: the lines, their translations (null: failed), one patch per translated
   * line in order with the frame's mean colours under them, the stage times, and the weight of the
   * translated lines' strokes (for the font).
   */
  record Result(int frame, List<RecognizedLine> lines, List<String> translations,
      Eraser.Patches patches, double[] means, double ocrMillis, double translateMillis,
      double eraseMillis, FontChoice.Weight weight) {
    /** Where the translated lines were read: what is erased, tracked and drawn. */
    List<RotatedRect> translatedRects() {
      return KeyframeWork.translatedRects(lines, translations);
    }
  }

  private final PhotoReader reader;
  private final Translator translator;
  private final AfterOcr afterOcr;
  // Lines read again at the next keyframe are mostly the same: translate each text once.
  private final Map<String, String> translated = new HashMap<>();

  /** A test's hook after each OCR run of frame {@code frame}: a slow or a held-up OCR. */
  interface AfterOcr {
    void ran(int frame) throws InterruptedException;
  }

  KeyframeWork(PhotoReader reader, Translator translator, AfterOcr afterOcr) {
    this.reader = reader;
    this.translator = translator;
    this.afterOcr = afterOcr;
  }

  /** {@code extraOcrMillis}: a delay added to every OCR run, to try a slow OCR. */
  static AfterOcr delay(long extraOcrMillis) {
    return frame -> {
      if (extraOcrMillis > 0) {
        Thread.sleep(extraOcrMillis);
      }
    };
  }

  synchronized Result run(Mat rgb, int frame) throws HostException {
    long start = System.nanoTime();
    List<RecognizedLine> lines = reader.read(rgb);
    try {
      afterOcr.ran(frame);
    } catch (InterruptedException e) {
      Thread.currentThread().interrupt();
      throw new HostException(ExitStatus.INTERNAL, "interrupted while reading the text");
    }
    long read = System.nanoTime();

    List<String> translations = translate(lines);
    long translatedAt = System.nanoTime();

    List<RotatedRect> rects = translatedRects(lines, translations);
    Eraser.Patches patches = Eraser.erase(rgb, rects);
    double[] means = FrameMeans.under(rgb, patches.patchRects);
    long end = System.nanoTime();
    return new Result(frame, lines, translations, patches, means, (read - start) / 1e6,
        (translatedAt - read) / 1e6, (end - translatedAt) / 1e6,
        FontChoice.weightOf(StrokeWeight.medianRatio(rgb, rects)));
  }

  private List<String> translate(List<RecognizedLine> lines) throws HostException {
    List<String> missing = new ArrayList<>();
    for (RecognizedLine line : lines) {
      if (!translated.containsKey(key(line.text)) && !missing.contains(line.text)) {
        missing.add(line.text);
      }
    }
    List<String> answers = translator.translate(missing);
    for (int i = 0; i < missing.size(); i++) {
      translated.put(key(missing.get(i)), answers.get(i));
    }
    List<String> translations = new ArrayList<>();
    for (RecognizedLine line : lines) {
      translations.add(translated.get(key(line.text)));
    }
    return translations;
  }

  private static List<RotatedRect> translatedRects(
      List<RecognizedLine> lines, List<String> translations) {
    List<RotatedRect> rects = new ArrayList<>();
    for (int i = 0; i < lines.size(); i++) {
      if (translations.get(i) != null) {
        rects.add(lines.get(i).rect);
      }
    }
    return rects;
  }

  static String key(String text) {
    return text.strip().toLowerCase(Locale.ROOT);
  }
}
