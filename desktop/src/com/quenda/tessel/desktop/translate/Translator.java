package com.quenda.tessel.desktop.translate;

import com.quenda.tessel.desktop.HostException;
import java.util.List;

/**
 * A machine-translation back-end. All texts of one image go in one call; a back-end that keeps a
 * process or a model loads it once per run, and {@link #close} releases it.
 */
public interface Translator extends AutoCloseable {
  /**
   * The translation of each text, in order, each translated on its own; null where the back-end
   * could not translate a text (the host then keeps its original). Throws only when the back-end
   * itself failed.
   */
  List<String> translate(List<String> lines) throws HostException;

  /** A short name for reports, such as "apertium eng-spa". */
  String name();

  /** Stops whatever the back-end keeps running; nothing by default. */
  @Override
  default void close() {}
}
