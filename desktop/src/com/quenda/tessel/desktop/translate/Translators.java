package com.quenda.tessel.desktop.translate;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import java.nio.file.Path;
import java.util.List;

/** The translator a run uses: the user's phrase table first, when given, then Apertium. */
public final class Translators {
  private Translators() {}

  /**
   * With a phrase table, Apertium is asked only for the lines the table lacks, and a pair Apertium
   * does not have is no error: the table then translates alone.
   */
  public static Translator create(Language from, Language to, Path phraseTable)
      throws HostException {
    if (phraseTable == null) {
      return new ApertiumTranslator(from, to);
    }
    PhraseTable table = PhraseTable.read(phraseTable);
    try {
      return new FirstThatKnows(List.of(table, new ApertiumTranslator(from, to)));
    } catch (HostException e) {
      if (e.status != ExitStatus.MISSING_TRANSLATION) {
        throw e;
      }
      return table;
    }
  }
}
