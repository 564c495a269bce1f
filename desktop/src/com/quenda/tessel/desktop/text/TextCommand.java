package com.quenda.tessel.desktop.text;

import com.quenda.tessel.desktop.CommandLine;
import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.translate.Translator;
import com.quenda.tessel.desktop.translate.Translators;
import java.io.ByteArrayOutputStream;
import java.io.IOException;
import java.io.InputStream;
import java.io.PrintStream;
import java.nio.ByteBuffer;
import java.nio.charset.CharacterCodingException;
import java.nio.charset.CodingErrorAction;
import java.nio.charset.StandardCharsets;
import java.util.List;

/**
 * The text mode: standard input, one text per line, translated line by line through the same
 * translator photos and videos use, one line out per line in, in order and as soon as each is
 * done. An empty line gives an empty line; a text nothing could translate is printed as it came
 * (a reader sees the original, as on a picture). A line that is not UTF-8 gets an empty line out
 * and a one-line error naming it, the other lines are still translated, and the run ends with the
 * status of bad input data. NUL bytes are read as spaces.
 */
public final class TextCommand {
  private TextCommand() {}

  /** Translates {@code in} to {@code out}; the status is OK or NOT_AN_IMAGE (bad input data). */
  public static ExitStatus run(
      CommandLine command, InputStream in, PrintStream out, PrintStream err) throws HostException {
    int bad = 0;
    try (Translator translator =
             Translators.create(command.from, command.to, command.translations)) {
      ByteArrayOutputStream line = new ByteArrayOutputStream();
      int number = 0;
      boolean more = true;
      while (more) {
        more = readLine(in, line);
        if (!more && line.size() == 0) {
          break;
        }
        number++;
        String text = decode(line.toByteArray());
        line.reset();
        if (text == null) {
          err.println("translate: line " + number + " of standard input is not UTF-8; skipped");
          bad++;
          out.println();
        } else {
          out.println(translation(translator, text));
        }
        out.flush();
      }
    } catch (IOException e) {
      throw new HostException(ExitStatus.NO_INPUT, "cannot read standard input: " + e.getMessage());
    }
    return bad == 0 ? ExitStatus.OK : ExitStatus.NOT_AN_IMAGE;
  }

  private static String translation(Translator translator, String text) throws HostException {
    if (text.isBlank()) {
      return "";
    }
    String translated = translator.translate(List.of(text)).get(0);
    return translated == null ? text.strip() : translated;
  }

  /** Reads up to the next line break into {@code line}; false at the end of the input. */
  private static boolean readLine(InputStream in, ByteArrayOutputStream line) throws IOException {
    for (int b = in.read(); b >= 0; b = in.read()) {
      if (b == '\n') {
        return true;
      }
      line.write(b);
    }
    return false;
  }

  /**
   * The line as text (a final carriage return dropped, NUL bytes made spaces), or null when not
   * UTF-8.
   */
  private static String decode(byte[] bytes) {
    try {
      String text = StandardCharsets.UTF_8.newDecoder()
                        .onMalformedInput(CodingErrorAction.REPORT)
                        .onUnmappableCharacter(CodingErrorAction.REPORT)
                        .decode(ByteBuffer.wrap(bytes))
                        .toString();
      return text.replace('\0', ' ').replaceFirst("\r$", "");
    } catch (CharacterCodingException e) {
      return null;
    }
  }
}
