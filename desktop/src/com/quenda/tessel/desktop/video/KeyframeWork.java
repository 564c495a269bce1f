package com.quenda.tessel.desktop.video;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import com.quenda.tessel.desktop.engine.Eraser;
import com.quenda.tessel.desktop.engine.FrameMeans;
import com.quenda.tessel.desktop.ocr.PhotoReader;
import com.quenda.tessel.desktop.ocr.RecognizedLine;
import com.quenda.tessel.desktop.translate.Translator;
import com.quenda.tessel.desktop.typeset.Face;
import com.quenda.tessel.desktop.typeset.Typesetter;
import java.util.ArrayList;
import java.util.List;
import java.util.Locale;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * The slow half of the host loop, for one keyframe: read the text, typeset its translation block
 * by block as a photo's is, erase the translated lines. On a phone (and with --live) this runs off
 * the frame path, on a worker thread, while frames keep coming; it touches no renderer state.
 */
final class KeyframeWork {
  /**
   * What one keyframe gave: the lines, how they were typeset (blocks translated whole, each line's
   * share of its block's translation, where to erase and where to draw it), one patch per
   * translated line in order with the frame's mean colours under them, and the stage times.
   */
  record Result(int frame, List<RecognizedLine> lines, Typesetter.Typeset typeset,
      Eraser.Patches patches, double[] means, double ocrMillis, double translateMillis,
      double eraseMillis) {
    /** Per line the text drawn over it; null where its block was not translated. */
    List<String> translations() {
      List<String> texts = new ArrayList<>();
      for (Typesetter.SetLine line : typeset.lines()) {
        texts.add(line.text());
      }
      return texts;
    }

    /** The face line {@code i} is drawn in. */
    Face face(int i) {
      Face face = typeset.blocks().get(typeset.lines().get(i).block()).face();
      return face == null ? Face.SANS : face;
    }

    /** Where the translated lines were read: what is tracked. */
    List<RotatedRect> translatedRects() {
      List<RotatedRect> rects = new ArrayList<>();
      for (int i = 0; i < lines.size(); i++) {
        if (typeset.lines().get(i).text() != null) {
          rects.add(lines.get(i).rect);
        }
      }
      return rects;
    }
  }

  private static final Size WARM_UP_SIZE = new Size(320, 128);

  private final PhotoReader reader;
  private final Typesetter typesetter;
  private final AfterOcr afterOcr;

  /** A test's hook after each OCR run of frame {@code frame}: a slow or a held-up OCR. */
  interface AfterOcr {
    void ran(int frame) throws InterruptedException;
  }

  KeyframeWork(PhotoReader reader, Translator translator, Language target, AfterOcr afterOcr) {
    this.reader = reader;
    this.typesetter = new Typesetter(new RememberingTranslator(translator), target);
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

  /**
   * Does a keyframe's work once on a small sign before the first frame, as an app gets ready
   * before it opens the camera. A first keyframe otherwise waits some 0.5 s longer than the next
   * ones: the translator's programs load their dictionaries, the fonts load, the eraser and the
   * host's code run for the first time.
   */
  void warmUp() throws HostException {
    Mat sign = new Mat(WARM_UP_SIZE, CvType.CV_8UC3, new Scalar(255, 255, 255));
    try {
      Imgproc.putText(sign, "OPEN", new Point(20, 90), Imgproc.FONT_HERSHEY_SIMPLEX, 2.5,
          new Scalar(0, 0, 0), 6);
      // Not a keyframe: the tests' hook after each keyframe's OCR is not called.
      work(sign, -1, frame -> {}).patches().release();
    } finally {
      sign.release();
    }
  }

  Result run(Mat rgb, int frame) throws HostException {
    return work(rgb, frame, afterOcr);
  }

  private synchronized Result work(Mat rgb, int frame, AfterOcr hook) throws HostException {
    long start = System.nanoTime();
    List<RecognizedLine> lines = reader.read(rgb);
    try {
      hook.ran(frame);
    } catch (InterruptedException e) {
      Thread.currentThread().interrupt();
      throw new HostException(ExitStatus.INTERNAL, "interrupted while reading the text");
    }
    long read = System.nanoTime();

    Typesetter.Typeset typeset = typesetter.run(rgb, lines);
    long translatedAt = System.nanoTime();

    Eraser.Patches patches = Eraser.erase(rgb, eraseRects(typeset));
    double[] means = FrameMeans.under(rgb, patches.patchRects);
    long end = System.nanoTime();
    return new Result(frame, lines, typeset, patches, means, (read - start) / 1e6,
        (translatedAt - read) / 1e6, (end - translatedAt) / 1e6);
  }

  /** What is erased around the translated lines: their whole ink, first and last letters too. */
  private static List<RotatedRect> eraseRects(Typesetter.Typeset typeset) {
    List<RotatedRect> rects = new ArrayList<>();
    for (Typesetter.SetLine line : typeset.lines()) {
      if (line.text() != null) {
        rects.add(line.eraseRect());
      }
    }
    return rects;
  }

  static String key(String text) {
    return text.strip().toLowerCase(Locale.ROOT);
  }
}
