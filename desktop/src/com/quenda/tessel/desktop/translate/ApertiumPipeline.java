package com.quenda.tessel.desktop.translate;

import com.quenda.tessel.desktop.ChildProcess;
import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import java.io.IOException;
import java.io.PrintStream;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.List;
import java.util.Map;

/**
 * One Apertium translation direction kept running in three parts: analysis, then tagging and
 * transfer, then generation. Between them the host's editing rules see the text as Apertium does
 * (lexical units with their morphological tags), which is where rules about imperatives and
 * registers are reliable; string rewriting of the finished Spanish is not.
 *
 * <p>The parts come from the direction's mode file in null-flush form (what apertium -z runs):
 * the first program is the morphological analyser and the generator is the first program given
 * the generation option ($1). Each part is a {@link NullFlushProcess}.
 */
final class ApertiumPipeline implements AutoCloseable {
  static final Path MODES = Path.of("/usr/share/apertium/modes");

  private final List<NullFlushProcess> parts;

  private ApertiumPipeline(List<NullFlushProcess> parts) {
    this.parts = parts;
  }

  /** The three running parts of {@code mode}, each answering within {@code timeoutMillis}. */
  static ApertiumPipeline start(String mode, long timeoutMillis, PrintStream log)
      throws HostException {
    String pipeline = nullFlushPipeline(mode, timeoutMillis);
    List<String> programs = List.of(pipeline.split(" \\| "));
    int generator = -1;
    for (int i = 1; i < programs.size() && generator < 0; i++) {
      if (programs.get(i).contains("$1")) {
        generator = i;
      }
    }
    if (generator < 2) {
      throw new HostException(ExitStatus.MISSING_TRANSLATION,
          "the Apertium mode " + mode + " has no generator step: reinstall its Debian package");
    }
    List<List<String>> split = List.of(programs.subList(0, 1), programs.subList(1, generator),
        programs.subList(generator, programs.size()));
    String[] names = {"analysis", "transfer", "generation"};
    List<NullFlushProcess> parts = new ArrayList<>();
    for (int i = 0; i < split.size(); i++) {
      // $1 is the generator's option (-g marks unknown words), $2 the tagger's (none).
      String script = String.join(" | ", split.get(i)).replace("$1", "-g").replace("$2", "");
      parts.add(new NullFlushProcess("apertium " + mode + " (" + names[i] + ")",
          List.of("bash", "-c", script), timeoutMillis, log));
    }
    return new ApertiumPipeline(parts);
  }

  /** The stream-format translation of one segment, with {@code rules} applied between parts. */
  String translate(String segment, SignRules.Edit rules) throws HostException {
    String analysed = rules.afterAnalysis(parts.get(0).ask(segment));
    String transferred = rules.afterTransfer(parts.get(1).ask(analysed));
    return parts.get(2).ask(transferred);
  }

  /** The morphological analysis of one segment: its lexical units with every reading. */
  String analyse(String segment) throws HostException {
    return parts.get(0).ask(segment);
  }

  /** The running part {@code i} (0 to 2), for tests that stop one. */
  NullFlushProcess part(int i) {
    return parts.get(i);
  }

  @Override
  public void close() {
    for (NullFlushProcess part : parts) {
      part.close();
    }
  }

  private static String nullFlushPipeline(String mode, long timeoutMillis) throws HostException {
    Path file = MODES.resolve(mode + ".mode");
    if (!Files.isReadable(file)) {
      throw new HostException(ExitStatus.MISSING_TRANSLATION,
          "cannot read the Apertium mode file " + file + ": reinstall its Debian package");
    }
    ChildProcess.Result result;
    try {
      result = ChildProcess.run("translation",
          List.of("apertium-wblank-mode", "-z", file.toString()), "", Map.of(), timeoutMillis);
    } catch (IOException e) {
      throw new HostException(ExitStatus.MISSING_TRANSLATION,
          "cannot run apertium-wblank-mode: install the Debian package apertium");
    }
    String text = result.stdout.strip();
    if (result.exitCode != 0 || text.isEmpty()) {
      throw new HostException(ExitStatus.MISSING_TRANSLATION,
          "apertium-wblank-mode failed on " + file + ": "
              + (text + " " + result.stderr.strip()).strip());
    }
    return text;
  }
}
