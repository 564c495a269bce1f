package com.quenda.tessel.testing;

import org.opencv.core.Core;

/** Loads OpenCV's Java binding, as a phone host does before it touches a Mat. */
public final class OpenCvHost {
  private static boolean loaded;

  private OpenCvHost() {}

  public static synchronized void load() {
    if (!loaded) {
      System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
      loaded = true;
    }
  }
}
