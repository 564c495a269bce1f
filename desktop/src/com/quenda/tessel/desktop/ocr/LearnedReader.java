package com.quenda.tessel.desktop.ocr;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import java.nio.charset.StandardCharsets;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.List;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;

/**
 * The learned text reader (a detection network, a direction classifier and a line recogniser) in
 * this JVM, through its own small native library. One reader holds its models; it reads one image
 * at a time and must be closed.
 *
 * <p>A line's rectangle is in the image's pixels, y down, the width along the reading direction:
 * an angle near 180 means the text stands upside down (its text is read the right way up).
 */
public final class LearnedReader implements AutoCloseable {
  /** Which recogniser reads the lines (the order is the native side's). */
  public enum Script { LATIN, CHINESE }

  /** A line as found: confidence 0..1, empty text when the reader only detects. */
  public record Line(RotatedRect rect, String text, double confidence) {}

  /** Where setup puts the models, unless the launcher says otherwise. */
  public static final String MODEL_DIR_PROPERTY = "ocr.models";

  /**
   * A picture this large or larger is looked at first at this long side, which finds more of a
   * scene's small text, and again at the detection side when that gives a page.
   */
  public static final int SCENE_LONG_SIDE = 1280;

  private static final String LIBRARY = "ocr_learned_reader";
  private static final int RECT_VALUES = 5;

  private long handle;

  /**
   * Loads the models from {@code modelDir}, for one thread and the default scene side. A model
   * missing or broken is a MISSING_OCR_DATA failure naming the file and what mends it.
   */
  public LearnedReader(Path modelDir, Script script, int detectionLongSide, boolean recognise)
      throws HostException {
    this(modelDir, script, detectionLongSide, SCENE_LONG_SIDE, recognise, 1);
  }

  /**
   * With the scene's long side ({@link #SCENE_LONG_SIDE}, or 0 to look once, at {@code
   * detectionLongSide}: half the detector's time on a 720p frame, fewer small words found) and
   * {@code threads} threads per network run (0: as many as the machine has cores): a photo is
   * read fastest on all of them; a live video's reading on one leaves the others to the frames.
   */
  public LearnedReader(Path modelDir, Script script, int detectionLongSide, int sceneLongSide,
      boolean recognise, int threads) throws HostException {
    loadLibrary();
    try {
      handle = open(modelDir.toString(), script.ordinal(), detectionLongSide, sceneLongSide,
          recognise, threads);
    } catch (ModelFileException e) {
      throw new HostException(ExitStatus.MISSING_OCR_DATA,
          "the text reader cannot load its models: " + e.getMessage()
              + " (run scripts/setup.sh to install them)",
          e);
    }
  }

  /** The model folder named by {@link #MODEL_DIR_PROPERTY}, or a MISSING_OCR_DATA failure. */
  public static Path modelDir() throws HostException {
    String dir = System.getProperty(MODEL_DIR_PROPERTY);
    if (dir == null || dir.isEmpty()) {
      throw new HostException(ExitStatus.MISSING_OCR_DATA,
          "no model folder for the text reader: run the host through scripts/translate.sh, or set -D"
              + MODEL_DIR_PROPERTY);
    }
    return Path.of(dir);
  }

  /** The text lines of an 8-bit RGB or RGBA image, in reading order. */
  public synchronized List<Line> read(Mat rgb) {
    Object[] arrays = read(openHandle(), rgb.nativeObj);
    double[] rects = (double[]) arrays[0];
    byte[][] texts = (byte[][]) arrays[1];
    float[] confidences = (float[]) arrays[2];
    List<Line> lines = new ArrayList<>();
    for (int i = 0; i < texts.length; i++) {
      lines.add(
          new Line(rectAt(rects, i), new String(texts[i], StandardCharsets.UTF_8), confidences[i]));
    }
    return lines;
  }

  /** The pixels under {@code rect} turned upright (reading to the right), {@code height} high. */
  public static Mat uprightCrop(Mat rgb, RotatedRect rect, int height) {
    Mat out = new Mat();
    uprightCrop(rgb.nativeObj,
        new double[] {rect.center.x, rect.center.y, rect.size.width, rect.size.height, rect.angle},
        height, out.nativeObj);
    return out;
  }

  @Override
  public synchronized void close() {
    close(handle);
    handle = 0;
  }

  private long openHandle() {
    if (handle == 0) {
      throw new IllegalStateException("the text reader is closed");
    }
    return handle;
  }

  private static RotatedRect rectAt(double[] r, int i) {
    int k = RECT_VALUES * i;
    return new RotatedRect(new Point(r[k], r[k + 1]), new Size(r[k + 2], r[k + 3]), r[k + 4]);
  }

  private static void loadLibrary() throws HostException {
    try {
      System.loadLibrary(LIBRARY);
    } catch (UnsatisfiedLinkError e) {
      throw new HostException(ExitStatus.MISSING_OCR_DATA,
          "the text reader's library cannot be loaded (" + e.getMessage()
              + "): run scripts/setup.sh, then build",
          e);
    }
  }

  static native long open(String modelDir, int script, int detectionLongSide, int sceneLongSide,
      boolean recognise, int threads) throws ModelFileException;

  /** {double[] 5 per line: cx, cy, w, h, angle; byte[][] UTF-8 texts; float[] confidences}. */
  static native Object[] read(long handle, long imageAddress);

  static native void uprightCrop(long imageAddress, double[] rect, int height, long outAddress);

  static native void close(long handle);
}
