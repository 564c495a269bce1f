package com.quenda.tessel.desktop;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertTrue;

import java.io.ByteArrayOutputStream;
import java.io.DataOutputStream;
import java.io.IOException;
import java.io.PrintStream;
import java.nio.ByteBuffer;
import java.nio.charset.StandardCharsets;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.List;
import java.util.stream.Stream;
import java.util.zip.CRC32;
import java.util.zip.Deflater;
import java.util.zip.DeflaterOutputStream;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.Scalar;
import org.opencv.imgcodecs.Imgcodecs;
import org.opencv.imgproc.Imgproc;

/**
 * Every bad input ends in one line on standard error naming the problem (and the Debian package
 * that mends it), its own exit status, and no file in the output directory.
 */
class BadInputTest {
  @TempDir static Path dir;
  static Path good;

  @BeforeAll
  static void writeInputs() throws IOException {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    good = dir.resolve("plain.png");
    Mat grey = new Mat(40, 60, CvType.CV_8UC3, new Scalar(128, 128, 128));
    Imgcodecs.imwrite(good.toString(), grey);
    grey.release();
    Files.writeString(dir.resolve("notes.png"), "these are not pixels\n");
    Files.createFile(dir.resolve("empty.png"));
    Files.writeString(dir.resolve("bad.tsv"), "no tab on this line\n");
  }

  static final class Run {
    final ExitStatus status;
    final String err;
    final Path out;

    Run(ExitStatus status, String err, Path out) {
      this.status = status;
      this.err = err;
      this.out = out;
    }
  }

  static Run run(String... args) throws IOException {
    Path out = Files.createTempDirectory(dir, "out");
    List<String> full = new ArrayList<>(List.of(args));
    full.addAll(List.of("--out", out.toString()));
    ByteArrayOutputStream err = new ByteArrayOutputStream();
    ExitStatus status = TranslateMain.run(full.toArray(new String[0]),
        new PrintStream(new ByteArrayOutputStream(), true, StandardCharsets.UTF_8),
        new PrintStream(err, true, StandardCharsets.UTF_8));
    return new Run(status, err.toString(StandardCharsets.UTF_8), out);
  }

  static void assertFails(Run run, ExitStatus status, String message) throws IOException {
    assertEquals(status, run.status, run.err);
    assertEquals("translate: " + message + "\n", run.err);
    try (Stream<Path> files = Files.list(run.out)) {
      assertEquals(List.of(), files.toList(), "nothing is written");
    }
  }

  @Test
  void unreadableInputsStopTheRunBeforeAnythingIsWritten() throws IOException {
    Path missing = dir.resolve("missing.png");
    assertFails(run("photo", good.toString(), missing.toString()), ExitStatus.NO_INPUT,
        missing + ": no such file");
    assertFails(run("photo", dir.toString()), ExitStatus.NO_INPUT, dir + ": cannot be read");
    Path notes = dir.resolve("notes.png");
    assertFails(run("photo", good.toString(), notes.toString()), ExitStatus.NOT_AN_IMAGE,
        notes + ": not an image OpenCV can read");
    Path empty = dir.resolve("empty.png");
    assertFails(
        run("photo", empty.toString()), ExitStatus.EMPTY_IMAGE, empty + ": the file is empty");
  }

  @Test
  void missingLanguagesNameTheDebianPackage() throws IOException {
    assertFails(run("photo", good.toString(), "--from", "it", "--to", "es"),
        ExitStatus.MISSING_OCR_DATA,
        "no OCR data for language 'ita': install the Debian package tesseract-ocr-ita");
    assertFails(run("photo", good.toString(), "--from", "es", "--to", "pt"),
        ExitStatus.MISSING_TRANSLATION,
        "no installed translation from Spanish (es) to Portuguese (pt): "
            + "install the Debian package apertium-es-pt");
    assertFails(run("photo", good.toString(), "--from", "en", "--to", "ja"),
        ExitStatus.MISSING_TRANSLATION,
        "Debian has no Apertium translation from English (en) to Japanese (ja): "
            + "give the translations as a phrase table with --translations FILE");
  }

  @Test
  void commandLineMistakesAreUsageErrors() throws IOException {
    String hint = " (translate.sh --help for usage)";
    assertFails(run("film", good.toString()), ExitStatus.USAGE,
        "unknown mode 'film' (expected photo, video or text)" + hint);
    assertFails(run("photo"), ExitStatus.USAGE, "no input image given" + hint);
    assertFails(run("text", good.toString()), ExitStatus.USAGE,
        "text reads standard input, not " + good + hint);
    assertFails(run("photo", good.toString(), "--to", "xx"), ExitStatus.USAGE,
        "--to: unknown language code 'xx' (known: " + Language.knownCodes() + ")" + hint);
    assertFails(run("photo", good.toString(), "--colour"), ExitStatus.USAGE,
        "unknown option --colour" + hint);
    Path table = dir.resolve("bad.tsv");
    assertFails(run("photo", good.toString(), "--translations", table.toString()), ExitStatus.USAGE,
        table + ":1: expected 'source<TAB>translation'");
  }

  @Test
  void anOutputDirectoryThatCannotBeMadeIsReported() throws IOException {
    ByteArrayOutputStream err = new ByteArrayOutputStream();
    Path blocked = dir.resolve("notes.png").resolve("out");
    ExitStatus status =
        TranslateMain.run(new String[] {"photo", good.toString(), "--out", blocked.toString()},
            new PrintStream(new ByteArrayOutputStream(), true, StandardCharsets.UTF_8),
            new PrintStream(err, true, StandardCharsets.UTF_8));
    assertEquals(ExitStatus.CANNOT_WRITE, status);
    assertTrue(err.toString(StandardCharsets.UTF_8).contains("cannot write " + blocked));
  }
  @Test
  void oddPicturesAreReadOrRefusedNeverACrash() throws IOException {
    // A dot, a grey page and a 16-bit page are read (as 8-bit colour); the text on them is found.
    Path dot = dir.resolve("dot.png");
    Imgcodecs.imwrite(dot.toString(), new Mat(1, 1, CvType.CV_8UC3, new Scalar(0, 0, 0)));
    Mat page = new Mat(160, 640, CvType.CV_8UC1, new Scalar(255));
    Imgproc.putText(page, "Emergency exit", new Point(40, 100), Imgproc.FONT_HERSHEY_SIMPLEX, 1.6,
        new Scalar(0), 4);
    Path grey = dir.resolve("grey.png");
    Imgcodecs.imwrite(grey.toString(), page);
    Mat deep = new Mat();
    page.convertTo(deep, CvType.CV_16UC1, 257);
    Path sixteen = dir.resolve("sixteen.png");
    Imgcodecs.imwrite(sixteen.toString(), deep);
    Run run = run("photo", dot.toString(), grey.toString(), sixteen.toString(), "--quiet");
    assertEquals(ExitStatus.OK, run.status, run.err);
    assertTrue(Files.readString(run.out.resolve("dot.json")).contains("\"lines\": []"),
        Files.readString(run.out.resolve("dot.json")));
    for (String name : List.of("grey.json", "sixteen.json")) {
      String json = Files.readString(run.out.resolve(name));
      assertTrue(json.contains("\"text\": \"Emergency exit\""), name + ": " + json);
    }

    // 20000x20000 is refused from its header, before a gigabyte of pixels is decoded.
    Path huge = dir.resolve("huge.png");
    writeBlankPng(huge, 20000, 20000);
    assertFails(run("photo", huge.toString()), ExitStatus.NOT_AN_IMAGE,
        huge + ": 20000x20000 is too large (at most 8192 pixels a side)");
  }

  @Test
  void missingModelsNameTheFileAndTheSetupScript() throws IOException {
    String models = System.getProperty("ocr.models");
    System.setProperty("ocr.models", dir.resolve("no-models").toString());
    try {
      Run run = run("photo", good.toString());
      assertEquals(ExitStatus.MISSING_OCR_DATA, run.status, run.err);
      assertTrue(
          run.err.startsWith("translate: the text reader cannot load its models: "), run.err);
      assertTrue(run.err.contains(dir.resolve("no-models").toString()), run.err);
      assertTrue(run.err.endsWith(" (run scripts/setup.sh to install them)\n"), run.err);
      assertEquals(1, run.err.lines().count(), run.err);
    } finally {
      System.setProperty("ocr.models", models);
    }
  }

  /** A grey PNG of {@code width}x{@code height} zeros, written row by row without the pixels. */
  static void writeBlankPng(Path path, int width, int height) throws IOException {
    ByteArrayOutputStream idat = new ByteArrayOutputStream();
    try (DeflaterOutputStream z =
             new DeflaterOutputStream(idat, new Deflater(Deflater.BEST_SPEED), 1 << 16)) {
      byte[] row = new byte[width + 1]; // filter byte 0, then the row's zeros
      for (int y = 0; y < height; y++) {
        z.write(row);
      }
    }
    try (DataOutputStream png = new DataOutputStream(Files.newOutputStream(path))) {
      png.write(new byte[] {(byte) 0x89, 'P', 'N', 'G', '\r', '\n', 0x1A, '\n'});
      ByteBuffer header = ByteBuffer.allocate(13).putInt(width).putInt(height);
      header.put((byte) 8).put((byte) 0).put((byte) 0).put((byte) 0).put((byte) 0);
      chunk(png, "IHDR", header.array());
      chunk(png, "IDAT", idat.toByteArray());
      chunk(png, "IEND", new byte[0]);
    }
  }

  private static void chunk(DataOutputStream png, String type, byte[] data) throws IOException {
    byte[] name = type.getBytes(StandardCharsets.US_ASCII);
    CRC32 crc = new CRC32();
    crc.update(name);
    crc.update(data);
    png.writeInt(data.length);
    png.write(name);
    png.write(data);
    png.writeInt((int) crc.getValue());
  }
}
