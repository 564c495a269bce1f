package com.quenda.tessel.demo;

import com.quenda.tessel.Constants;
import com.quenda.tessel.inpainting.InpaintingJNI;
import java.io.File;
import java.io.IOException;
import java.util.ArrayList;
import java.util.Arrays;
import java.util.List;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.MatOfPoint2f;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgcodecs.Imgcodecs;
import org.opencv.imgproc.Imgproc;

/**
 * Demo step: erases the text of one camera frame the way a phone host asks for it (OCR boxes
 * enlarged by the engine's ratios, one output matrix and one colour per line) and writes a
 * before/after picture: the frame, and the frame with every returned overlay laid over it by its
 * alpha, as the renderer does.
 */
public final class InpaintingDemo {
  /** What the inpainting request returned for one frame. */
  public static final class Result {
    public final int status;
    public final double millis;
    /** The rectangles as sent, after the host's enlargement. */
    public final double[] rects;
    /** Per line: the RGBA overlay (empty when the line could not be erased). */
    public final List<Mat> overlays;
    /** Per line: the text colour, 0xFF000000 | B << 16 | G << 8 | R. */
    public final int[] colors;
    public final File picture;

    Result(
        int status, double millis, double[] rects, List<Mat> overlays, int[] colors, File picture) {
      this.status = status;
      this.millis = millis;
      this.rects = rects;
      this.overlays = overlays;
      this.colors = colors;
      this.picture = picture;
    }
  }

  private InpaintingDemo() {}

  /**
   * Runs the inpainting request on {@code rgbFrame} (8-bit RGB) for the given OCR rectangles (five
   * values each) and writes {@code inpainting.png} (before | after) into {@code outDir}.
   */
  public static Result run(Mat rgbFrame, double[] ocrRects, File outDir) throws IOException {
    double[] rects = enlargeForInpainting(ocrRects);
    int count = rects.length / Constants.getValsPerRect();
    List<Mat> overlays = new ArrayList<>();
    long[] addresses = new long[count];
    for (int i = 0; i < count; i++) {
      Mat overlay = new Mat();
      overlays.add(overlay);
      addresses[i] = overlay.getNativeObjAddr();
    }
    int[] colors = new int[count];

    long start = System.nanoTime();
    int status =
        InpaintingJNI.InpaintingRotRectImg(rgbFrame.getNativeObjAddr(), addresses, rects, colors);
    double millis = (System.nanoTime() - start) / 1e6;

    Mat after = rgbFrame.clone();
    if (status == 0) {
      for (int i = 0; i < count; i++) {
        composite(after, overlays.get(i), rectAt(rects, i));
      }
    }
    Mat sheet = new Mat();
    Core.hconcat(Arrays.asList(label(rgbFrame.clone(), "before"), label(after, "after")), sheet);
    Imgproc.cvtColor(sheet, sheet, Imgproc.COLOR_RGB2BGR);
    File picture = new File(outDir, "inpainting.png");
    if (!Imgcodecs.imwrite(picture.getPath(), sheet)) {
      throw new IOException("cannot write " + picture);
    }
    after.release();
    sheet.release();
    return new Result(status, millis, rects, overlays, colors, picture);
  }

  /** Prints the request's outcome, one line per text line. */
  public static void print(Result result, java.io.PrintStream out) {
    out.printf("inpainting: status %d, %d lines in %.1f ms%n", result.status,
        result.overlays.size(), result.millis);
    for (int i = 0; i < result.overlays.size(); i++) {
      Mat overlay = result.overlays.get(i);
      int c = result.colors[i];
      out.printf("  line %2d: overlay %s, text colour R %3d G %3d B %3d%n", i,
          overlay.empty() ? "empty" : overlay.cols() + "x" + overlay.rows(), c & 0xFF,
          (c >> 8) & 0xFF, (c >> 16) & 0xFF);
    }
  }

  /** The host widens and heightens every OCR box by the engine's ratios before sending it. */
  static double[] enlargeForInpainting(double[] ocrRects) {
    int stride = Constants.getValsPerRect();
    double[] rects = ocrRects.clone();
    for (int i = 0; i + stride <= rects.length; i += stride) {
      rects[i + 2] *= Constants.getInpaintRectWidthRatio();
      rects[i + 3] *= Constants.getInpaintRectHeightRatio();
    }
    return rects;
  }

  private static RotatedRect rectAt(double[] rects, int i) {
    int k = i * Constants.getValsPerRect();
    return new RotatedRect(
        new Point(rects[k], rects[k + 1]), new Size(rects[k + 2], rects[k + 3]), rects[k + 4]);
  }

  /**
   * Lays an overlay over the frame by its alpha. The overlay is the rectangle's upright patch: its
   * corners (0, h), (0, 0), (w, 0) sit on the rectangle's corners 0, 1, 2.
   */
  static void composite(Mat frame, Mat overlay, RotatedRect rect) {
    if (overlay.empty()) {
      return;
    }
    Point[] corners = new Point[4];
    rect.points(corners);
    MatOfPoint2f patchTriangle = new MatOfPoint2f(
        new Point(0, overlay.rows()), new Point(0, 0), new Point(overlay.cols(), 0));
    MatOfPoint2f frameTriangle = new MatOfPoint2f(corners[0], corners[1], corners[2]);
    Mat toFrame = Imgproc.getAffineTransform(patchTriangle, frameTriangle);

    // Premultiplied, so that interpolation at the patch border mixes in no colour from outside.
    Mat premultiplied = new Mat();
    overlay.convertTo(premultiplied, CvType.CV_32FC4, 1.0 / 255);
    List<Mat> channels = new ArrayList<>();
    Core.split(premultiplied, channels);
    for (int c = 0; c < 3; c++) {
      Core.multiply(channels.get(c), channels.get(3), channels.get(c));
    }
    Core.merge(channels, premultiplied);
    Mat warped = new Mat();
    Imgproc.warpAffine(premultiplied, warped, toFrame, frame.size(), Imgproc.INTER_LINEAR,
        Core.BORDER_CONSTANT, Scalar.all(0));

    List<Mat> warpedChannels = new ArrayList<>();
    Core.split(warped, warpedChannels);
    Mat alpha = warpedChannels.remove(3);
    Mat colour = new Mat();
    Core.merge(warpedChannels, colour);
    Mat alpha3 = new Mat();
    Core.merge(Arrays.asList(alpha, alpha, alpha), alpha3);
    Mat keep = new Mat();
    Core.subtract(new Mat(frame.size(), CvType.CV_32FC3, Scalar.all(1)), alpha3, keep);
    Mat base = new Mat();
    frame.convertTo(base, CvType.CV_32FC3, 1.0 / 255);
    Core.multiply(base, keep, base);
    Core.add(base, colour, base);
    base.convertTo(frame, CvType.CV_8UC3, 255);

    for (Mat m : Arrays.asList(patchTriangle, frameTriangle, toFrame, premultiplied, warped, alpha,
             colour, alpha3, keep, base)) {
      m.release();
    }
  }

  private static Mat label(Mat image, String text) {
    Imgproc.putText(image, text, new Point(12, 32), Imgproc.FONT_HERSHEY_SIMPLEX, 1.0,
        new Scalar(255, 255, 255), 4, Imgproc.LINE_AA);
    Imgproc.putText(image, text, new Point(12, 32), Imgproc.FONT_HERSHEY_SIMPLEX, 1.0,
        new Scalar(20, 20, 20), 2, Imgproc.LINE_AA);
    return image;
  }
}
