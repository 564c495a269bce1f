package org.vexel.android;

import com.quenda.tessel.testing.OpenCvHost;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.MatOfPoint;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;
import org.vexel.desktop.DirectoryAssetManager;
import org.vexel.desktop.OffscreenSurface;

/**
 * The renderer on an offscreen surface as a phone host drives it, frames of one camera image and
 * one translated text, and the drawn pixels read back as RGBA matrices and masks of them.
 */
final class OverlayScene implements AutoCloseable {
  static final Scalar BACKGROUND = new Scalar(40, 90, 160, 255);
  // Painted into the camera image where the text stands; the patch must hide it.
  static final Scalar MARKER = new Scalar(30, 200, 60, 255);
  static final Scalar PATCH = new Scalar(230, 200, 40, 255);
  static final int TEXT_COLOR = 0xFF0000FF; // opaque red, 0xAABBGGRR

  final OffscreenSurface surface;
  // The default fonts the build assembled.
  private final DirectoryAssetManager assets =
      new DirectoryAssetManager(System.getProperty("ocr.assets"));

  /** Initialises the renderer on a new surface for camera images of the given size. */
  OverlayScene(int width, int height, int imageWidth, int imageHeight) {
    OpenCvHost.load();
    surface = new OffscreenSurface(width, height);
    VexelJNI.setAssetManager(assets);
    if (!VexelJNI.initFromSurface(surface, imageWidth, imageHeight)) {
      throw new IllegalStateException("initFromSurface failed");
    }
  }

  /** A camera image of the background colour with the marker two pixels inside {@code rect}. */
  static Mat imageWithMarker(int width, int height, RotatedRect rect) {
    Mat image = new Mat(height, width, CvType.CV_8UC4, BACKGROUND);
    Point[] corners = new Point[4];
    new RotatedRect(rect.center, new Size(rect.size.width - 4, rect.size.height - 4), rect.angle)
        .points(corners);
    Imgproc.fillConvexPoly(image, new MatOfPoint(corners), MARKER);
    return image;
  }

  /** One frame with {@code text} in {@code rect} over an upright patch of the rectangle's size. */
  static void renderText(Mat image, String text, RotatedRect rect) {
    Mat patch = new Mat((int) Math.round(rect.size.height), (int) Math.round(rect.size.width),
        CvType.CV_8UC4, PATCH);
    double[] values = {rect.center.x, rect.center.y, rect.size.width, rect.size.height, rect.angle};
    VexelJNI.renderOneFrame(image.getNativeObjAddr(), new String[] {text}, values, values,
        new long[] {1}, new long[] {patch.getNativeObjAddr()}, new double[] {1, 1, 1},
        new double[] {0, 0, 0}, new int[] {TEXT_COLOR});
  }

  static void renderEmpty(Mat image) {
    VexelJNI.renderOneFrame(
        image.getNativeObjAddr(), new String[0], null, null, null, null, null, null, null);
  }

  /** The last frame drawn, RGBA, top row first. */
  Mat pixels() {
    Mat frame = new Mat(surface.getHeight(), surface.getWidth(), CvType.CV_8UC4);
    frame.put(0, 0, surface.readPixels());
    return frame;
  }

  /** 255 where every channel of {@code frame} lies in [low, high]. */
  static Mat inRange(Mat frame, Scalar low, Scalar high) {
    Mat mask = new Mat();
    Core.inRange(frame, low, high, mask);
    return mask;
  }

  /** 255 where the colour lies within {@code tolerance} of {@code colour}, alpha aside. */
  static Mat near(Mat frame, Scalar colour, int tolerance) {
    double[] c = colour.val;
    return inRange(frame, new Scalar(c[0] - tolerance, c[1] - tolerance, c[2] - tolerance, 0),
        new Scalar(c[0] + tolerance, c[1] + tolerance, c[2] + tolerance, 255));
  }

  static Mat marker(Mat frame) {
    return inRange(frame, new Scalar(0, 151, 0, 0), new Scalar(99, 255, 119, 255));
  }

  static Mat red(Mat frame) {
    return inRange(frame, new Scalar(181, 0, 0, 0), new Scalar(255, 79, 79, 255));
  }

  /** Pixels of {@code mask} outside {@code region} grown by {@code margin} in every direction. */
  static int outside(Mat mask, Mat region, int margin) {
    Mat grown = new Mat();
    Imgproc.dilate(region, grown,
        Imgproc.getStructuringElement(
            Imgproc.MORPH_RECT, new Size(2 * margin + 1, 2 * margin + 1)));
    Core.subtract(mask, grown, grown);
    return Core.countNonZero(grown);
  }

  @Override
  public void close() {
    VexelJNI.setOrientation(0); // the orientation outlives the renderer
    VexelJNI.shutDown();
    surface.close();
    assets.close();
  }
}
