package com.quenda.tessel.desktop.scenes;

import java.util.List;
import org.opencv.core.Mat;

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

  /** Frees the pixels now rather than at garbage collection. */
  public void release() {
    rgb.release();
  }
}
