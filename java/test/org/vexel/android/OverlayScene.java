package org.vexel.android;

import com.quenda.tessel.testing.OpenCvHost;
import java.util.ArrayList;
import java.util.List;
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
 * The renderer on an offscreen surface as a phone host drives it, with frames built from one
 * camera image and one translated text, and the drawn pixels read back.
 */
final class OverlayScene implements AutoCloseable {
  static final Scalar BACKGROUND = new Scalar(40, 90, 160, 255);
  // Painted into the camera image where the text stands; the patch must hide it.
  static final Scalar MARKER = new Scalar(30, 200, 60, 255);
  static final Scalar PATCH = new Scalar(230, 200, 40, 255);
  static final int TEXT_COLOR = 0xFF0000FF; // opaque red, 0xAABBGGRR

  final OffscreenSurface surface;
  private final List<Mat> mats = new ArrayList<>();

  /** The asset directory the build assembled (default fonts). */
  static DirectoryAssetManager assets() {
    String directory = System.getProperty("ocr.assets");
    if (directory == null || directory.isEmpty()) {
      throw new IllegalStateException("ocr.assets is not set; run the test through ctest");
    }
    return new DirectoryAssetManager(directory);
  }

  OverlayScene(int width, int height) {
    OpenCvHost.load();
    surface = new OffscreenSurface(width, height);
  }

  Mat mat(Mat mat) {
    mats.add(mat);
    return mat;
  }

  /** A camera image of the background colour with the marker painted over {@code rect}. */
  Mat imageWithMarker(int width, int height, RotatedRect rect) {
    Mat image = mat(new Mat(height, width, CvType.CV_8UC4, BACKGROUND));
    // Two pixels inside the rectangle, so that only the patch's own edge can matter.
    RotatedRect inner = new RotatedRect(
        rect.center, new Size(rect.size.width - 4, rect.size.height - 4), rect.angle);
    Point[] corners = new Point[4];
    inner.points(corners);
    Imgproc.fillConvexPoly(image, new MatOfPoint(corners), MARKER);
    return image;
  }

  /** An upright RGBA patch of the rectangle's size in the patch colour. */
  Mat patch(RotatedRect rect) {
    return mat(new Mat((int) Math.round(rect.size.height), (int) Math.round(rect.size.width),
        CvType.CV_8UC4, PATCH));
  }

  static double[] values(RotatedRect rect) {
    return new double[] {
        rect.center.x, rect.center.y, rect.size.width, rect.size.height, rect.angle};
  }

  /** One frame with one text and its patch, colour uncorrected. */
  void renderText(Mat image, String text, RotatedRect rect, long id) {
    Mat patch = patch(rect);
    VexelJNI.renderOneFrame(image.getNativeObjAddr(), new String[] {text}, values(rect),
        values(rect), new long[] {id}, new long[] {patch.getNativeObjAddr()},
        new double[] {1, 1, 1}, new double[] {0, 0, 0}, new int[] {TEXT_COLOR});
  }

  void renderEmpty(Mat image) {
    VexelJNI.renderOneFrame(
        image.getNativeObjAddr(), new String[0], null, null, null, null, null, null, null);
  }

  Pixels pixels() {
    return new Pixels(surface.readPixels(), surface.getWidth(), surface.getHeight());
  }

  @Override
  public void close() {
    for (Mat mat : mats) {
      mat.release();
    }
    surface.close();
  }

  /** A frame read back from the surface: RGBA, top row first. */
  static final class Pixels {
    final byte[] rgba;
    final int width;
    final int height;

    Pixels(byte[] rgba, int width, int height) {
      this.rgba = rgba;
      this.width = width;
      this.height = height;
    }

    int channel(int x, int y, int c) {
      return rgba[(y * width + x) * 4 + c] & 0xFF;
    }

    boolean near(int x, int y, Scalar colour, int tolerance) {
      for (int c = 0; c < 3; ++c) {
        if (Math.abs(channel(x, y, c) - colour.val[c]) > tolerance) {
          return false;
        }
      }
      return true;
    }

    boolean isMarker(int x, int y) {
      return channel(x, y, 1) > 150 && channel(x, y, 0) < 100 && channel(x, y, 2) < 120;
    }

    boolean isRed(int x, int y) {
      return channel(x, y, 0) > 180 && channel(x, y, 1) < 80 && channel(x, y, 2) < 80;
    }

    /** A mask (CV_8U, 255 where the test holds) of this frame. */
    Mat mask(java.util.function.BiPredicate<Integer, Integer> test) {
      Mat mask = Mat.zeros(height, width, CvType.CV_8U);
      byte[] row = new byte[width];
      for (int y = 0; y < height; ++y) {
        for (int x = 0; x < width; ++x) {
          row[x] = (byte) (test.test(x, y) ? 255 : 0);
        }
        mask.put(y, 0, row);
      }
      return mask;
    }
  }

  /** {@code mask} grown by {@code pixels} in every direction. */
  static Mat grown(Mat mask, int pixels) {
    Mat out = new Mat();
    Imgproc.dilate(mask, out,
        Imgproc.getStructuringElement(
            Imgproc.MORPH_RECT, new Size(2 * pixels + 1, 2 * pixels + 1)));
    return out;
  }

  /** The bytes of a CV_8U mask, row by row. */
  static byte[] bytes(Mat mask) {
    byte[] values = new byte[(int) mask.total()];
    mask.get(0, 0, values);
    return values;
  }
}
