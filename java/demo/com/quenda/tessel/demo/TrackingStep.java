package com.quenda.tessel.demo;

import com.quenda.tessel.tracking.TrackingJNI;
import java.io.File;
import java.io.IOException;
import java.io.PrintStream;
import java.nio.charset.StandardCharsets;
import java.util.ArrayList;
import java.util.List;
import org.opencv.core.Mat;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * Demo step: tracks the OCR rectangles of the first frame through the sequence as a phone host
 * does (initialise on the OCR frame, one update per camera frame, coverage and frame measures
 * per frame), compares them with the known truth and draws a contact sheet.
 */
final class TrackingStep {
  /** Truth drawn in red, tracked rectangles in green (RGB pictures). */
  private static final Scalar TRUTH_COLOUR = new Scalar(230, 40, 40);

  private static final Scalar TRACKED_COLOUR = new Scalar(20, 200, 60);
  private static final int SHEET_FRAMES = 6;

  /** What the host saw on one frame. */
  static final class FrameResult {
    final int frame;
    final double[] tracked;
    final double[] truth;
    final double coverage;
    final double blur;
    final double accuracy;
    final double meanError;
    final double maxError;
    final int zeroRects;

    FrameResult(int frame, double[] tracked, double[] truth, double coverage, double blur,
        double accuracy) {
      this.frame = frame;
      this.tracked = tracked;
      this.truth = truth;
      this.coverage = coverage;
      this.blur = blur;
      this.accuracy = accuracy;
      double sum = 0;
      double max = 0;
      int zeros = 0;
      int count = truth.length / 5;
      for (int i = 0; i < count; ++i) {
        if (RectDrawing.isZero(tracked, i)) {
          ++zeros;
          continue;
        }
        double d = Math.hypot(tracked[5 * i] - truth[5 * i], tracked[5 * i + 1] - truth[5 * i + 1]);
        sum += d;
        max = Math.max(max, d);
      }
      this.meanError = count > zeros ? sum / (count - zeros) : 0;
      this.maxError = max;
      this.zeroRects = zeros;
    }
  }

  private final DemoSequence sequence;

  TrackingStep(DemoSequence sequence) {
    this.sequence = sequence;
  }

  /** Runs the tracker over the whole sequence; the results are one entry per frame. */
  List<FrameResult> run(File outDir) throws IOException {
    List<FrameResult> results = new ArrayList<>();
    Mat first = sequence.frame(0);
    Mat firstRgba = rgba(first);
    double[] ocr = sequence.ocrRects();
    long tracker = TrackingJNI.initializeTracker(first.getNativeObjAddr(), ocr);
    ContactSheet sheet = new ContactSheet(3, new Size(640, 360));
    int sheetStep = Math.max(1, (sequence.frameCount() - 1) / (SHEET_FRAMES - 1));
    try {
      results.add(measure(0, ocr, ocr, TrackingJNI.getCoverageLeft(tracker), firstRgba, firstRgba));
      addToSheet(sheet, first, results.get(0));
      for (int k = 1; k < sequence.frameCount(); ++k) {
        Mat frame = sequence.frame(k);
        Mat frameRgba = rgba(frame);
        double[] tracked = TrackingJNI.updateTracker(tracker, frame.getNativeObjAddr());
        FrameResult result = measure(k, tracked, sequence.truthRects(k),
            TrackingJNI.getCoverageLeft(tracker), firstRgba, frameRgba);
        results.add(result);
        if (k % sheetStep == 0) {
          addToSheet(sheet, frame, result);
        }
        frameRgba.release();
        frame.release();
      }
    } finally {
      TrackingJNI.releaseTracker(tracker);
      firstRgba.release();
      first.release();
    }
    FrameResult last = results.get(results.size() - 1);
    sheet.write(new File(outDir, "tracking.png"),
        String.format("red: true text rectangles; green: tracked from the OCR result of frame 0"
                + "  (final centre error mean %.2f px, max %.2f px)",
            last.meanError, last.maxError));
    writeReport(results, new File(outDir, "tracking.txt"));
    return results;
  }

  private static FrameResult measure(
      int k, double[] tracked, double[] truth, double coverage, Mat ocrRgba, Mat frameRgba) {
    double blur = TrackingJNI.calculateBlur(frameRgba.getNativeObjAddr());
    double accuracy = TrackingJNI.calculateFrameAccuracy(
        ocrRgba.getNativeObjAddr(), frameRgba.getNativeObjAddr());
    return new FrameResult(k, tracked, truth, coverage, blur, accuracy);
  }

  private void addToSheet(ContactSheet sheet, Mat frame, FrameResult result) {
    Mat picture = frame.clone();
    // Thin truth over a wide tracked outline: both stay visible where they agree.
    RectDrawing.outline(picture, result.tracked, TRACKED_COLOUR, 5);
    RectDrawing.outline(picture, result.truth, TRUTH_COLOUR, 2);
    String blurred = sequence.blurSigma(result.frame) > 0 ? ", blurred" : "";
    sheet.add(picture,
        String.format("frame %d%s: error max %.2f px, coverage %.3f", result.frame, blurred,
            result.maxError, result.coverage));
    picture.release();
  }

  private static Mat rgba(Mat rgb) {
    Mat rgba = new Mat();
    Imgproc.cvtColor(rgb, rgba, Imgproc.COLOR_RGB2RGBA);
    return rgba;
  }

  /** The per-frame table, printed and saved beside the picture. */
  static void print(List<FrameResult> results, PrintStream out) {
    out.println("frame  coverage     blur  accuracy  err mean  err max  lost");
    for (FrameResult r : results) {
      out.printf("%5d  %8.3f  %7.2f  %8.4f  %8.2f  %7.2f  %4d%n", r.frame, r.coverage, r.blur,
          r.accuracy, r.meanError, r.maxError, r.zeroRects);
    }
  }

  private static void writeReport(List<FrameResult> results, File file) throws IOException {
    try (PrintStream out = new PrintStream(file, StandardCharsets.UTF_8)) {
      print(results, out);
    }
  }
}
