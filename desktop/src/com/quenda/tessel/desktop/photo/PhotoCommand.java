package com.quenda.tessel.desktop.photo;

import com.quenda.tessel.desktop.CommandLine;
import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.OutputFiles;
import com.quenda.tessel.desktop.Progress;
import com.quenda.tessel.desktop.ocr.PhotoReader;
import com.quenda.tessel.desktop.translate.Translator;
import com.quenda.tessel.desktop.translate.Translators;
import java.io.PrintStream;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.HashMap;
import java.util.List;
import java.util.Map;

/**
 * The photo mode: every input checked first, so that a bad one stops the run before anything is
 * written; then each photo translated and its files written whole.
 */
public final class PhotoCommand {
  // Steps per photo that the progress bar counts: read, translate, erase, draw, write.
  private static final int STEPS_PER_PHOTO = 5;

  private PhotoCommand() {}

  public static void run(CommandLine command, PrintStream out, PrintStream err)
      throws HostException {
    List<PhotoInput> inputs = checkInputs(command.inputs);
    try (PhotoReader reader = new PhotoReader(command.from.tesseract, PhotoReader.ALL_CORES);
         Translator translator =
             Translators.create(command.from, command.to, command.translations)) {
      run(command, inputs, new PhotoJob(reader, translator, command.to), out, err);
    }
  }

  private static void run(CommandLine command, List<PhotoInput> inputs, PhotoJob job,
      PrintStream out, PrintStream err) throws HostException {
    OutputFiles files = new OutputFiles(command.out);

    Progress progress = new Progress(STEPS_PER_PHOTO * inputs.size(), command.quiet, err);
    PhotoSummary summary = new PhotoSummary();
    try (files) {
      for (PhotoInput input : inputs) {
        PhotoResult result = job.run(input, progress);
        try {
          result.write(files);
        } finally {
          result.release();
        }
        progress.step(input.name + ": done");
        summary.add(result);
        if (!command.quiet) {
          report(result, progress);
        }
      }
    } finally {
      progress.finish();
    }
    summary.print(out, command.out);
  }

  private static List<PhotoInput> checkInputs(List<Path> paths) throws HostException {
    List<PhotoInput> inputs = new ArrayList<>();
    Map<String, Path> names = new HashMap<>();
    for (Path path : paths) {
      PhotoInput input = PhotoInput.check(path);
      Path earlier = names.put(input.name, path);
      if (earlier != null) {
        throw new HostException(ExitStatus.USAGE,
            earlier + " and " + path + " would both be written as " + input.name + ".png");
      }
      inputs.add(input);
    }
    return inputs;
  }

  private static void report(PhotoResult result, Progress progress) {
    if (result.lines.isEmpty()) {
      progress.message(result.input.path + ": no text found; copied through unchanged");
      return;
    }
    for (LineResult kept : result.untranslated()) {
      progress.message(String.format(
          "%s: \"%s\" could not be translated; kept as it is", result.input.path, kept.line.text));
    }
  }
}
