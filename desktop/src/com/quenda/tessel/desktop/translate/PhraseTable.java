package com.quenda.tessel.desktop.translate;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import java.io.IOException;
import java.nio.charset.StandardCharsets;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.HashMap;
import java.util.List;
import java.util.Locale;
import java.util.Map;

/**
 * Translations given by the user as a tab-separated table, one phrase per line: source, tab,
 * translation. Blank lines and lines starting with '#' are skipped. A line of the image is
 * translated when the table has it, compared on letters and digits alone, without case: OCR
 * keeps neither punctuation nor spacing reliably.
 */
public final class PhraseTable implements Translator {
  private final Map<String, String> phrases;
  private final String name;

  private PhraseTable(Map<String, String> phrases, String name) {
    this.phrases = phrases;
    this.name = name;
  }

  /** Reads {@code file}; a missing, unreadable or malformed table is a usage error. */
  public static PhraseTable read(Path file) throws HostException {
    List<String> rows;
    try {
      rows = Files.readAllLines(file, StandardCharsets.UTF_8);
    } catch (IOException e) {
      throw new HostException(ExitStatus.NO_INPUT, "cannot read the phrase table " + file);
    }
    Map<String, String> phrases = new HashMap<>();
    for (int i = 0; i < rows.size(); i++) {
      String row = rows.get(i);
      if (row.isBlank() || row.startsWith("#")) {
        continue;
      }
      int tab = row.indexOf('\t');
      if (tab <= 0 || tab == row.length() - 1) {
        throw new HostException(ExitStatus.USAGE,
            String.format("%s:%d: expected 'source<TAB>translation'", file, i + 1));
      }
      phrases.put(key(row.substring(0, tab)), row.substring(tab + 1).trim());
    }
    return new PhraseTable(phrases, "phrase table " + file.getFileName());
  }

  @Override
  public List<String> translate(List<String> lines) {
    List<String> translations = new ArrayList<>(lines.size());
    for (String line : lines) {
      translations.add(phrases.get(key(line)));
    }
    return translations;
  }

  @Override
  public String name() {
    return name;
  }

  private static String key(String phrase) {
    return phrase.toLowerCase(Locale.ROOT).replaceAll("[^\\p{L}\\p{N}]+", " ").strip();
  }
}
