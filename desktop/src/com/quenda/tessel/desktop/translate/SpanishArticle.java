package com.quenda.tessel.desktop.translate;

import java.util.Locale;
import java.util.regex.Matcher;
import java.util.regex.Pattern;

/**
 * The article before a phrase the memory translated inside a Spanish sentence. Apertium cannot see
 * the gender of protected text and writes "el" before it ("en el entrada principal"); when the
 * English has "the" or "a" before the phrase and the Spanish phrase starts with a feminine noun,
 * the article is taken into the phrase as "la", "las" or "una". Masculine is what Apertium writes
 * anyway, with its contractions ("al", "del").
 */
final class SpanishArticle {
  private static final Pattern ARTICLE_BEFORE = Pattern.compile("(?i)\\b(the|a|an)\\s+$");
  /** Feminine endings of Spanish nouns and their adjectives ("entrada", "estación", "última"). */
  private static final Pattern FEMININE = Pattern.compile("(a|ión|dad|tad|tud)(s|es)?");
  /** Feminine words that take "el" ("el agua", "el aula") or are not feminine ("el día"). */
  private static final Pattern EXCEPTIONS =
      Pattern.compile("(agua|aula|área|arma|hacha|día|mapa|programa|problema|sistema|tranvía)s?");

  private SpanishArticle() {}

  /** {@code match}, with the article before it taken in when its phrase is feminine. */
  static SignMemory.Match takeIn(String text, SignMemory.Match match) {
    Matcher article = ARTICLE_BEFORE.matcher(text.substring(0, match.start));
    if (!article.find()) {
      return match;
    }
    String first = match.translation.split("[\\s,]+")[0].toLowerCase(Locale.ROOT);
    Matcher feminine = FEMININE.matcher(first);
    if (EXCEPTIONS.matcher(first).matches() || !endsFeminine(first, feminine)) {
      return match;
    }
    boolean plural = first.endsWith("s");
    String spanish = article.group(1).equalsIgnoreCase("the") ? (plural ? "las" : "la") : "una";
    return new SignMemory.Match(
        article.start(), match.end, spanish + " " + SignRules.lowerFirst(match.translation));
  }

  private static boolean endsFeminine(String word, Matcher feminine) {
    for (int start = 0; start < word.length(); start++) {
      if (feminine.region(start, word.length()).matches()) {
        return start > 0;
      }
    }
    return false;
  }
}
