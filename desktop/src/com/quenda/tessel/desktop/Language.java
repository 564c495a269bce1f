package com.quenda.tessel.desktop;

import java.util.List;
import java.util.Locale;

/**
 * A language as the user names it (ISO 639-1) and as each tool names it: Tesseract's data file,
 * Apertium's pair part, and the engine's language code, which picks the font of the translation.
 */
public final class Language {
  public final String iso;
  public final String english;
  public final String tesseract;
  public final String apertium;
  public final String engine;

  private Language(String iso, String english, String tesseract, String apertium, String engine) {
    this.iso = iso;
    this.english = english;
    this.tesseract = tesseract;
    this.apertium = apertium;
    this.engine = engine;
  }

  // Apertium names Serbo-Croatian as one language; the engine knows simplified Chinese as zh-CHS.
  private static final List<Language> KNOWN =
      List.of(new Language("en", "English", "eng", "eng", "en"),
          new Language("es", "Spanish", "spa", "spa", "es"),
          new Language("ca", "Catalan", "cat", "cat", "ca"),
          new Language("gl", "Galician", "glg", "glg", "gl"),
          new Language("fr", "French", "fra", "fra", "fr"),
          new Language("de", "German", "deu", "deu", "de"),
          new Language("it", "Italian", "ita", "ita", "it"),
          new Language("pt", "Portuguese", "por", "por", "pt"),
          new Language("nl", "Dutch", "nld", "nld", "nl"),
          new Language("is", "Icelandic", "isl", "isl", "is"),
          new Language("mk", "Macedonian", "mkd", "mkd", "mk"),
          new Language("sr", "Serbian", "srp_latn", "hbs", "sr"),
          new Language("hr", "Croatian", "hrv", "hbs", "hr"),
          new Language("bs", "Bosnian", "bos", "hbs", "bs"),
          new Language("ru", "Russian", "rus", "rus", "ru"),
          new Language("ja", "Japanese", "jpn", "jpn", "ja"),
          new Language("zh", "Chinese (simplified)", "chi_sim", "zho", "zh-CHS"),
          new Language("ko", "Korean", "kor", "kor", "ko"));

  /** The language of an ISO 639-1 code, or null when the host does not know it. */
  public static Language of(String iso) {
    String code = iso.toLowerCase(Locale.ROOT);
    for (Language language : KNOWN) {
      if (language.iso.equals(code)) {
        return language;
      }
    }
    return null;
  }

  /** The codes the host knows, for the usage message. */
  public static String knownCodes() {
    StringBuilder codes = new StringBuilder();
    for (Language language : KNOWN) {
      codes.append(codes.length() == 0 ? "" : ", ").append(language.iso);
    }
    return codes.toString();
  }

  /** Whether texts in this language are written in CJK scripts (no spaces between words). */
  public boolean isCjk() {
    return iso.equals("ja") || iso.equals("zh") || iso.equals("ko");
  }

  @Override
  public String toString() {
    return iso;
  }
}
