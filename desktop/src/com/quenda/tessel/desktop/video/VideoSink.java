package com.quenda.tessel.desktop.video;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.OutputFiles;
import java.awt.image.BufferedImage;
import java.awt.image.DataBufferByte;
import java.io.IOException;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.List;
import org.opencv.core.Mat;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;
import org.opencv.videoio.VideoWriter;

/**
 * The translated video and its preview, staged in the output directory until the last frame is
 * in. The video is H.264 in MP4 where the installed codecs allow, else MPEG-4 Part 2 in MP4, else
 * Motion JPEG in AVI; live, where every millisecond of the frame loop counts, MPEG-4 Part 2 comes
 * first (a third of H.264's encoding time here). The preview is a small animated GIF of the first
 * seconds, every third frame.
 */
final class VideoSink implements AutoCloseable {
  private record Codec(String fourcc, String extension) {}

  private static final Codec H264 = new Codec("avc1", ".mp4");
  private static final Codec MPEG4 = new Codec("mp4v", ".mp4");
  private static final Codec MJPEG = new Codec("MJPG", ".avi");
  static final int PREVIEW_WIDTH = 480;
  static final int PREVIEW_STEP = 3;
  static final int PREVIEW_FRAMES = 40;

  private final OutputFiles files;
  private final String name;
  private final double fps;
  private final List<Codec> codecs;
  private VideoWriter writer;
  private Codec codec;
  // Kept small and written when the video is complete: GIF encoding is slow, and the frame loop
  // must not wait for it.
  private final List<BufferedImage> preview = new ArrayList<>();
  private int frames;

  VideoSink(OutputFiles files, String name, double fps, boolean fastEncoding) {
    this.files = files;
    this.name = name;
    this.fps = fps;
    this.codecs = fastEncoding ? List.of(MPEG4, H264, MJPEG) : List.of(H264, MPEG4, MJPEG);
  }

  /** Appends an RGB frame. */
  void add(Mat rgb) throws HostException {
    if (writer == null) {
      open(rgb.size());
    }
    Mat bgr = new Mat();
    Imgproc.cvtColor(rgb, bgr, Imgproc.COLOR_RGB2BGR);
    writer.write(bgr);
    if (frames % PREVIEW_STEP == 0 && frames / PREVIEW_STEP < PREVIEW_FRAMES) {
      addPreview(bgr);
    }
    bgr.release();
    ++frames;
  }

  /** The video's file name, once the first frame is in. */
  String videoName() {
    return codec == null ? null : name + codec.extension;
  }

  String codecName() {
    return codec == null ? null : codec.fourcc;
  }

  /** Closes the video and writes the preview; the caller then commits the output files. */
  void finish() throws HostException {
    if (writer == null) {
      return;
    }
    writer.release();
    int delay = (int) Math.round(1000.0 * PREVIEW_STEP / fps);
    try (AnimatedGif gif = new AnimatedGif(files.stage(name + ".preview.gif").toFile(), delay)) {
      for (BufferedImage image : preview) {
        gif.add(image);
      }
    } catch (IOException e) {
      throw new HostException(ExitStatus.CANNOT_WRITE, "cannot write " + name + ".preview.gif");
    }
  }

  @Override
  public void close() {
    if (writer != null) {
      writer.release();
    }
  }

  private void open(Size size) throws HostException {
    for (Codec candidate : codecs) {
      Path path = files.stage(name + candidate.extension);
      String c = candidate.fourcc;
      VideoWriter w = new VideoWriter(path.toString(),
          VideoWriter.fourcc(c.charAt(0), c.charAt(1), c.charAt(2), c.charAt(3)), fps, size);
      if (w.isOpened()) {
        writer = w;
        codec = candidate;
        break;
      }
      w.release();
      files.drop(name + candidate.extension);
    }
    if (writer == null) {
      throw new HostException(ExitStatus.CANNOT_WRITE,
          "no video codec could write " + name + " (tried H.264, MPEG-4 and Motion JPEG)");
    }
  }

  private void addPreview(Mat bgr) {
    int height = (int) Math.round((double) bgr.rows() * PREVIEW_WIDTH / bgr.cols());
    Mat small = new Mat();
    Imgproc.resize(bgr, small, new Size(PREVIEW_WIDTH, height), 0, 0, Imgproc.INTER_AREA);
    BufferedImage image =
        new BufferedImage(small.cols(), small.rows(), BufferedImage.TYPE_3BYTE_BGR);
    small.get(0, 0, ((DataBufferByte) image.getRaster().getDataBuffer()).getData());
    small.release();
    preview.add(image);
  }
}
