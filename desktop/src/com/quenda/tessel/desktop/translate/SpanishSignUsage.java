package com.quenda.tessel.desktop.translate;

import java.util.Locale;
import java.util.Map;
import java.util.Set;
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
 *   <li>"must" in a notice is "deber" ("Los visitantes deben ...");
 *   <li>what is open, closed or somewhere "está" ("El museo está abierto", "está en la planta"),
 *       also before a phrase of the memory that says so;
 *   <li>"X are sold/allowed" is the reflexive passive ("Las entradas se venden");
 *   <li>"until six" is "hasta las seis";
 *   <li>words of the sign sense where the dictionary has another: a platform is an "andén", a
 *       counter a "mostrador".
 * </ul>
 */
final class SpanishSignUsage {
  private static final Pattern NUMBER_BLANK = Pattern.compile("\\[[^\\]]*\\d[^\\]]*\\]");
  private static final Pattern MUST = Pattern.compile("(?i)tener<vbmod><pri><p3><(sg|pl)># que");
  private static final Pattern BE = Pattern.compile("(?i)ser<vbser><pri><p3><(sg|pl)>");
  private static final Pattern BE_ANY =
      Pattern.compile("(?i)(?:ser<vbser>|estar<vblex>)(<(?:pri|pii|ifi|fti)><p3><(?:sg|pl)>)");
  private static final Pattern STATE =
      Pattern.compile("(?i)(abierto<adj>|cerrado<adj>|(abrir|cerrar)<vblex><pp>|en<pr>).*");
  /** A phrase of the memory after "is" that is a place or a state: "en la planta baja". */
  private static final Pattern PROTECTED_STATE =
      Pattern.compile("\\s*\\[(?i:en|abiert|cerrad|fuera de|prohibid|reservad|agotad)");
  private static final Pattern PARTICIPLE = Pattern.compile("(?i)([^<]+)<vblex><pp>.*");
  /** The sign sense of a word, by the English word it came from. */
  private static final Map<String, String[]> SENSES =
      Map.of("platform", new String[] {"programa<n>", "andén<n>"}, "counter",
          new String[] {"contador<n>", "mostrador<n>"});
  private static final Pattern ALLOWED =
      Pattern.compile("(?i)(dejar|permitir|admitir)<vblex><pp>.*");

  private SpanishSignUsage() {}

  /** {@code sourceWords}: the English words of the text, in lower case. */
  static LexicalUnits apply(LexicalUnits units, Set<String> sourceWords) {
    for (int i = 0; i < units.size(); i++) {
      String unit = units.get(i);
      for (Map.Entry<String, String[]> sense : SENSES.entrySet()) {
        String wrong = sense.getValue()[0];
        if (sourceWords.contains(sense.getKey())
            && unit.toLowerCase(Locale.ROOT).startsWith(wrong)) {
          String right = sense.getValue()[1];
          boolean capital = Character.isUpperCase(unit.charAt(0));
          unit = (capital ? SignRules.upperFirst(right) : right) + unit.substring(wrong.length());
          units.set(i, unit);
        }
      }
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
      } else if (unit.equals("hasta que<cnjadv>") && !last && units.get(i + 1).contains("<num>")) {
        units.set(i, "hasta<pr>");
        units.insert(i + 1, "el<det><def><f><pl>");
      } else if (unit.matches("(?i)ser<vbser>.*") && stateFollows(units, i, last)) {
        units.set(i,
            unit.replaceFirst(
                "(?i)^ser<vbser>", unit.startsWith("S") ? "Estar<vblex>" : "estar<vblex>"));
      }
    }
    return passive(notAllowed(units));
  }

  /** A state or a place follows: "abierto", "cerrado", "en ...", or a phrase of the memory. */
  private static boolean stateFollows(LexicalUnits units, int i, boolean last) {
    return PROTECTED_STATE.matcher(units.pieces.get(2 * i + 2)).lookingAt()
        || (!last && STATE.matcher(units.get(i + 1)).matches());
  }

  /** "Las entradas están vendidas" becomes "Las entradas se venden". */
  private static LexicalUnits passive(LexicalUnits units) {
    for (int k = 1; k + 1 < units.size(); k++) {
      Matcher be = BE_ANY.matcher(units.get(k));
      Matcher participle = PARTICIPLE.matcher(units.get(k + 1));
      if (be.matches() && participle.matches() && units.get(k - 1).contains("<n>")) {
        String lemma =
            participle.group(1).equalsIgnoreCase("dejar") ? "permitir" : participle.group(1);
        String number = be.group(1).replaceAll(".*<(sg|pl)>$", "$1");
        units.set(k, "se<prn><pro><ref><p3><mf><sp>");
        units.set(k + 1, lemma + "<vblex><pri><p3><" + number + ">");
      }
    }
    return units;
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
    int verb =
        years + 1 < units.size() && units.get(years + 1).equals("no<adv>") ? years + 2 : years + 1;
    if (people && verb < units.size() && units.get(verb).matches(".*<(pri|prs)><p3><sg>")) {
      units.set(verb, units.get(verb).replaceFirst("<(pri|prs)><p3><sg>", "<$1><p3><pl>"));
      if (i == 1) {
        // A sentence about them: "Los niños menores de 12 años no pagan".
        Matcher gender = Pattern.compile("<n><(m|f)>").matcher(units.get(0));
        String g = gender.find() ? gender.group(1) : "m";
        units.set(0, SignRules.lowerFirst(units.get(0)));
        units.pieces.add(1, "El<det><def><" + g + "><pl>");
        units.pieces.add(2, " ");
      }
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
