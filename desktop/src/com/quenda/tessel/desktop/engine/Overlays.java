package com.quenda.tessel.desktop.engine;

/**
 * What the renderer draws over one frame, per line: the translated string, where its patch was
 * cut and where its text goes (five values each), its id (the renderer's caches key on it), its
 * patch matrix and its text colour (0xAABBGGRR).
 */
public final class Overlays {
  public final String[] texts;
  public final double[] patchRects;
  public final double[] textRects;
  public final long[] ids;
  public final long[] patchAddresses;
  public final int[] colors;

  public Overlays(String[] texts, double[] patchRects, double[] textRects, long[] ids,
      long[] patchAddresses, int[] colors) {
    this.texts = texts;
    this.patchRects = patchRects;
    this.textRects = textRects;
    this.ids = ids;
    this.patchAddresses = patchAddresses;
    this.colors = colors;
  }

  /** Nothing over the frame. */
  public static Overlays none() {
    return new Overlays(
        new String[0], new double[0], new double[0], new long[0], new long[0], new int[0]);
  }
}
