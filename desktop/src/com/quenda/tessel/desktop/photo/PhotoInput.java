package com.quenda.tessel.desktop.photo;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import java.io.IOException;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.Iterator;
import javax.imageio.ImageIO;
import javax.imageio.ImageReader;
import javax.imageio.stream.ImageInputStream;
import org.opencv.core.Mat;
import org.opencv.imgcodecs.Imgcodecs;
import org.opencv.imgproc.Imgproc;

/** An input image, checked and decoded before any work starts. */
public final class PhotoInput {
  // The drawing surface and the engine's patches are sized by the image; beyond this a frame no
  // longer fits the renderer's offscreen surface.
  static final int MAX_SIDE = 8192;

  public final Path path;
  /** The file name without its extension: the outputs' base name. */
  public final String name;

  private PhotoInput(Path path) {
    this.path = path;
    String file = path.getFileName().toString();
    int dot = file.lastIndexOf('.');
    this.name = dot > 0 ? file.substring(0, dot) : file;
  }

  /** Checks that {@code path} is a readable, non-empty image; decodes nothing yet. */
  public static PhotoInput check(Path path) throws HostException {
    if (!Files.exists(path)) {
      throw new HostException(ExitStatus.NO_INPUT, path + ": no such file");
    }
    if (!Files.isRegularFile(path) || !Files.isReadable(path)) {
      throw new HostException(ExitStatus.NO_INPUT, path + ": cannot be read");
    }
    try {
      if (Files.size(path) == 0) {
        throw new HostException(ExitStatus.EMPTY_IMAGE, path + ": the file is empty");
      }
    } catch (IOException e) {
      throw new HostException(ExitStatus.NO_INPUT, path + ": cannot be read");
    }
    PhotoInput input = new PhotoInput(path);
    input.checkSize(headerSize(path));
    input.decode().release();
    return input;
  }

  /**
   * The width and height that the file's header declares, or null when Java's image readers do
   * not know the format (OpenCV may still): a picture too large is refused before its pixels are
   * decoded, which for 20000×20000 would take over a gigabyte.
   */
  static int[] headerSize(Path path) {
    try (ImageInputStream stream = ImageIO.createImageInputStream(path.toFile())) {
      Iterator<ImageReader> readers = stream == null ? null : ImageIO.getImageReaders(stream);
      if (readers == null || !readers.hasNext()) {
        return null;
      }
      ImageReader reader = readers.next();
      try {
        reader.setInput(stream, true, true);
        return new int[] {reader.getWidth(0), reader.getHeight(0)};
      } finally {
        reader.dispose();
      }
    } catch (IOException | RuntimeException e) {
      return null; // a damaged header: OpenCV's decoder gives the verdict
    }
  }

  private void checkSize(int[] size) throws HostException {
    if (size != null && (size[0] > MAX_SIDE || size[1] > MAX_SIDE)) {
      throw new HostException(ExitStatus.NOT_AN_IMAGE,
          path + ": " + size[0] + "x" + size[1] + " is too large (at most " + MAX_SIDE
              + " pixels a side)");
    }
  }

  /** The image as 8-bit RGB; the caller releases it. */
  public Mat decode() throws HostException {
    Mat bgr = Imgcodecs.imread(path.toString(), Imgcodecs.IMREAD_COLOR);
    if (bgr.empty()) {
      bgr.release();
      throw new HostException(ExitStatus.NOT_AN_IMAGE, path + ": not an image OpenCV can read");
    }
    int[] size = {bgr.cols(), bgr.rows()};
    if (size[0] > MAX_SIDE || size[1] > MAX_SIDE) {
      bgr.release();
      checkSize(size);
    }
    Mat rgb = new Mat();
    Imgproc.cvtColor(bgr, rgb, Imgproc.COLOR_BGR2RGB);
    bgr.release();
    return rgb;
  }
}
