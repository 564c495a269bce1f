package com.quenda.tessel.desktop.video;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import java.io.IOException;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.Comparator;
import java.util.List;
import java.util.Locale;
import java.util.stream.Stream;
import org.opencv.core.Mat;
import org.opencv.core.Size;
import org.opencv.imgcodecs.Imgcodecs;
import org.opencv.imgproc.Imgproc;
import org.opencv.videoio.VideoCapture;
import org.opencv.videoio.Videoio;

/**
 * Opens a video file (through OpenCV's video reader) or a folder of numbered images as a frame
 * source. Every frame must have the first one's size: the tracker and the renderer are set up for
 * one frame size.
 */
public final class FrameSources {
  // A folder of images has no frame rate of its own; a phone camera's is assumed.
  static final double FOLDER_FPS = 30;
  private static final List<String> IMAGE_EXTENSIONS =
      List.of(".png", ".jpg", ".jpeg", ".bmp", ".tif", ".tiff", ".webp");

  private FrameSources() {}

  public static FrameSource open(Path path) throws HostException {
    if (!Files.exists(path)) {
      throw new HostException(ExitStatus.NO_INPUT, path + ": no such file or folder");
    }
    if (!Files.isReadable(path)) {
      throw new HostException(ExitStatus.NO_INPUT, path + ": cannot be read");
    }
    return Files.isDirectory(path) ? folder(path) : file(path);
  }

  private static FrameSource file(Path path) throws HostException {
    if (isEmptyFile(path)) {
      throw new HostException(ExitStatus.EMPTY_IMAGE, path + ": the file is empty");
    }
    VideoCapture capture = new VideoCapture(path.toString());
    if (!capture.isOpened()) {
      capture.release();
      throw new HostException(ExitStatus.NOT_AN_IMAGE, path + ": not a video OpenCV can read");
    }
    double fps = capture.get(Videoio.CAP_PROP_FPS);
    int count = (int) Math.max(0, capture.get(Videoio.CAP_PROP_FRAME_COUNT));
    return new Checked(baseName(path), fps > 0 && fps < 1000 ? fps : FOLDER_FPS, count, path) {
      @Override
      Mat read() {
        Mat bgr = new Mat();
        if (!capture.read(bgr) || bgr.empty()) {
          bgr.release();
          return null;
        }
        return bgr;
      }

      @Override
      public void close() {
        capture.release();
      }
    };
  }

  private static FrameSource folder(Path path) throws HostException {
    List<Path> images;
    try (Stream<Path> files = Files.list(path)) {
      images = new ArrayList<>(files.filter(FrameSources::isImage).toList());
    } catch (IOException e) {
      throw new HostException(ExitStatus.NO_INPUT, path + ": cannot be read");
    }
    if (images.isEmpty()) {
      throw new HostException(ExitStatus.EMPTY_IMAGE, path + ": no frames (no images in it)");
    }
    images.sort(Comparator.comparing(FrameSources::numberedKey));
    return new Checked(path.getFileName().toString(), FOLDER_FPS, images.size(), path) {
      private int next;

      @Override
      Mat read() throws HostException {
        if (next >= images.size()) {
          return null;
        }
        Path image = images.get(next++);
        Mat bgr = Imgcodecs.imread(image.toString(), Imgcodecs.IMREAD_COLOR);
        if (bgr.empty()) {
          throw new HostException(
              ExitStatus.NOT_AN_IMAGE, image + ": not an image OpenCV can read");
        }
        return bgr;
      }

      @Override
      public void close() {}
    };
  }

  /** Reads BGR frames, checks their size, hands them out as RGB. */
  private abstract static class Checked implements FrameSource {
    private final String name;
    private final double fps;
    private final int count;
    private final Path path;
    private Size size;
    private int index;

    Checked(String name, double fps, int count, Path path) {
      this.name = name;
      this.fps = fps;
      this.count = count;
      this.path = path;
    }

    abstract Mat read() throws HostException;

    @Override
    public Mat next() throws HostException {
      Mat bgr = read();
      if (bgr == null) {
        if (index == 0) {
          throw new HostException(ExitStatus.EMPTY_IMAGE, path + ": no frames");
        }
        return null;
      }
      if (size == null) {
        size = bgr.size();
      } else if (!size.equals(bgr.size())) {
        String message = String.format("%s: frame %d is %dx%d, the first was %dx%d", path, index,
            bgr.cols(), bgr.rows(), (int) size.width, (int) size.height);
        bgr.release();
        throw new HostException(ExitStatus.NOT_AN_IMAGE, message);
      }
      ++index;
      Mat rgb = new Mat();
      Imgproc.cvtColor(bgr, rgb, Imgproc.COLOR_BGR2RGB);
      bgr.release();
      return rgb;
    }

    @Override
    public double fps() {
      return fps;
    }

    @Override
    public int frameCountHint() {
      return count;
    }

    @Override
    public String name() {
      return name;
    }
  }

  private static boolean isEmptyFile(Path path) throws HostException {
    try {
      return Files.size(path) == 0;
    } catch (IOException e) {
      throw new HostException(ExitStatus.NO_INPUT, path + ": cannot be read");
    }
  }

  private static boolean isImage(Path file) {
    String name = file.getFileName().toString().toLowerCase(Locale.ROOT);
    return Files.isRegularFile(file) && IMAGE_EXTENSIONS.stream().anyMatch(name::endsWith);
  }

  /** Names in numeric order: frame2.png before frame10.png. */
  private static String numberedKey(Path file) {
    StringBuilder key = new StringBuilder();
    for (String part : file.getFileName().toString().split("(?<=\\D)(?=\\d)|(?<=\\d)(?=\\D)")) {
      key.append(part.matches("\\d+") ? String.format(
                     "%020d", Long.parseLong(part.length() > 18 ? part.substring(0, 18) : part))
                                      : part);
    }
    return key.toString();
  }

  private static String baseName(Path path) {
    String file = path.getFileName().toString();
    int dot = file.lastIndexOf('.');
    return dot > 0 ? file.substring(0, dot) : file;
  }
}
