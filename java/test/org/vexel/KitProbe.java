package org.vexel;

/** Drives the scene kit from Java through the natives of a small test library. */
public final class KitProbe {
  static {
    System.loadLibrary("vexel_java_probe");
  }

  private KitProbe() {}

  /**
   * Draws one frame of an empty scene cleared to {@code rgba} (0xAABBGGRR) into the window behind
   * {@code surface}; false when the object is no surface.
   */
  public static native boolean drawBackground(Object surface, int rgba);

  /** Width in ems of {@code text} in a font asset read through {@code assetManager}. */
  public static native float measureWithAssetFont(
      Object assetManager, String fontName, String text);
}
