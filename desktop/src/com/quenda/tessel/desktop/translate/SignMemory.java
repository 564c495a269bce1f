package com.quenda.tessel.desktop.translate;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import java.io.IOException;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.HashMap;
import java.util.List;
import java.util.Locale;
import java.util.Map;
import java.util.regex.Matcher;
import java.util.regex.Pattern;
import javax.xml.parsers.ParserConfigurationException;
import javax.xml.parsers.SAXParser;
import javax.xml.parsers.SAXParserFactory;
import org.xml.sax.Attributes;
import org.xml.sax.Locator;
import org.xml.sax.SAXException;
import org.xml.sax.SAXParseException;
import org.xml.sax.helpers.DefaultHandler;

/**
 * A translation memory of the phrases of public signs and notices, read from a TMX file. Known
 * segments are found inside running text, whole words only, without regard to case or to the
 * punctuation around them ("NO ENTRY", "No entry." and "no entry" are one segment). A segment of a
 * single word is matched only as a whole text: "Exit" alone is a sign, "exit" in a sentence is
 * usually a verb.
 */
final class SignMemory {
  private static final Pattern WORD = Pattern.compile("[\\p{L}\\p{N}]+(?:['’][\\p{L}\\p{N}]+)*");
  /** What may stand between the words of one segment: spaces and joining marks only. */
  private static final Pattern JOINER = Pattern.compile("[\\s\\-'’]*");

  /** A known segment found in a text: its place and its translation. */
  static final class Match {
    final int start;
    final int end;
    final String translation;

    Match(int start, int end, String translation) {
      this.start = start;
      this.end = end;
      this.translation = translation;
    }
  }

  static final SignMemory EMPTY = new SignMemory(Map.of(), 0, "no memory");

  private final Map<String, String> segments;
  private final int longest;
  private final String name;

  private SignMemory(Map<String, String> segments, int longest, String name) {
    this.segments = segments;
    this.longest = longest;
    this.name = name;
  }

  int size() {
    return segments.size();
  }

  String name() {
    return name;
  }

  /**
   * The memory for translating {@code from} into {@code to} (ISO codes) from {@code file}; a file
   * that does not parse is a usage error naming the file and line.
   */
  static SignMemory read(Path file, String from, String to) throws HostException {
    Handler handler = new Handler(file, from, to);
    try {
      SAXParserFactory factory = SAXParserFactory.newInstance();
      factory.setNamespaceAware(true);
      factory.setFeature("http://apache.org/xml/features/disallow-doctype-decl", true);
      SAXParser parser = factory.newSAXParser();
      parser.parse(Files.newInputStream(file), handler);
    } catch (SAXParseException e) {
      throw new HostException(
          ExitStatus.USAGE, String.format("%s:%d: %s", file, e.getLineNumber(), e.getMessage()));
    } catch (SAXException | ParserConfigurationException e) {
      throw new HostException(ExitStatus.USAGE, file + ": " + e.getMessage());
    } catch (IOException e) {
      throw new HostException(ExitStatus.NO_INPUT, "cannot read the memory " + file);
    }
    int longest = 0;
    for (String key : handler.segments.keySet()) {
      longest = Math.max(longest, key.split(" ").length);
    }
    return new SignMemory(handler.segments, longest,
        "memory " + file.getFileName() + " (" + handler.segments.size() + " segments)");
  }

  /** The translation of {@code text} when the memory knows all of it, else null. */
  String whole(String text) {
    return segments.get(key(text));
  }

  /** The known segments of two words or more in {@code text}, longest first, left to right. */
  List<Match> find(String text) {
    List<int[]> words = new ArrayList<>();
    Matcher m = WORD.matcher(text);
    while (m.find()) {
      words.add(new int[] {m.start(), m.end()});
    }
    List<Match> found = new ArrayList<>();
    for (int i = 0; i < words.size();) {
      int matched = 0;
      for (int n = Math.min(longest, words.size() - i); n >= 2 && matched == 0; n--) {
        String translation = lookup(text, words.subList(i, i + n));
        if (translation != null) {
          found.add(new Match(words.get(i)[0], words.get(i + n - 1)[1], translation));
          matched = n;
        }
      }
      i += Math.max(matched, 1);
    }
    return found;
  }

  private String lookup(String text, List<int[]> words) {
    StringBuilder key = new StringBuilder();
    for (int k = 0; k < words.size(); k++) {
      if (k > 0) {
        String between = text.substring(words.get(k - 1)[1], words.get(k)[0]);
        if (!JOINER.matcher(between).matches()) {
          return null;
        }
        key.append(' ');
      }
      key.append(text, words.get(k)[0], words.get(k)[1]);
    }
    return segments.get(key.toString().toLowerCase(Locale.ROOT).replace('’', '\''));
  }

  /** Letters and digits of the words, lower case, one space apart. */
  static String key(String text) {
    StringBuilder key = new StringBuilder();
    Matcher m = WORD.matcher(text);
    while (m.find()) {
      key.append(key.length() == 0 ? "" : " ").append(m.group());
    }
    return key.toString().toLowerCase(Locale.ROOT).replace('’', '\'');
  }

  /** Collects the segment pairs of the two languages from TMX's tu, tuv and seg elements. */
  private static final class Handler extends DefaultHandler {
    final Map<String, String> segments = new HashMap<>();
    private final Path file;
    private final String from;
    private final String to;
    private Locator locator;
    private final Map<String, String> unit = new HashMap<>();
    private String language;
    private StringBuilder seg;
    private int unitLine;

    Handler(Path file, String from, String to) {
      this.file = file;
      this.from = from;
      this.to = to;
    }

    @Override
    public void setDocumentLocator(Locator locator) {
      this.locator = locator;
    }

    @Override
    public void startElement(String uri, String local, String qName, Attributes attributes)
        throws SAXException {
      switch (local) {
        case "tu":
          unit.clear();
          unitLine = locator.getLineNumber();
          break;
        case "tuv":
          language = attributes.getValue("http://www.w3.org/XML/1998/namespace", "lang");
          if (language == null) {
            throw error("a tuv without xml:lang");
          }
          language = language.toLowerCase(Locale.ROOT);
          break;
        case "seg":
          seg = new StringBuilder();
          break;
        default:
          break;
      }
    }

    @Override
    public void characters(char[] ch, int start, int length) {
      if (seg != null) {
        seg.append(ch, start, length);
      }
    }

    @Override
    public void endElement(String uri, String local, String qName) throws SAXException {
      if (local.equals("seg")) {
        String text = seg.toString().strip().replaceAll("\\s+", " ");
        if (text.isEmpty()) {
          throw error("an empty seg");
        }
        unit.put(language, text);
        seg = null;
      } else if (local.equals("tu")) {
        if (!unit.containsKey(from) && !unit.containsKey(to)) {
          throw new SAXParseException(
              "a tu with neither " + from + " nor " + to + " text", null, null, unitLine, 0);
        }
        if (unit.containsKey(from) && unit.containsKey(to)) {
          segments.put(key(unit.get(from)), unit.get(to));
        }
      }
    }

    private SAXParseException error(String problem) {
      return new SAXParseException(problem + " in " + file.getFileName(), locator);
    }
  }
}
