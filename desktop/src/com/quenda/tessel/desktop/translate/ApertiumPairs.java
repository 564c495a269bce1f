package com.quenda.tessel.desktop.translate;

import com.quenda.tessel.desktop.Language;
import java.util.List;
import java.util.Map;

/**
 * Which Apertium mode translates one language into another, and which Debian package installs it.
 * Older pairs use two-letter codes ("en-gl"), newer ones three-letter codes ("eng-spa"); a package
 * carries both directions of its pair under one name, in either order.
 */
final class ApertiumPairs {
  // Debian's packages of the pairs between the languages the host knows, by unordered pair.
  private static final Map<String, String> PACKAGES =
      Map.ofEntries(Map.entry("eng/spa", "apertium-eng-spa"),
          Map.entry("cat/eng", "apertium-eng-cat"), Map.entry("eng/glg", "apertium-en-gl"),
          Map.entry("eng/hbs", "apertium-hbs-eng"), Map.entry("eng/isl", "apertium-isl-eng"),
          Map.entry("eng/mkd", "apertium-mkd-eng"), Map.entry("cat/spa", "apertium-spa-cat"),
          Map.entry("cat/fra", "apertium-fra-cat"), Map.entry("fra/spa", "apertium-fr-es"),
          Map.entry("glg/spa", "apertium-es-gl"), Map.entry("por/spa", "apertium-es-pt"),
          Map.entry("cat/ita", "apertium-cat-ita"), Map.entry("ita/spa", "apertium-spa-ita"),
          Map.entry("cat/por", "apertium-por-cat"), Map.entry("glg/por", "apertium-pt-gl"));

  // Serbo-Croatian is one language to Apertium, with a variant per standard.
  private static final Map<String, String> VARIANTS = Map.of("sr", "_SR", "hr", "_HR", "bs", "_BS");

  private ApertiumPairs() {}

  /** The installed mode for the direction, or null. */
  static String chooseMode(List<String> installed, Language from, Language to) {
    String three = from.apertium + "-" + to.apertium;
    String variant = VARIANTS.getOrDefault(to.iso, "");
    for (String candidate : List.of(three + variant, three, from.iso + "-" + to.iso)) {
      if (installed.contains(candidate)) {
        return candidate;
      }
    }
    return null;
  }

  /** The Debian package of the pair, or null when Debian has none. */
  static String debianPackage(Language from, Language to) {
    String a = from.apertium;
    String b = to.apertium;
    return PACKAGES.get(a.compareTo(b) < 0 ? a + "/" + b : b + "/" + a);
  }

  /** The one-line error for a pair that is not installed. */
  static String missingPair(Language from, Language to) {
    String pair = String.format("%s (%s) to %s (%s)", from.english, from.iso, to.english, to.iso);
    String debianPackage = debianPackage(from, to);
    if (debianPackage != null) {
      return "no installed translation from " + pair + ": install the Debian package "
          + debianPackage;
    }
    return "Debian has no Apertium translation from " + pair
        + ": give the translations as a phrase table with --translations FILE";
  }
}
