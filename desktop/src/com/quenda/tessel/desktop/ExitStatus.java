package com.quenda.tessel.desktop;

/**
 * The host's exit statuses, one per class of failure (in the spirit of BSD's sysexits), so that
 * a script can tell a bad argument from a missing package. The README lists them.
 */
public enum ExitStatus {
  OK(0),
  /** Bad command line: unknown mode or option, missing value, unknown language code. */
  USAGE(64),
  /** The file exists but does not decode as an image. */
  NOT_AN_IMAGE(65),
  /** The input file is missing or cannot be read. */
  NO_INPUT(66),
  /** The image decodes to no pixels. */
  EMPTY_IMAGE(67),
  /** OCR is not installed, or has no data for the source language. */
  MISSING_OCR_DATA(68),
  /** No installed translation for the language pair. */
  MISSING_TRANSLATION(69),
  /** A failure of the host or the engine itself. */
  INTERNAL(70),
  /** The OCR or translation program failed or timed out. */
  CHILD_FAILED(71),
  /** The output directory or a file in it cannot be written. */
  CANNOT_WRITE(73);

  public final int code;

  ExitStatus(int code) {
    this.code = code;
  }
}
