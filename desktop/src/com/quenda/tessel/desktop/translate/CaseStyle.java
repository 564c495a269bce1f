package com.quenda.tessel.desktop.translate;

import java.util.Locale;
import java.util.Set;
import java.util.regex.Matcher;
import java.util.regex.Pattern;

/**
 * The case a sign is written in, kept in its translation: one rule for every path (text mode,
 * photos, video), so that drawn text and printed text agree.
 *
 * <ul>
 *   <li>CAPITALS: a text of two letters or more with no lower-case letter comes out in capitals.
 *   <li>Title Case: a text of two words or more whose words of four letters or more all start
 *       with a capital. Languages that write signs in sentence case (Spanish, Catalan, Galician,
 *       French, Italian, Portuguese: only the first word and proper names) get a capital on the
 *       first word alone; English gets its words of four letters or more capitalised; others keep
 *       the translator's case.
 *   <li>Otherwise the translation starts with a capital exactly when the source does.
 * </ul>
 *
 * Apertium reads words in capitals badly ("KEEP CLEAR" as unknown words), so texts in capitals or
 * title case are given to it in sentence case and the case is put back afterwards.
 */
enum CaseStyle {
  CAPITALS,
  TITLE,
  SENTENCE;

  private static final Pattern WORD = Pattern.compile("\\p{L}[\\p{L}\\p{N}'’]*");
  private static final String SENTENCE_CASE_LANGUAGES = "es ca gl fr it pt";
  /** English words that keep their capital in any sentence: days and months. */
  private static final Set<String> ALWAYS_CAPITALISED = Set.of("monday", "tuesday", "wednesday",
      "thursday", "friday", "saturday", "sunday", "mondays", "tuesdays", "wednesdays", "thursdays",
      "fridays", "saturdays", "sundays", "january", "february", "march", "april", "june", "july",
      "august", "september", "october", "november", "december");

  static CaseStyle of(String text) {
    long letters = text.codePoints().filter(Character::isLetter).count();
    boolean lower = text.codePoints().anyMatch(Character::isLowerCase);
    if (letters >= 2 && !lower && text.codePoints().anyMatch(Character::isUpperCase)) {
      return CAPITALS;
    }
    Matcher m = WORD.matcher(text);
    int words = 0;
    int longWords = 0;
    boolean allCapitalised = true;
    while (m.find()) {
      words++;
      if (m.group().length() >= 4) {
        longWords++;
        allCapitalised &= Character.isUpperCase(m.group().codePointAt(0));
      }
    }
    return words >= 2 && longWords >= 2 && allCapitalised ? TITLE : SENTENCE;
  }

  /**
   * The text as the translator should read it; words in {@code names} (lower case) keep a
   * capital.
   */
  String forTranslation(String text, Set<String> names) {
    switch (this) {
      case CAPITALS:
        return sentenceCase(capitalised(text), names);
      case TITLE:
        return sentenceCase(text, names);
      default:
        return text;
    }
  }

  /** Every word with a capital first letter and the rest in lower case. */
  static String capitalised(String text) {
    Matcher m = WORD.matcher(text);
    StringBuilder out = new StringBuilder();
    while (m.find()) {
      String word = m.group().toLowerCase(Locale.ROOT);
      m.appendReplacement(out, Matcher.quoteReplacement(SignRules.upperFirst(word)));
    }
    m.appendTail(out);
    return out.toString();
  }

  /** {@code translation} (of a text in this case, starting with {@code source}) in the case. */
  String apply(String translation, String source, String targetIso) {
    if (translation == null || translation.isEmpty()) {
      return translation;
    }
    switch (this) {
      case CAPITALS:
        return translation.toUpperCase(Locale.forLanguageTag(targetIso));
      case TITLE:
        if (SENTENCE_CASE_LANGUAGES.contains(targetIso)) {
          return SignRules.upperFirst(translation);
        }
        return targetIso.equals("en") ? titleCase(translation) : translation;
      default:
        boolean upper = source.codePoints()
                            .filter(Character::isLetter)
                            .limit(1)
                            .anyMatch(Character::isUpperCase);
        return upper ? SignRules.upperFirst(translation) : SignRules.lowerFirst(translation);
    }
  }

  /** First letter in capitals, the first letters of the other words in lower case. */
  private static String sentenceCase(String text, Set<String> names) {
    Matcher m = WORD.matcher(text);
    StringBuilder out = new StringBuilder();
    boolean first = true;
    while (m.find()) {
      String word = m.group();
      // Words in capitals inside a title are acronyms ("WC", "ATM"): kept, as are the words
      // English always capitalises.
      boolean acronym = word.length() > 1 && word.equals(word.toUpperCase(Locale.ROOT));
      String lower = word.toLowerCase(Locale.ROOT);
      boolean keep =
          first || acronym || ALWAYS_CAPITALISED.contains(lower) || names.contains(lower);
      m.appendReplacement(out, Matcher.quoteReplacement(keep ? word : SignRules.lowerFirst(word)));
      first = false;
    }
    m.appendTail(out);
    return out.toString();
  }

  private static String titleCase(String text) {
    Matcher m = WORD.matcher(text);
    StringBuilder out = new StringBuilder();
    while (m.find()) {
      String word = m.group();
      boolean first = m.start() == 0 || out.length() == 0;
      m.appendReplacement(out,
          Matcher.quoteReplacement(
              first || word.length() >= 4 ? SignRules.upperFirst(word) : word));
    }
    m.appendTail(out);
    return out.toString();
  }
}
