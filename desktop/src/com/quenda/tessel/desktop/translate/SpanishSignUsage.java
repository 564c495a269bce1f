package com.quenda.tessel.desktop.translate;

import java.util.regex.Matcher;
import java.util.regex.Pattern;

/**
 * Spanish sign usage that Apertium's general dictionary and rules miss, applied to transferred
 * lexical units (lemmas and tags, before generation):
 *
 * <ul>
 *   <li>"enter" without an object is "entrar" ("introducir" is for putting things in);
 *   <li>a welcome greets everyone ("Bienvenidos");
 *   <li>"when" inside a sentence is not a question ("cuando");
 *   <li>"under" an age is "menores de N años";
 *   <li>"free" after a verb ("travel free", "eat for free") is "gratis";
 *   <li>"X are not allowed" is "No se admiten X";
 *   <li>"must" in a notice is "deber" ("Los visitantes deben ...").
 * </ul>
 */
final class SpanishSignUsage {
  private static final Pattern NUMBER_BLANK = Pattern.compile("\\[[^\\]]*\\d[^\\]]*\\]");
  private static final Pattern MUST = Pattern.compile("(?i)tener<vbmod><pri><p3><(sg|pl)># que");
  private static final Pattern BE = Pattern.compile("(?i)ser<vbser><pri><p3><(sg|pl)>");
  private static final Pattern ALLOWED =
      Pattern.compile("(?i)(dejar|permitir|admitir)<vblex><pp>.*");

  private SpanishSignUsage() {}

  static LexicalUnits apply(LexicalUnits units) {
    for (int i = 0; i < units.size(); i++) {
      String unit = units.get(i);
      boolean last =
          i + 1 == units.size() || SignRules.PUNCTUATION.matcher(units.get(i + 1)).find();
      Matcher must = MUST.matcher(unit);
      if (last && unit.matches("(?i)introducir<vblex>.*")) {
        units.set(
            i, unit.replaceFirst("(?i)introducir", unit.startsWith("I") ? "Entrar" : "entrar"));
      } else if (i == 0 && unit.matches("(?i)bienvenido<adj><m><sg>")) {
        units.set(i, unit.replace("<sg>", "<pl>"));
      } else if (i > 0 && unit.startsWith("cuándo<adv><itg>")) {
        units.set(i, "cuando<cnjadv>");
      } else if (unit.equals("debajo<adv>") || unit.equals("bajo<pr>")) {
        age(units, i);
      } else if (i > 0 && unit.startsWith("libre<adj>")) {
        free(units, i);
      } else if (must.matches()) {
        String lemma = unit.startsWith("T") ? "Deber" : "deber";
        units.set(i, lemma + "<vblex><pri><p3><" + must.group(1) + ">");
      }
    }
    return notAllowed(units);
  }

  /** "debajo 5" becomes "menores de 5 años" when a number follows (as a unit or protected). */
  private static void age(LexicalUnits units, int i) {
    String blank = units.pieces.get(2 * i + 2);
    boolean protectedNumber = NUMBER_BLANK.matcher(blank).find();
    boolean number = i + 1 < units.size() && units.get(i + 1).contains("<num>");
    if (!protectedNumber && !number) {
      return;
    }
    boolean one = i > 0 && units.get(i - 1).matches(".*<n>.*<sg>");
    units.set(i, one ? "menor<adj><mf><sg>" : "menor<adj><mf><pl>");
    // "de" goes right after "menores", before the blank that may hold the number.
    units.pieces.add(2 * i + 2, " ");
    units.pieces.add(2 * i + 3, "de<pr>");
    int years = protectedNumber ? i + 2 : i + 3;
    units.insert(years, "año<n><m><pl>");
    // The verb agrees with the people, not with the number: "Niños menores de 3 años comen".
    boolean people = i > 0 && units.get(i - 1).matches(".*<n>.*<pl>");
    if (people && years + 1 < units.size()) {
      units.set(
          years + 1, units.get(years + 1).replaceFirst("<(pri|prs)><p3><sg>", "<$1><p3><pl>"));
    }
  }

  /** "libre" after a verb, or after "para" after a verb, is "gratis". */
  private static void free(LexicalUnits units, int i) {
    boolean afterPara = units.get(i - 1).equals("para<pr>");
    int verb = afterPara ? i - 2 : i - 1;
    if (verb < 0 || !units.get(verb).contains("<vblex>")) {
      return;
    }
    units.set(i, "gratis<adv>");
    if (afterPara) {
      units.remove(i - 1);
    }
  }

  /** "Los perros no son dejados en X" becomes "No se admiten perros en X". */
  private static LexicalUnits notAllowed(LexicalUnits units) {
    for (int k = 1; k + 2 < units.size(); k++) {
      Matcher be = BE.matcher(units.get(k + 1));
      if (!units.get(k).equalsIgnoreCase("no<adv>") || !be.matches()
          || !ALLOWED.matcher(units.get(k + 2)).matches() || !subject(units, k)) {
        continue;
      }
      StringBuilder out = new StringBuilder(units.pieces.get(0));
      out.append("^No<adv>$ ^se<prn><pro><ref><p3><mf><sp>$ ^admitir<vblex><pri><p3><")
          .append(be.group(1))
          .append(">$");
      for (int i = 0; i < k; i++) {
        if (!units.get(i).contains("<det>")) {
          out.append(" ^").append(SignRules.lowerFirst(units.get(i))).append('$');
        }
      }
      for (int p = 2 * (k + 3); p < units.pieces.size(); p++) {
        out.append(p % 2 == 1 ? "^" + units.pieces.get(p) + "$" : units.pieces.get(p));
      }
      return new LexicalUnits(out.toString());
    }
    return units;
  }

  /** Units before {@code k} are a noun phrase: determiners, adjectives and nouns only. */
  private static boolean subject(LexicalUnits units, int k) {
    boolean noun = false;
    for (int i = 0; i < k; i++) {
      String unit = units.get(i);
      if (!unit.contains("<det>") && !unit.contains("<adj>") && !unit.contains("<n>")) {
        return false;
      }
      noun |= unit.contains("<n>");
    }
    return noun;
  }
}
