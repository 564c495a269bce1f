package com.quenda.tessel;

/** Loads the engine library once for every bridge class. */
public final class NativeLibrary {
  private static boolean loaded;

  private NativeLibrary() {}

  public static synchronized void load() {
    if (!loaded) {
      System.loadLibrary("ocr_ndk");
      loaded = true;
    }
  }
}
