package com.quenda.tessel.desktop.scenes;

import java.io.IOException;
import java.nio.file.Path;
import java.util.List;
import org.opencv.core.Mat;
import org.opencv.imgcodecs.Imgcodecs;
import org.opencv.imgproc.Imgproc;

/** A generated picture (8-bit RGB) with the truth about the text drawn in it. */
public final class Scene {
  public final String name;
  public final Mat rgb;
  public final List<SceneLine> lines;

  public Scene(String name, Mat rgb, List<SceneLine> lines) {
    this.name = name;
    this.rgb = rgb;
    this.lines = List.copyOf(lines);
  }

  /** Writes the picture as a PNG file (OpenCV writes BGR, so the channels are swapped first). */
  public void writePng(Path file) throws IOException {
    Mat bgr = new Mat();
    Imgproc.cvtColor(rgb, bgr, Imgproc.COLOR_RGB2BGR);
    boolean written = Imgcodecs.imwrite(file.toString(), bgr);
    bgr.release();
    if (!written) {
      throw new IOException("cannot write " + file);
    }
  }

  /** Frees the pixels now rather than at garbage collection. */
  public void release() {
    rgb.release();
  }
}
