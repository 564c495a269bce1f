package com.quenda.tessel.demo;

import com.quenda.tessel.inpainting.InpaintingJNI;
import java.awt.image.BufferedImage;
import java.awt.image.DataBufferByte;
import java.io.File;
import java.io.IOException;
import java.util.ArrayList;
import java.util.Arrays;
import java.util.List;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.Rect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;
import org.vexel.android.VexelJNI;
import org.vexel.desktop.DirectoryAssetManager;
import org.vexel.desktop.OffscreenSurface;

/**
 * Demo step: what the user sees. The text lines of the OCR frame were inpainted once (the
 * inpainting step), as a phone host does when the translations arrive; now every camera frame is
 * drawn through the renderer bridge: the camera image, each line's patch at its tracked place,
 * colour-matched to the frame, and the translated string over it. Writes an animated picture of
 * the whole sequence (the language changes every third of it) and a still of the first frame,
 * original against translated.
 */
final class TranslationStep {
  private static final Size GIF_FRAME = new Size(640, 360);
  private static final int GIF_CAPTION = 24;
  private static final int GIF_DELAY_MS = 150;
  private static final Size STILL_TILE = new Size(960, 540);

  /** What the step did, for the demo's report. */
  static final class Summary {
    final int frames;
    final int lines;
    final double medianRenderMillis;
    final File still;
    final File animation;

    Summary(int frames, int lines, double medianRenderMillis, File still, File animation) {
      this.frames = frames;
      this.lines = lines;
      this.medianRenderMillis = medianRenderMillis;
      this.still = still;
      this.animation = animation;
    }
  }

  private final DemoSequence sequence;
  private final List<TrackingStep.FrameResult> tracking;
  private final int lineCount;

  // Per line, from the OCR frame: the inpainted patch, its text colour and the frame's mean
  // colour under it (the reference of the colour matching).
  private final long[] patchAddresses;
  private final int[] textColours;
  private double[] referenceMeans;

  /** {@code inpainting}: the inpainting step's result on frame 0, one overlay per line. */
  TranslationStep(DemoSequence sequence, List<TrackingStep.FrameResult> tracking,
      InpaintingDemo.Result inpainting) {
    this.sequence = sequence;
    this.tracking = tracking;
    this.lineCount = inpainting.overlays.size();
    patchAddresses = new long[lineCount];
    for (int i = 0; i < lineCount; ++i) {
      patchAddresses[i] = inpainting.overlays.get(i).getNativeObjAddr();
    }
    textColours = inpainting.colors.clone();
    Mat first = sequence.frame(0);
    referenceMeans = means(first, inpainting.rects);
    first.release();
  }

  Summary run(File outDir) throws IOException {
    int width = (int) sequence.frameSize().width;
    int height = (int) sequence.frameSize().height;
    Mat first = sequence.frame(0);
    File still = new File(outDir, "translation_first_frame.png");
    File animation = new File(outDir, "translation.gif");

    double[] millis = new double[sequence.frameCount()];
    try (DirectoryAssetManager assets = new DirectoryAssetManager(assetDirectory());
         OffscreenSurface surface = new OffscreenSurface(width, height)) {
      VexelJNI.setAssetManager(assets);
      if (!VexelJNI.initFromSurface(surface, width, height)) {
        throw new IllegalStateException("the renderer could not be initialised");
      }
      try {
        writeStill(first, surface, still);
        writeAnimation(first, surface, animation, millis);
      } finally {
        VexelJNI.shutDown();
      }
    } finally {
      first.release();
    }
    return new Summary(sequence.frameCount(), lineCount, median(millis), still, animation);
  }

  /** Prints what the step drew. */
  static void print(Summary summary, java.io.PrintStream out) {
    out.printf("translation: %d frames, %d lines in %s; renderOneFrame median %.1f ms (headless)%n",
        summary.frames, summary.lines, String.join(", ", Translations.LANGUAGES),
        summary.medianRenderMillis);
  }

  private static String assetDirectory() {
    String directory = System.getProperty("ocr.assets");
    if (directory == null || directory.isEmpty()) {
      throw new IllegalStateException("ocr.assets is not set; run the demo through run-demo.sh");
    }
    return directory;
  }

  /** Frame 0 untouched and translated into each language, as one picture. */
  private void writeStill(Mat first, OffscreenSurface surface, File file) {
    ContactSheet sheet = new ContactSheet(2, STILL_TILE);
    sheet.add(first, "original camera frame 0");
    for (String language : Translations.LANGUAGES) {
      VexelJNI.setTranslationLanguage(language);
      render(first, 0, language);
      Mat drawn = readRgb(surface);
      sheet.add(drawn, "translated into " + language + " (same frame)");
      drawn.release();
    }
    sheet.write(file, "patches from the inpainting bridge, texts fitted into the OCR rectangles");
  }

  /** Every frame of the sequence, the language changing every third of it. */
  private void writeAnimation(Mat first, OffscreenSurface surface, File file, double[] millis)
      throws IOException {
    String language = null;
    int languages = Translations.LANGUAGES.size();
    try (AnimatedGif gif = new AnimatedGif(file, GIF_DELAY_MS)) {
      for (int k = 0; k < sequence.frameCount(); ++k) {
        String wanted = Translations.LANGUAGES.get(k * languages / sequence.frameCount());
        if (!wanted.equals(language)) {
          language = wanted;
          VexelJNI.setTranslationLanguage(language);
        }
        Mat frame = k == 0 ? first : sequence.frame(k);
        long start = System.nanoTime();
        render(frame, k, language);
        millis[k] = (System.nanoTime() - start) / 1e6;
        Mat drawn = readRgb(surface);
        gif.add(gifFrame(drawn, String.format("frame %d   %s", k, language)));
        drawn.release();
        if (frame != first) {
          frame.release();
        }
      }
    }
  }

  /** One renderOneFrame call for frame k with the lines the tracker still holds. */
  private void render(Mat frame, int k, String language) {
    double[] tracked = tracking.get(k).tracked;
    List<Integer> shown = new ArrayList<>();
    for (int i = 0; i < lineCount; ++i) {
      if (!RectDrawing.isZero(tracked, i)) {
        shown.add(i);
      }
    }
    int n = shown.size();
    String[] texts = new String[n];
    double[] textRects = new double[5 * n];
    long[] ids = new long[n];
    long[] patchMats = new long[n];
    int[] colours = new int[n];
    for (int j = 0; j < n; ++j) {
      int i = shown.get(j);
      texts[j] = Translations.of(i, language);
      System.arraycopy(tracked, 5 * i, textRects, 5 * j, 5);
      ids[j] = i;
      patchMats[j] = patchAddresses[i];
      colours[j] = textColours[i];
    }
    double[] patchRects = InpaintingDemo.enlargeForInpainting(textRects);
    double[] scales = gains(frame, patchRects, shown);
    VexelJNI.renderOneFrame(frame.getNativeObjAddr(), texts, patchRects, textRects, ids, patchMats,
        scales, new double[3 * n], colours);
  }

  /**
   * Per-channel gains that carry the OCR frame's colours under each line to this frame's:
   * exposure changes multiply colours, and the mean (unlike the spread, which blur lowers) stays
   * put when the camera shakes.
   */
  private double[] gains(Mat frame, double[] patchRects, List<Integer> shown) {
    double[] now = means(frame, patchRects);
    double[] gains = new double[now.length];
    for (int j = 0; j < shown.size(); ++j) {
      for (int c = 0; c < 3; ++c) {
        double reference = referenceMeans[3 * shown.get(j) + c];
        gains[3 * j + c] = reference > 1.0 ? now[3 * j + c] / reference : 1.0;
      }
    }
    return gains;
  }

  /** Mean colour under each rectangle, asked the way the request wants it: half-size frame. */
  private static double[] means(Mat frame, double[] rects) {
    int n = rects.length / 5;
    double[] means = new double[3 * n];
    double[] deviations = new double[3 * n];
    if (n > 0) {
      Mat half = new Mat();
      Imgproc.resize(
          frame, half, new Size(frame.cols() / 2, frame.rows() / 2), 0, 0, Imgproc.INTER_AREA);
      InpaintingJNI.CalculateMeansStdDevs(half.getNativeObjAddr(), rects, means, deviations);
      half.release();
    }
    return means;
  }

  /** The surface's last frame as an RGB matrix; the caller releases it. */
  private static Mat readRgb(OffscreenSurface surface) {
    Mat rgba = new Mat(surface.getHeight(), surface.getWidth(), CvType.CV_8UC4);
    rgba.put(0, 0, surface.readPixels());
    Mat rgb = new Mat();
    Imgproc.cvtColor(rgba, rgb, Imgproc.COLOR_RGBA2RGB);
    rgba.release();
    return rgb;
  }

  /** A scaled-down frame under a caption bar, as the GIF writer takes it. */
  private static BufferedImage gifFrame(Mat rgb, String caption) {
    int w = (int) GIF_FRAME.width;
    int h = (int) GIF_FRAME.height;
    Mat canvas = new Mat(h + GIF_CAPTION, w, CvType.CV_8UC3, new Scalar(40, 40, 40));
    Mat area = canvas.submat(new Rect(0, GIF_CAPTION, w, h));
    Imgproc.resize(rgb, area, GIF_FRAME, 0, 0, Imgproc.INTER_AREA);
    area.release();
    Imgproc.putText(canvas, caption, new Point(8, GIF_CAPTION - 7), Imgproc.FONT_HERSHEY_SIMPLEX,
        0.5, new Scalar(255, 255, 255), 1, Imgproc.LINE_AA);
    Mat bgr = new Mat();
    Imgproc.cvtColor(canvas, bgr, Imgproc.COLOR_RGB2BGR);
    BufferedImage image = new BufferedImage(bgr.cols(), bgr.rows(), BufferedImage.TYPE_3BYTE_BGR);
    bgr.get(0, 0, ((DataBufferByte) image.getRaster().getDataBuffer()).getData());
    bgr.release();
    canvas.release();
    return image;
  }

  private static double median(double[] values) {
    double[] sorted = values.clone();
    Arrays.sort(sorted);
    return sorted.length == 0 ? 0 : sorted[sorted.length / 2];
  }
}
