package com.quenda.tessel.desktop;

import java.nio.file.Path;
import java.util.ArrayList;
import java.util.List;

/** The parsed command line: a mode, its inputs and the options common to every mode. */
public final class CommandLine {
  public static final String USAGE = String.join("\n",
      "usage: translate.sh photo IMAGE... --from LANG --to LANG --out DIR [options]",
      "       translate.sh video VIDEO_OR_FRAME_FOLDER --from LANG --to LANG --out DIR [--live]",
      "       translate.sh text --from LANG --to LANG [--translations FILE]", "",
      "Finds the text, translates it and draws the translation in place. photo writes",
      "DIR/NAME.png (translated), DIR/NAME.compare.png (before | after) and DIR/NAME.json;",
      "video writes DIR/NAME.mp4 (or .avi), DIR/NAME.preview.gif and DIR/NAME.json.",
      "text reads standard input, one text per line, and prints one translation per line",
      "(an empty line for an empty line, the original where nothing could be translated).", "",
      "  --from LANG          language of the text in the images (ISO 639-1, default en)",
      "  --to LANG            language to translate into (ISO 639-1, default es)",
      "  --out DIR            output directory (default out), created when missing",
      "  --translations FILE  tab-separated phrase table (source<TAB>translation), asked",
      "                       before the machine translation; alone for pairs it lacks",
      "  --live               video: frames at the source's rate, OCR off the frame path",
      "  --quiet              no progress bar and no messages, only errors and the summary", "",
      "Languages: " + Language.knownCodes());

  public final String mode;
  public final List<Path> inputs;
  public final Language from;
  public final Language to;
  public final Path out;
  public final Path translations;
  public final boolean quiet;
  public final boolean live;

  private CommandLine(String mode, List<Path> inputs, Language from, Language to, Path out,
      Path translations, boolean quiet, boolean live) {
    this.mode = mode;
    this.inputs = inputs;
    this.from = from;
    this.to = to;
    this.out = out;
    this.translations = translations;
    this.quiet = quiet;
    this.live = live;
  }

  /** Parses {@code args}; every mistake is a USAGE error naming what is wrong. */
  public static CommandLine parse(String[] args) throws HostException {
    if (args.length == 0) {
      throw usage("no mode given");
    }
    String mode = args[0];
    if (!mode.equals("photo") && !mode.equals("video") && !mode.equals("text")) {
      throw usage("unknown mode '" + mode + "' (expected photo, video or text)");
    }
    List<Path> inputs = new ArrayList<>();
    String from = "en";
    String to = "es";
    String out = "out";
    String translations = null;
    boolean quiet = false;
    boolean live = false;
    for (int i = 1; i < args.length; i++) {
      String arg = args[i];
      switch (arg) {
        case "--from":
          from = value(args, ++i, arg);
          break;
        case "--to":
          to = value(args, ++i, arg);
          break;
        case "--out":
          out = value(args, ++i, arg);
          break;
        case "--translations":
          translations = value(args, ++i, arg);
          break;
        case "--quiet":
          quiet = true;
          break;
        case "--live":
          live = true;
          break;
        default:
          if (arg.startsWith("--")) {
            throw usage("unknown option " + arg);
          }
          inputs.add(Path.of(arg));
      }
    }
    boolean video = mode.equals("video");
    if (mode.equals("text") && !inputs.isEmpty()) {
      throw usage("text reads standard input, not " + inputs.get(0));
    }
    if (inputs.isEmpty() && !mode.equals("text")) {
      throw usage(video ? "no video or frame folder given" : "no input image given");
    }
    if (video && inputs.size() > 1) {
      throw usage("video takes one video or frame folder, not " + inputs.size());
    }
    if (live && !video) {
      throw usage("--live is for video");
    }
    Language source = language(from, "--from");
    Language target = language(to, "--to");
    if (source == target) {
      throw usage("--from and --to are both " + source.iso);
    }
    return new CommandLine(mode, List.copyOf(inputs), source, target, Path.of(out),
        translations == null ? null : Path.of(translations), quiet, live);
  }

  private static String value(String[] args, int i, String option) throws HostException {
    if (i >= args.length || args[i].startsWith("--")) {
      throw usage(option + " needs a value");
    }
    return args[i];
  }

  private static Language language(String code, String option) throws HostException {
    Language language = Language.of(code);
    if (language == null) {
      throw usage(
          option + ": unknown language code '" + code + "' (known: " + Language.knownCodes() + ")");
    }
    return language;
  }

  private static HostException usage(String problem) {
    return new HostException(ExitStatus.USAGE, problem + " (translate.sh --help for usage)");
  }
}
