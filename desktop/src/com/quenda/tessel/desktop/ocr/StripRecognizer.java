package com.quenda.tessel.desktop.ocr;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.ocr.TsvPages.Word;
import java.io.IOException;
import java.nio.charset.StandardCharsets;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.Comparator;
import java.util.List;
import java.util.Map;
import java.util.stream.Stream;
import org.opencv.core.Mat;
import org.opencv.imgcodecs.Imgcodecs;

/**
 * Reads many line strips with one run of the recogniser: the strips are written as PNG files to a
 * temporary directory and the program gets a file listing them, reading each as a page in
 * single-line mode. One process per picture instead of one per line saves the program's start-up
 * (loading the language model) for every line. The strips are already dark on light, so the
 * recogniser's second try of badly read lines in negative is turned off: it nearly doubles the
 * time spent on the non-text candidates.
 */
final class StripRecognizer {
  private final TesseractProgram program;
  private final String language;

  StripRecognizer(TesseractProgram program, String language) {
    this.program = program;
    this.language = language;
  }

  /** The words of each strip, in the strips' order (empty for a strip with nothing read). */
  List<List<Word>> read(List<Mat> strips) throws HostException {
    List<List<Word>> out = new ArrayList<>();
    if (strips.isEmpty()) {
      return out;
    }
    Path dir = null;
    try {
      dir = Files.createTempDirectory("photo-reader");
      StringBuilder list = new StringBuilder();
      for (int i = 0; i < strips.size(); i++) {
        Path png = dir.resolve(String.format("line%03d.png", i));
        if (!Imgcodecs.imwrite(png.toString(), strips.get(i))) {
          throw new IOException("cannot write " + png);
        }
        list.append(png).append('\n');
      }
      Path listFile = dir.resolve("lines.txt");
      Files.writeString(listFile, list, StandardCharsets.UTF_8);
      String tsv = program.run(List.of(listFile.toString(), "stdout", "-l", language, "--psm", "7",
          "-c", "tessedit_do_invert=0", "tsv"));
      Map<Integer, List<Word>> pages = TsvPages.parse(tsv);
      for (int i = 0; i < strips.size(); i++) {
        out.add(pages.getOrDefault(i + 1, List.of()));
      }
      return out;
    } catch (IOException e) {
      throw new HostException(
          ExitStatus.INTERNAL, "cannot prepare the line images for OCR: " + e.getMessage(), e);
    } finally {
      deleteQuietly(dir);
    }
  }

  private static void deleteQuietly(Path dir) {
    if (dir == null) {
      return;
    }
    try (Stream<Path> files = Files.walk(dir)) {
      files.sorted(Comparator.reverseOrder()).forEach(p -> p.toFile().delete());
    } catch (IOException e) {
      // A leftover temporary file is not worth failing the reading for.
    }
  }
}
