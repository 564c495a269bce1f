package com.quenda.tessel.desktop.translate;

import com.quenda.tessel.desktop.ChildProcess;
import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import java.io.IOException;
import java.io.PrintStream;
import java.nio.file.Files;
import java.nio.file.Path;
import java.text.BreakIterator;
import java.util.ArrayList;
import java.util.HashSet;
import java.util.List;
import java.util.Locale;
import java.util.Map;
import java.util.Set;
import java.util.regex.Matcher;
import java.util.regex.Pattern;

/**
 * Translation by Apertium, kept running for the whole run, with the sign memory and the editing
 * rules around it. Each text is translated on its own, and a text of several sentences (a
 * paragraph read as one block) sentence by sentence, so that the memory and the rules see each
 * sentence whole as they would see it on a sign. Each sentence, in this order:
 *
 * <ol>
 *   <li>its case is noted and the text put in sentence case ({@link CaseStyle});
 *   <li>a text the memory knows whole is translated by the memory alone;
 *   <li>else the editing rules take their look ({@link SignRules}), and the text goes to Apertium
 *       as one segment, with known segments of the memory and times protected as
 *       superblanks, so that Apertium translates around them;
 *   <li>Apertium's marks of unknown words are dropped, and the case is put back.
 * </ol>
 *
 * A text in which Apertium knew no word (and the memory none) is not translated (null).
 */
public final class ApertiumTranslator implements Translator {
  /** How long one text may take; a hung Apertium is restarted after it, never waited for. */
  static final long TIMEOUT_MILLIS = 30_000;
  private static final long LIST_TIMEOUT_MILLIS = 120_000;
  private static final Pattern MARK = Pattern.compile("(?<![\\p{L}\\p{N}])[*#@](?=[\\p{L}\\p{N}])");
  private static final Pattern UNKNOWN =
      Pattern.compile("(?<![\\p{L}\\p{N}])\\*(?=[\\p{L}\\p{N}])");
  /**
   * Times with "am" or "pm", kept as written: Apertium reads the "am" of "10am" as the verb
   * ("10soy"). Other numbers, prices and times it keeps as written itself, and protecting them
   * would let it move words across them.
   */
  private static final Pattern NUMBER = Pattern.compile(
      "(?<![\\p{L}\\p{N}])\\d[\\d:.]*\\s?[ap]\\.?m\\b\\.?", Pattern.CASE_INSENSITIVE);
  /** A capital Apertium put after protected text, as if a sentence started there. */
  private static final Pattern CAPITAL_AFTER_BLANK =
      Pattern.compile("(?<=[^\\[]\\])(\\s*(?:[*#@]\\S+\\s+)*)(\\p{Lu}[\\p{Ll}\\p{M}]+)");
  /** A request after a comma or colon. */
  private static final Pattern LATER_REQUEST =
      Pattern.compile("([,;:]\\s*)(?=please\\s+\\p{L})", Pattern.CASE_INSENSITIVE);
  private static final Pattern EDGE = Pattern.compile("^[^\\p{L}\\p{N}]*|[^\\p{L}\\p{N}]*$");

  private final String mode;
  private final Language to;
  private final SignMemory memory;
  private final SignRules rules;
  private final ApertiumPipeline pipeline;

  /**
   * Checks that apertium and a mode from {@code from} to {@code to} are installed and starts it;
   * the memory is the pair's file in the directory named by the property translate.memory.
   */
  public ApertiumTranslator(Language from, Language to) throws HostException {
    this(from, to, memoryOf(from, to), TIMEOUT_MILLIS, System.err);
  }

  ApertiumTranslator(Language from, Language to, SignMemory memory, long timeoutMillis,
      PrintStream log) throws HostException {
    mode = ApertiumPairs.chooseMode(installedModes(from, to), from, to);
    if (mode == null) {
      throw new HostException(ExitStatus.MISSING_TRANSLATION, ApertiumPairs.missingPair(from, to));
    }
    this.to = to;
    this.memory = memory;
    this.rules = SignRules.forPair(from, to);
    this.pipeline = ApertiumPipeline.start(mode, timeoutMillis, log);
  }

  /** The pair's memory file in the directory of the property translate.memory, if there is one. */
  static SignMemory memoryOf(Language from, Language to) throws HostException {
    String directory = System.getProperty("translate.memory");
    if (directory == null) {
      return SignMemory.EMPTY;
    }
    Path file = Path.of(directory, from.iso + "-" + to.iso + ".tmx");
    return Files.exists(file) ? SignMemory.read(file, from.iso, to.iso) : SignMemory.EMPTY;
  }

  @Override
  public String name() {
    return "apertium " + mode + (memory.size() > 0 ? " with " + memory.name() : "");
  }

  @Override
  public List<String> translate(List<String> lines) throws HostException {
    List<String> translations = new ArrayList<>(lines.size());
    for (String line : lines) {
      translations.add(translateOne(line));
    }
    return translations;
  }

  @Override
  public void close() {
    pipeline.close();
  }

  /** The running pipeline, for tests that stop a part of it. */
  ApertiumPipeline pipeline() {
    return pipeline;
  }

  private String translateOne(String line) throws HostException {
    String flat = line.replaceAll("\\s+", " ").strip();
    if (flat.isEmpty()) {
      return null;
    }
    List<String> sentences = sentences(flat);
    if (sentences.size() > 1) {
      return bySentence(sentences);
    }
    Matcher request = LATER_REQUEST.matcher(flat);
    if (request.find() && request.start() > 0) {
      // "Wet floor, please walk carefully": the request is a sentence of its own.
      String first = translateOne(flat.substring(0, request.start()));
      String second = translateOne(flat.substring(request.end()));
      if (first != null && second != null) {
        return first + request.group(1) + SignRules.lowerFirst(second);
      }
    }
    CaseStyle style = CaseStyle.of(flat);
    String source =
        style.forTranslation(flat, style == CaseStyle.SENTENCE ? Set.of() : names(flat));
    String translation = wholeFromMemory(source);
    if (translation == null) {
      SignRules.Edit edit = rules.edit(source);
      List<SignMemory.Match> known = knownInside(edit);
      // Apertium's own text reader ends every text with a full stop, and its tagger is trained on
      // what that gives; the stop is added here too and taken back off.
      String stream = pipeline.translate(segment(edit.text + ".", known), edit);
      String output = StreamFormat.plain(lowerAfterProtected(stream, edit.text)).strip();
      output = output.endsWith(".") ? output.substring(0, output.length() - 1) : output;
      String plain = unmarked(output);
      if (plain == null && !known.isEmpty()) {
        plain = MARK.matcher(output.replaceAll("\\s+", " ").strip()).replaceAll("");
      }
      translation = edit.finish(plain);
    }
    return style.apply(translation, flat, to.iso);
  }

  /** The sentences of a text, in order; one for a text of one sentence. */
  static List<String> sentences(String text) {
    BreakIterator breaks = BreakIterator.getSentenceInstance(Locale.ENGLISH);
    breaks.setText(text);
    List<String> sentences = new ArrayList<>();
    for (int start = breaks.first(), end = breaks.next(); end != BreakIterator.DONE;
         start = end, end = breaks.next()) {
      String sentence = text.substring(start, end).strip();
      if (!sentence.isEmpty()) {
        sentences.add(sentence);
      }
    }
    return sentences;
  }

  /**
   * Each sentence translated on its own and joined again; one that cannot be translated (a name,
   * a code) stands as written. Null when none can.
   */
  private String bySentence(List<String> sentences) throws HostException {
    StringBuilder joined = new StringBuilder();
    boolean any = false;
    for (String sentence : sentences) {
      String translation = translateOne(sentence);
      any |= translation != null;
      joined.append(joined.length() == 0 ? "" : " ")
          .append(translation != null ? translation : sentence);
    }
    return any ? joined.toString() : null;
  }

  /**
   * The words of a text in capitals or Title Case that Apertium knows only as names ("Spain",
   * "Madrid"): they keep their capital when the text is put in sentence case for it.
   */
  private Set<String> names(String text) throws HostException {
    String probe = CaseStyle.capitalised(text);
    LexicalUnits units = new LexicalUnits(
        pipeline.analyse(StreamFormat.escape(probe) + "." + StreamFormat.SEGMENT_END));
    Set<String> names = new HashSet<>();
    for (int i = 0; i < units.size(); i++) {
      List<String> readings = LexicalUnits.readings(units.get(i));
      if (!readings.isEmpty() && readings.stream().allMatch(r -> r.contains("<np>"))) {
        names.add(LexicalUnits.surface(units.get(i)).toLowerCase(Locale.ROOT));
      }
    }
    return names;
  }

  /**
   * Apertium starts a sentence after a superblank; the word there keeps its capital only when the
   * source has it with one (a name left untranslated).
   */
  private static String lowerAfterProtected(String stream, String source) {
    Matcher m = CAPITAL_AFTER_BLANK.matcher(stream);
    StringBuilder out = new StringBuilder();
    while (m.find()) {
      String word = m.group(2);
      boolean name = Pattern.compile("\\b" + Pattern.quote(word) + "\\b").matcher(source).find();
      m.appendReplacement(
          out, Matcher.quoteReplacement(m.group(1) + (name ? word : SignRules.lowerFirst(word))));
    }
    m.appendTail(out);
    return out.toString();
  }

  /** The memory's translation of the whole text, with the text's own punctuation around it. */
  private String wholeFromMemory(String source) {
    String known = memory.whole(source);
    if (known == null) {
      return null;
    }
    Matcher edges = EDGE.matcher(source);
    String lead = edges.find() ? edges.group() : "";
    String trail = edges.find() ? edges.group() : "";
    boolean punctuated =
        !known.isEmpty() && !Character.isLetterOrDigit(known.codePointBefore(known.length()));
    return lead + known + (punctuated ? "" : trail);
  }

  /**
   * The memory's phrases inside the text. A request keeps its verb for the rules: the memory's
   * commands are infinitives, and "Por favor, ..." needs the usted form.
   */
  private List<SignMemory.Match> knownInside(SignRules.Edit edit) {
    List<SignMemory.Match> known = new ArrayList<>();
    for (SignMemory.Match match : memory.find(edit.text)) {
      if (!(edit.polite() && match.start == 0)) {
        known.add(to.iso.equals("es") ? SpanishArticle.takeIn(edit.text, match) : match);
      }
    }
    return known;
  }

  /** One segment in stream format: memory translations and times as superblanks. */
  private static String segment(String text, List<SignMemory.Match> known) {
    StringBuilder out = new StringBuilder();
    int done = 0;
    for (SignMemory.Match match : known) {
      protectNumbers(out, text.substring(done, match.start));
      out.append(StreamFormat.superblank(caseOfPlace(text, match)));
      done = match.end;
    }
    protectNumbers(out, text.substring(done));
    return out.append(StreamFormat.SEGMENT_END).toString();
  }

  /** A memory translation starts with a capital where its source did. */
  private static String caseOfPlace(String text, SignMemory.Match match) {
    boolean upper = Character.isUpperCase(text.codePointAt(match.start));
    return upper ? SignRules.upperFirst(match.translation)
                 : SignRules.lowerFirst(match.translation);
  }

  private static void protectNumbers(StringBuilder out, String text) {
    Matcher m = NUMBER.matcher(text);
    int done = 0;
    while (m.find()) {
      out.append(StreamFormat.escape(text.substring(done, m.start())))
          .append(StreamFormat.superblank(m.group()));
      done = m.end();
    }
    out.append(StreamFormat.escape(text.substring(done)));
  }

  private static List<String> installedModes(Language from, Language to) throws HostException {
    ChildProcess.Result result;
    try {
      result = ChildProcess.run(
          "translation", List.of("apertium", "-l"), "", Map.of(), LIST_TIMEOUT_MILLIS);
    } catch (IOException e) {
      throw new HostException(ExitStatus.MISSING_TRANSLATION,
          "Apertium is not installed: install the Debian packages apertium and "
              + ApertiumPairs.debianPackage(from, to));
    }
    List<String> modes = new ArrayList<>();
    for (String line : result.stdout.split("\n")) {
      if (!line.isBlank()) {
        modes.add(line.strip());
      }
    }
    return modes;
  }

  /** The text without Apertium's marks; null when no word of it was known. */
  static String unmarked(String text) {
    int known = 0;
    StringBuilder out = new StringBuilder();
    for (String word : text.strip().split("\\s+")) {
      if (word.isEmpty()) {
        continue;
      }
      // A mark stands before the word's letters, after any punctuation glued to it ("(*word").
      String plain = MARK.matcher(word).replaceAll("");
      if (!UNKNOWN.matcher(word).find()
          && plain.codePoints().anyMatch(Character::isLetterOrDigit)) {
        ++known;
      }
      out.append(out.length() == 0 ? "" : " ").append(plain);
    }
    return known == 0 ? null : out.toString();
  }
}
