package com.quenda.tessel.desktop.engine;

/**
 * What the renderer draws over one frame, per line: the translated string, where its patch was
 * cut and where its text goes (five values each), its id (the renderer's caches key on it), its
 * patch matrix and its text colour (0xAABBGGRR); and optionally three per-channel gains per line
 * that carry the patch's colours to the frame's light when it has changed since the patch was cut.
 */
public final class Overlays {
  public final String[] texts;
  public final double[] patchRects;
  public final double[] textRects;
  public final long[] ids;
  public final long[] patchAddresses;
  public final int[] colors;
  /** Null for no change. */
  public final double[] colorScales;

  public Overlays(String[] texts, double[] patchRects, double[] textRects, long[] ids,
      long[] patchAddresses, int[] colors, double[] colorScales) {
    this.texts = texts;
    this.patchRects = patchRects;
    this.textRects = textRects;
    this.ids = ids;
    this.patchAddresses = patchAddresses;
    this.colors = colors;
    this.colorScales = colorScales;
  }

  /** Nothing over the frame. */
  public static Overlays none() {
    return new Overlays(
        new String[0], new double[0], new double[0], new long[0], new long[0], new int[0], null);
  }
}
