package com.quenda.tessel.desktop.translate;

import com.quenda.tessel.desktop.HostException;
import java.util.List;

/**
 * A machine-translation back-end. All lines of one image go in one call, so a back-end that starts
 * a process or loads a model pays for it once per image, not once per line.
 */
public interface Translator {
  /**
   * The translation of each line, in order; null where the back-end could not translate a line
   * (the host then keeps that line's original text). Throws only when the back-end itself failed.
   */
  List<String> translate(List<String> lines) throws HostException;

  /** A short name for reports, such as "apertium eng-spa". */
  String name();
}
