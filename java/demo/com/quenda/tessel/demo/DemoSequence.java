package com.quenda.tessel.demo;

import java.util.ArrayList;
import java.util.Collections;
import java.util.List;
import java.util.Random;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.Rect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * The demo's deterministic camera input: a printed page with lines of text in several sizes,
 * filmed by a camera that pans, turns a little and zooms in, with a few frames blurred as by
 * camera shake and some sensor noise.
 *
 * <p>The camera motion of frame k is a similarity transform from page to frame coordinates, so
 * the true rectangle of every text line is known in every frame. Rectangles use the bridges'
 * layout: centre x, centre y, width, height (pixels, x right, y down), angle in degrees clockwise
 * on screen. The rectangles of frame 0 stand for the host's OCR result.
 */
public final class DemoSequence {
  /** One printed line: its text and its upright box on the page. */
  public static final class TextLine {
    public final String text;
    public final Rect pageBox;

    TextLine(String text, Rect pageBox) {
      this.text = text;
      this.pageBox = pageBox;
    }
  }

  private static final double PAGE_SCALE = 1.5;
  private static final int TEXT_PADDING = 4;
  private static final int[] FONTS = {Imgproc.FONT_HERSHEY_SIMPLEX, Imgproc.FONT_HERSHEY_DUPLEX,
      Imgproc.FONT_HERSHEY_COMPLEX, Imgproc.FONT_HERSHEY_TRIPLEX};
  private static final Scalar[] INKS = {
      new Scalar(25, 25, 30), new Scalar(30, 45, 125), new Scalar(120, 25, 25)};

  private final Size frameSize;
  private final int frameCount;
  private final long seed;
  private final double panX;
  private final double panY;
  private final double rotationDeg;
  private final double zoom;
  private final Mat page;
  private final List<TextLine> lines = new ArrayList<>();

  /** The default demo input: 1280 x 720, 31 frames, ten lines of text. */
  public static DemoSequence createDefault() {
    return new DemoSequence(new Size(1280, 720), 31, 10, 20240611L, -90, 40, 6.0, 1.2);
  }

  /**
   * @param panX horizontal camera pan over the whole sequence, pixels
   * @param panY vertical camera pan over the whole sequence, pixels
   * @param rotationDeg rotation over the whole sequence, degrees clockwise on screen
   * @param zoom scale of the last frame relative to the first
   */
  public DemoSequence(Size frameSize, int frameCount, int lineCount, long seed, double panX,
      double panY, double rotationDeg, double zoom) {
    this.frameSize = frameSize;
    this.frameCount = frameCount;
    this.seed = seed;
    this.panX = panX;
    this.panY = panY;
    this.rotationDeg = rotationDeg;
    this.zoom = zoom;
    this.page = printPage(lineCount);
  }

  public int frameCount() {
    return frameCount;
  }

  public Size frameSize() {
    return frameSize;
  }

  public List<TextLine> lines() {
    return Collections.unmodifiableList(lines);
  }

  /** Frame k as a new 8-bit RGB matrix; the caller releases it. */
  public Mat frame(int k) {
    Mat motion = motion(k);
    Mat frame = new Mat();
    Imgproc.warpAffine(
        page, frame, motion, frameSize, Imgproc.INTER_LINEAR, Core.BORDER_REFLECT_101);
    motion.release();
    double sigma = blurSigma(k);
    if (sigma > 0) {
      Imgproc.GaussianBlur(frame, frame, new Size(0, 0), sigma);
    }
    addNoise(frame, 2.0, seed * 31 + k);
    return frame;
  }

  /** Gaussian blur applied to frame k, 0 for a sharp frame. */
  public double blurSigma(int k) {
    return k % 7 == 4 ? 1.6 : 0.0;
  }

  /** The true rectangles of all lines in frame k, five values per line. */
  public double[] truthRects(int k) {
    double[] m = motionValues(k);
    double scale = Math.hypot(m[0], m[3]);
    double angle = Math.toDegrees(Math.atan2(m[3], m[0]));
    double[] rects = new double[5 * lines.size()];
    for (int i = 0; i < lines.size(); ++i) {
      Rect box = lines.get(i).pageBox;
      double cx = box.x + box.width * 0.5;
      double cy = box.y + box.height * 0.5;
      rects[5 * i] = m[0] * cx + m[1] * cy + m[2];
      rects[5 * i + 1] = m[3] * cx + m[4] * cy + m[5];
      rects[5 * i + 2] = box.width * scale;
      rects[5 * i + 3] = box.height * scale;
      rects[5 * i + 4] = angle;
    }
    return rects;
  }

  /** The host's OCR result on the first frame. */
  public double[] ocrRects() {
    return truthRects(0);
  }

  /** Page-to-frame transform of frame k as a 2 x 3 CV_64F matrix; the caller releases it. */
  public Mat motion(int k) {
    Mat m = new Mat(2, 3, CvType.CV_64F);
    m.put(0, 0, motionValues(k));
    return m;
  }

  private double[] motionValues(int k) {
    double t = frameCount > 1 ? (double) k / (frameCount - 1) : 0.0;
    double e = 0.5 - 0.5 * Math.cos(Math.PI * t); // smooth start and stop
    double s = 1.0 + (zoom - 1.0) * e;
    double a = Math.toRadians(rotationDeg * e);
    double c = s * Math.cos(a);
    double n = s * Math.sin(a);
    double pageCx = page.cols() * 0.5;
    double pageCy = page.rows() * 0.5;
    double tx = frameSize.width * 0.5 + panX * e;
    double ty = frameSize.height * 0.5 + panY * e;
    return new double[] {c, -n, tx - c * pageCx + n * pageCy, n, c, ty - n * pageCx - c * pageCy};
  }

  private Mat printPage(int lineCount) {
    Random random = new Random(seed);
    int pageW = (int) (frameSize.width * PAGE_SCALE);
    int pageH = (int) (frameSize.height * PAGE_SCALE);
    Mat paper = new Mat(pageH, pageW, CvType.CV_8UC3);
    for (int y = 0; y < pageH; ++y) {
      double shade = 12.0 * y / pageH;
      paper.row(y).setTo(new Scalar(236 - shade, 231 - shade, 214 - shade));
    }
    addNoise(paper, 3.0, seed);

    double viewW = frameSize.width * 0.72;
    double viewH = frameSize.height * 0.74;
    double slotH = viewH / Math.max(1, lineCount);
    double left0 = pageW * 0.5 - viewW * 0.5;
    double top0 = pageH * 0.5 - viewH * 0.5;
    for (int i = 0; i < lineCount; ++i) {
      int font = FONTS[i % FONTS.length];
      int thickness = 1 + i % 3;
      // Hershey glyphs are about 30 px tall (baseline included) at scale 1.
      double scale = Math.max(0.35, slotH * 0.65 / 30.0) * (0.5 + 0.5 * random.nextDouble());
      String text = Translations.source(i);
      double widthAtUnitScale = Imgproc.getTextSize(text, font, 1.0, thickness, null).width;
      scale = Math.min(scale, viewW * 0.95 / widthAtUnitScale);
      int[] baseline = new int[1];
      Size size = Imgproc.getTextSize(text, font, scale, thickness, baseline);
      double left = left0 + random.nextDouble() * Math.max(1.0, viewW - size.width);
      double baseY = top0 + slotH * i + (slotH + size.height - baseline[0]) * 0.5;
      Point origin = new Point(Math.round(left), Math.round(baseY));
      Imgproc.putText(
          paper, text, origin, font, scale, INKS[i % INKS.length], thickness, Imgproc.LINE_AA);
      lines.add(new TextLine(text,
          new Rect((int) origin.x - TEXT_PADDING, (int) (origin.y - size.height) - TEXT_PADDING,
              (int) size.width + 2 * TEXT_PADDING,
              (int) size.height + baseline[0] + 2 * TEXT_PADDING)));
    }
    return paper;
  }

  private static void addNoise(Mat image, double sigma, long noiseSeed) {
    Core.setRNGSeed((int) noiseSeed);
    Mat noise = new Mat(image.size(), CvType.CV_16SC3);
    Core.randn(noise, 0, sigma);
    Mat wide = new Mat();
    image.convertTo(wide, CvType.CV_16SC3);
    Core.add(wide, noise, wide);
    wide.convertTo(image, CvType.CV_8UC3);
    noise.release();
    wide.release();
  }
}
