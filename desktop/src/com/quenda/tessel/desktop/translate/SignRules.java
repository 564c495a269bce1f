package com.quenda.tessel.desktop.translate;

import com.quenda.tessel.desktop.Language;
import java.util.HashSet;
import java.util.List;
import java.util.Locale;
import java.util.Map;
import java.util.Set;
import java.util.regex.Matcher;
import java.util.regex.Pattern;

/**
 * Pre- and post-editing of English signs and notices, around Apertium and between its steps.
 * Apertium reads running prose; signs are mostly commands to the reader, prohibitions and labels,
 * and it gets those wrong in the same few ways: "Please" read as the verb "to please", commands in
 * the familiar register, "No X" as "no X at all", "X only" in English order. The rules:
 *
 * <ul>
 *   <li>"Please ..." / "..., please": the word is taken off and the request, translated as a
 *       command, gets the target's polite formula ("Por favor, ...") and the formal (usted)
 *       imperative.
 *   <li>A line that starts with a verb is a command: its first word is read as the verb, and the
 *       verb comes out in the infinitive, the register of signs ("Mantener la puerta cerrada").
 *   <li>The reader is never addressed familiarly: second-person verbs, possessives and pronouns
 *       become the formal third person.
 *   <li>"No" + verb-ing and "No" + noun are prohibitions ("Prohibido fumar", "Prohibidos los
 *       perros").
 *   <li>"X only" puts the restriction first ("Solo personal").
 *   <li>Past participles are preferred to past tenses ("closed" is a state on a sign).
 * </ul>
 *
 * Numbers and times are protected from translation by the translator itself. Rules apply when the
 * source is English and the target is one with the forms used (Spanish, Catalan, Galician).
 */
final class SignRules {
  private static final Pattern PLEASE_FIRST =
      Pattern.compile("^please\\b[,:]?\\s*", Pattern.CASE_INSENSITIVE);
  private static final Pattern PLEASE_LAST =
      Pattern.compile("[,;]?\\s*\\bplease\\s*([.!]?)$", Pattern.CASE_INSENSITIVE);
  private static final Pattern ONLY_LAST =
      Pattern.compile("\\S\\s+only\\s*[.!]?$", Pattern.CASE_INSENSITIVE);
  private static final Pattern FINITE =
      Pattern.compile("<(?:pri|imp|prs|ifi|fti|pii|cni|inf)>(?:<p[123]>)?(?:<(?:sg|pl)>)?");
  private static final Pattern SECOND_PERSON_VERB =
      Pattern.compile("<(pri|imp|prs|ifi|fti|pii|cni)><p2><(?:sg|pl)>");
  static final Pattern PUNCTUATION = Pattern.compile("<(?:sent|cm|lpar|rpar|lquest|guio)>");
  private static final Pattern VERB = Pattern.compile("<(?:vblex|vbser|vbhaver|vbmod|vaux)>");
  /** The reader's familiar possessive in each target, and the formal one that replaces it. */
  private static final Map<String, Pattern> FAMILIAR_POSSESSIVE =
      Map.of("es", Pattern.compile("^(?i:vuestro|tu)<det><pos>(?:<[mf]+>)?<(sg|pl)>(.*)$"), "ca",
          Pattern.compile("^(?i:el vostre|el teu)<det><pos>(.*)$"), "gl",
          Pattern.compile("^(?i:o voso|o teu)<det><pos>(.*)$"));
  private static final Map<String, String> FORMAL_POSSESSIVE = Map.of(
      "es", "suyo<det><pos><mf><$1>$2", "ca", "el seu<det><pos>$1", "gl", "o seu<det><pos>$1");
  /** "ti", "vosotros", "tu": the reader as a stressed pronoun ("con usted", "amb vostè"). */
  private static final Pattern FAMILIAR_PRONOUN =
      Pattern.compile("^(?i:ti|vosotros|prpers)<prn><tn><p2>.*$");

  /** The words a target puts before a polite request. */
  private static final Map<String, String> PLEASE =
      Map.of("es", "Por favor, ", "gl", "Por favor, ", "ca", "Si us plau, ");
  /**
   * Words of British signs whose sign sense Apertium's dictionary gives only under another
   * English word: the lift is a machine, not a push.
   */
  private static final List<Synonym> SIGN_SYNONYMS = List.of(Synonym.of("lift<n>", "elevator<n>"));

  /** A word with its tags ("lift<n>"), matched in a unit's readings, and its sign sense. */
  private record Synonym(Pattern reading, String tags, String sense) {
    static Synonym of(String word, String sense) {
      String lemma = word.substring(0, word.indexOf('<'));
      String tags = word.substring(lemma.length());
      return new Synonym(Pattern.compile("/(?i:" + lemma + ")" + Pattern.quote(tags)), tags,
          sense.substring(0, sense.indexOf('<')));
    }
  }

  /** The definite article's lemma, for "Prohibida la entrada". */
  private static final Map<String, String> ARTICLE = Map.of("es", "el", "gl", "o", "ca", "el");

  private final boolean active;
  private final String target;

  private SignRules(boolean active, String target) {
    this.active = active;
    this.target = target;
  }

  static SignRules forPair(Language from, Language to) {
    return new SignRules(from.iso.equals("en") && PLEASE.containsKey(to.iso), to.iso);
  }

  /** The rules' work on one source text: made before translation, asked at each step. */
  Edit edit(String source) {
    return new Edit(source);
  }

  /** What the rules found in one text and apply to it at each step. */
  final class Edit {
    /** The source as Apertium should see it. */
    final String text;
    private boolean polite;
    private final boolean endsWithOnly;
    private final boolean sentence;
    private boolean command;
    private boolean prohibitsDoing;
    private boolean prohibitsThing;
    private boolean plural;
    private final Set<String> sourceWords = new HashSet<>();

    private Edit(String source) {
      String text = source;
      if (active) {
        Matcher first = PLEASE_FIRST.matcher(text);
        Matcher last = PLEASE_LAST.matcher(text);
        if (first.find() && first.end() < text.length()) {
          polite = true;
          text = text.substring(first.end());
        } else if (last.find() && last.start() > 0) {
          polite = true;
          text = text.substring(0, last.start()) + last.group(1);
        }
      }
      this.text = text;
      this.endsWithOnly = active && ONLY_LAST.matcher(text).find();
      this.sentence = text.matches(".*[.!]\\s*$");
    }

    /** Whether the text is a request ("Please ..."). */
    boolean polite() {
      return polite;
    }

    /** After morphological analysis: chooses the readings a sign means. */
    String afterAnalysis(String stream) {
      if (!active) {
        return stream;
      }
      LexicalUnits units = new LexicalUnits(stream);
      for (int i = 0; i < units.size(); i++) {
        if (i == 0 || hasReading(units.get(i - 1), "<n>")) {
          preferParticiple(units, i);
        }
        units.set(i, signSense(units.get(i)));
        sourceWords.add(LexicalUnits.surface(units.get(i)).toLowerCase(Locale.ROOT));
      }
      // Text the memory translated opens the line: what follows it does not start the sign.
      if (units.size() == 0 || units.pieces.get(0).matches("^\\[.+")) {
        return units.toString();
      }
      List<String> first = LexicalUnits.readings(units.get(0));
      String next =
          units.size() > 1 && !PUNCTUATION.matcher(units.get(1)).find() ? units.get(1) : null;
      if (LexicalUnits.surface(units.get(0)).equalsIgnoreCase("no") && next != null) {
        readProhibition(units, next);
      } else if (readsAsCommand(first, next)) {
        command = true;
        keepReadings(units, 0, "<inf>", "<vbdo>");
        // "Take a number and wait": a verb after "and" or "or" continues the command.
        for (int i = 2; i < units.size(); i++) {
          if (hasReading(units.get(i - 1), "<cnjcoo>")
              && hasReading(units.get(i), "<vblex><inf>")) {
            keepReadings(units, i, "<inf>");
          }
        }
      }
      return units.toString();
    }

    /** After transfer: the register of signs, prohibitions and the order of "only". */
    String afterTransfer(String stream) {
      if (!active) {
        return stream;
      }
      LexicalUnits units = new LexicalUnits(stream);
      boolean verbSet = !command;
      // A request, or a command written as a sentence, speaks to the reader (usted); a bare sign
      // states the rule (infinitive).
      String form = polite || sentence ? "<prs><p3><sg>" : "<inf>";
      for (int i = 0; i < units.size(); i++) {
        String unit = units.get(i);
        boolean verb = VERB.matcher(unit).find() && FINITE.matcher(unit).find();
        boolean continued = i > 0 && units.get(i - 1).contains("<cnjcoo>");
        if (verb && (!verbSet || (command && continued))) {
          units.set(i, FINITE.matcher(unit).replaceFirst(form));
          verbSet = true;
        } else {
          units.set(i, formal(unit));
        }
      }
      if (target.equals("es")) {
        units = SpanishSignUsage.apply(units, sourceWords);
      }
      if (prohibitsDoing || prohibitsThing) {
        prohibit(units);
      }
      if (endsWithOnly) {
        restrictionFirst(units);
      }
      return units.toString();
    }

    /** After generation: the polite formula and target spelling. */
    String finish(String translation) {
      if (translation == null || !active) {
        return translation;
      }
      String text = translation;
      if (target.equals("es")) {
        // Current Spanish spelling writes the adverb without an accent.
        text = text.replaceAll("\\bsólo\\b", "solo").replaceAll("\\bSólo\\b", "Solo");
      }
      if (polite) {
        String please = PLEASE.get(target);
        text = please + (text.isEmpty() ? "" : lowerFirst(text));
      }
      return text;
    }

    private void readProhibition(LexicalUnits units, String next) {
      List<String> readings = LexicalUnits.readings(next);
      if (readings.stream().anyMatch(r -> r.contains("<ger>"))) {
        prohibitsDoing = true;
        keepReadings(units, 1, "<ger>");
      } else if (readings.stream().anyMatch(r -> r.contains("<n>"))) {
        prohibitsThing = true;
        plural = readings.stream().anyMatch(r -> r.contains("<n><pl>"));
        keepReadings(units, 1, "<n>");
      }
    }

    /** "Prohibido fumar", "Prohibida la entrada", "Prohibidos los perros". */
    private void prohibit(LexicalUnits units) {
      if (units.size() < 2) {
        return;
      }
      if (prohibitsDoing) {
        units.set(0, "prohibir<vblex><pp><m><sg>");
        return;
      }
      // "No" came out as a determiner ("ningún"); the noun after it gives gender and number.
      int noun = -1;
      for (int i = 1; i < units.size() && noun < 0; i++) {
        if (units.get(i).contains("<n>")) {
          noun = i;
        }
      }
      if (noun < 0) {
        return;
      }
      Matcher gender = Pattern.compile("<n><(m|f|mf)>").matcher(units.get(noun));
      String g = gender.find() && !gender.group(1).equals("mf") ? gender.group(1) : "m";
      String n = plural ? "pl" : "sg";
      units.set(noun, units.get(noun).replaceFirst("<(sg|pl|sp)>", "<" + n + ">"));
      units.set(0, String.format("prohibir<vblex><pp><%s><%s>", g, n));
      String article = String.format("%s<det><def><%s><%s>", ARTICLE.get(target), g, n);
      if (noun == 1) {
        units.insert(1, article);
        noun = 2;
      }
      units.set(noun, lowerFirst(units.get(noun)));
    }

    private void restrictionFirst(LexicalUnits units) {
      int last = units.size() - 1;
      while (last > 0 && units.get(last).contains("<sent>")) {
        last--;
      }
      if (last <= 0 || !units.get(last).contains("<adv>")) {
        return;
      }
      String only = units.get(last);
      units.remove(last);
      units.set(0, lowerFirst(units.get(0)));
      units.insert(0, upperFirst(only));
    }
  }

  /** The sign sense of an ambiguous English word, given as the word that has it alone. */
  private static String signSense(String unit) {
    for (Synonym synonym : SIGN_SYNONYMS) {
      Matcher m = synonym.reading().matcher(unit);
      if (m.find()) {
        boolean capital = Character.isUpperCase(unit.charAt(m.start() + 1));
        return m.replaceAll(Matcher.quoteReplacement(
            "/" + (capital ? upperFirst(synonym.sense()) : synonym.sense()) + synonym.tags()));
      }
    }
    return unit;
  }

  /** A line starting with a verb (and not an adjective before a number, "Open 9-5") commands. */
  private static boolean readsAsCommand(List<String> first, String next) {
    boolean verb = first.stream().anyMatch(r -> r.contains("<vblex><inf>") || r.contains("<vbdo>"));
    if (!verb) {
      return false;
    }
    if (next == null) {
      // A single word: a noun or adjective reading is the likelier sign ("Exit", "Open").
      return first.stream().noneMatch(r -> r.contains("<n>") || r.contains("<adj>"));
    }
    List<String> after = LexicalUnits.readings(next);
    boolean adjective = first.stream().anyMatch(r -> r.contains("<adj>"));
    boolean objectFollows =
        after.stream().anyMatch(r -> r.contains("<det>") || r.contains("<prn>"));
    return !adjective || objectFollows;
  }

  private static boolean hasReading(String unit, String tag) {
    return LexicalUnits.readings(unit).stream().anyMatch(r -> r.contains(tag))
        || (unit.indexOf('/') < 0 && unit.contains(tag));
  }

  private static void preferParticiple(LexicalUnits units, int i) {
    List<String> readings = LexicalUnits.readings(units.get(i));
    if (readings.stream().anyMatch(r -> r.contains("<pp>"))
        && readings.stream().anyMatch(r -> r.contains("<past>"))) {
      keepReadings(units, i, "<pp>");
    }
  }

  /** Keeps only the readings of unit {@code i} that contain one of {@code tags}, if any do. */
  private static void keepReadings(LexicalUnits units, int i, String... tags) {
    String unit = units.get(i);
    StringBuilder kept = new StringBuilder(LexicalUnits.surface(unit));
    for (String reading : LexicalUnits.readings(unit)) {
      for (String tag : tags) {
        if (reading.contains(tag)) {
          kept.append('/').append(reading);
          break;
        }
      }
    }
    if (kept.length() > LexicalUnits.surface(unit).length()) {
      units.set(i, kept.toString());
    }
  }

  /** A transferred unit in the formal register: third person for the reader. */
  private String formal(String unit) {
    String formal = SECOND_PERSON_VERB.matcher(unit).replaceAll("<$1><p3><sg>");
    Matcher possessive = FAMILIAR_POSSESSIVE.get(target).matcher(formal);
    if (possessive.matches()) {
      return possessive.replaceFirst(FORMAL_POSSESSIVE.get(target));
    }
    if (FAMILIAR_PRONOUN.matcher(formal).matches()) {
      return "prpers<prn><tn><p3><mf><sg>";
    }
    // Clitics: "te" becomes "le".
    return formal.replaceFirst(
        "^prpers<prn><(pro|enc)><p2><mf><(sg|pl)>", "prpers<prn><$1><p3><mf><sg>");
  }

  static String lowerFirst(String text) {
    if (text.isEmpty()) {
      return text;
    }
    int first = text.codePointAt(0);
    return new StringBuilder()
        .appendCodePoint(Character.toLowerCase(first))
        .append(text.substring(Character.charCount(first)))
        .toString();
  }

  static String upperFirst(String text) {
    if (text.isEmpty()) {
      return text;
    }
    int first = text.codePointAt(0);
    return new StringBuilder()
        .appendCodePoint(Character.toUpperCase(first))
        .append(text.substring(Character.charCount(first)))
        .toString();
  }
}
