package com.quenda.tessel.desktop.video;

import com.quenda.tessel.desktop.HostException;
import org.opencv.core.Mat;

/** Camera frames in order, as a phone's camera delivers them. */
public interface FrameSource extends AutoCloseable {
  /** The next frame, 8-bit RGB, owned by the caller; null after the last one. */
  Mat next() throws HostException;

  /** Frames per second at which the frames were taken. */
  double fps();

  /** How many frames there are, as far as known beforehand; 0 when unknown. */
  int frameCountHint();

  /** The outputs' base name. */
  String name();

  @Override void close();
}
