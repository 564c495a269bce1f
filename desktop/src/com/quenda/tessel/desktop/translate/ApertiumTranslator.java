package com.quenda.tessel.desktop.translate;

import com.quenda.tessel.desktop.ChildProcess;
import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import java.io.IOException;
import java.util.ArrayList;
import java.util.List;
import java.util.Map;
import java.util.regex.Pattern;

/**
 * Translation by the apertium program, all lines of an image in one run.
 *
 * <p>Apertium reads running text: lines separated by a single line break are one paragraph, and
 * its rules move words across the break ("Please keep / the door closed" comes back with words of
 * one line in the other). A blank line ends a paragraph, so the lines go in separated by blank
 * lines and come back the same way. Unknown words come back marked with '*' (and words it failed
 * to inflect with '#' or '@'); the marks are dropped from the drawn text, and a line in which
 * every word was unknown counts as not translated.
 */
public final class ApertiumTranslator implements Translator {
  private static final long TIMEOUT_MILLIS = 120_000;
  private static final Pattern MARK = Pattern.compile("(?<![\\p{L}\\p{N}])[*#@](?=[\\p{L}\\p{N}])");
  private static final Pattern UNKNOWN =
      Pattern.compile("(?<![\\p{L}\\p{N}])\\*(?=[\\p{L}\\p{N}])");

  private final String mode;

  /** Checks that apertium and a mode from {@code from} to {@code to} are installed. */
  public ApertiumTranslator(Language from, Language to) throws HostException {
    List<String> modes = installedModes(from, to);
    mode = ApertiumPairs.chooseMode(modes, from, to);
    if (mode == null) {
      throw new HostException(ExitStatus.MISSING_TRANSLATION, ApertiumPairs.missingPair(from, to));
    }
  }

  @Override
  public String name() {
    return "apertium " + mode;
  }

  @Override
  public List<String> translate(List<String> lines) throws HostException {
    if (lines.isEmpty()) {
      return List.of();
    }
    List<String> paragraphs = paragraphs(run(String.join("\n\n", oneLineEach(lines)) + "\n"));
    if (paragraphs.size() != lines.size()) {
      // A line Apertium split or joined after all: ask line by line rather than misplace text.
      paragraphs = new ArrayList<>();
      for (String line : oneLineEach(lines)) {
        paragraphs.add(String.join(" ", paragraphs(run(line + "\n"))));
      }
    }
    List<String> translations = new ArrayList<>();
    for (String paragraph : paragraphs) {
      translations.add(unmarked(paragraph));
    }
    return translations;
  }

  private String run(String text) throws HostException {
    ChildProcess.Result result;
    try {
      result = ChildProcess.run(
          "translation", List.of("apertium", mode), text, Map.of(), TIMEOUT_MILLIS);
    } catch (IOException e) {
      throw new HostException(ExitStatus.MISSING_TRANSLATION,
          "cannot run apertium: install the Debian package apertium");
    }
    if (result.exitCode != 0) {
      throw new HostException(ExitStatus.CHILD_FAILED,
          "apertium " + mode + " failed (exit " + result.exitCode + "): " + result.lastErrorLine());
    }
    return result.stdout;
  }

  private static List<String> installedModes(Language from, Language to) throws HostException {
    ChildProcess.Result result;
    try {
      result =
          ChildProcess.run("translation", List.of("apertium", "-l"), "", Map.of(), TIMEOUT_MILLIS);
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

  private static List<String> oneLineEach(List<String> lines) {
    List<String> flat = new ArrayList<>();
    for (String line : lines) {
      flat.add(line.replaceAll("\\s+", " ").strip());
    }
    return flat;
  }

  private static List<String> paragraphs(String output) {
    List<String> paragraphs = new ArrayList<>();
    for (String paragraph : output.strip().split("\\n\\s*\\n")) {
      paragraphs.add(paragraph.replaceAll("\\s+", " ").strip());
    }
    return paragraphs;
  }

  /** The paragraph without Apertium's marks; null when no word of it was known. */
  static String unmarked(String paragraph) {
    int known = 0;
    StringBuilder text = new StringBuilder();
    for (String word : paragraph.split(" ")) {
      if (word.isEmpty()) {
        continue;
      }
      // A mark stands before the word's letters, after any punctuation glued to it ("(*word").
      String plain = MARK.matcher(word).replaceAll("");
      if (!UNKNOWN.matcher(word).find()
          && plain.codePoints().anyMatch(Character::isLetterOrDigit)) {
        ++known;
      }
      text.append(text.length() == 0 ? "" : " ").append(plain);
    }
    return known == 0 ? null : text.toString();
  }
}
