package org.vexel.desktop;

/** Loads the desktop stand-in for the phone's system library once. */
final class DesktopLibrary {
  private static boolean loaded;

  private DesktopLibrary() {}

  static synchronized void load() {
    if (!loaded) {
      System.loadLibrary("android_desktop");
      loaded = true;
    }
  }
}
