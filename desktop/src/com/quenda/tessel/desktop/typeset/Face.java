package com.quenda.tessel.desktop.typeset;

/**
 * The typeface a translation is drawn in, after the original's: serif or sans, regular or bold,
 * each a Noto face the renderer finds among the platform fonts by its file name.
 */
public enum Face {
  SANS("sans", "NotoSans-Regular.ttf"),
  SANS_BOLD("sans bold", "NotoSans-Bold.ttf"),
  SERIF("serif", "NotoSerif-Regular.ttf"),
  SERIF_BOLD("serif bold", "NotoSerif-Bold.ttf");

  /** As the JSON report names it. */
  public final String label;
  /** The font file, under /system/fonts on a phone and /usr/share/fonts on Linux. */
  public final String file;

  Face(String label, String file) {
    this.label = label;
    this.file = file;
  }

  public static Face of(boolean serif, boolean bold) {
    if (serif) {
      return bold ? SERIF_BOLD : SERIF;
    }
    return bold ? SANS_BOLD : SANS;
  }
}
