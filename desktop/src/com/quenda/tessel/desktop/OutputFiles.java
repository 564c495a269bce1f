package com.quenda.tessel.desktop;

import java.io.IOException;
import java.nio.charset.StandardCharsets;
import java.nio.file.AtomicMoveNotSupportedException;
import java.nio.file.Files;
import java.nio.file.Path;
import java.nio.file.StandardCopyOption;
import java.util.ArrayList;
import java.util.List;
import org.opencv.core.Mat;
import org.opencv.imgcodecs.Imgcodecs;
import org.opencv.imgproc.Imgproc;

/**
 * The files of one result, written under temporary names in the output directory and renamed to
 * their real names only when every one of them is complete: an interrupted or failed run leaves
 * either the whole result or nothing of it.
 */
public final class OutputFiles implements AutoCloseable {
  private final Path directory;
  private final List<Path[]> staged = new ArrayList<>();

  /** Creates {@code directory} when missing; CANNOT_WRITE when that or writing fails. */
  public OutputFiles(Path directory) throws HostException {
    this.directory = directory;
    try {
      Files.createDirectories(directory);
    } catch (IOException e) {
      throw cannotWrite(directory);
    }
    if (!Files.isWritable(directory)) {
      throw cannotWrite(directory);
    }
  }

  /** Stages an RGB image as {@code name} (a .png name). */
  public void image(String name, Mat rgb) throws HostException {
    Path temporary = temporary(name);
    Mat bgr = new Mat();
    Imgproc.cvtColor(rgb, bgr, Imgproc.COLOR_RGB2BGR);
    boolean written = Imgcodecs.imwrite(temporary.toString(), bgr);
    bgr.release();
    if (!written) {
      throw cannotWrite(directory.resolve(name));
    }
  }

  /** Stages a UTF-8 text as {@code name}. */
  public void text(String name, String text) throws HostException {
    Path temporary = temporary(name);
    try {
      Files.writeString(temporary, text, StandardCharsets.UTF_8);
    } catch (IOException e) {
      throw cannotWrite(directory.resolve(name));
    }
  }

  /**
   * Stages a file that the caller writes itself (a video); returns the temporary path to write,
   * which keeps {@code name}'s extension.
   */
  public Path stage(String name) {
    return temporary(name);
  }

  /** Gives up a staged file: deletes what was written under its temporary name. */
  public void drop(String name) {
    Path target = directory.resolve(name);
    staged.removeIf(file -> {
      if (!file[1].equals(target)) {
        return false;
      }
      try {
        Files.deleteIfExists(file[0]);
      } catch (IOException e) {
        // Left under its temporary name; the real name is never written.
      }
      return true;
    });
  }

  /** Renames every staged file to its real name. */
  public void commit() throws HostException {
    for (Path[] file : staged) {
      try {
        try {
          Files.move(file[0], file[1], StandardCopyOption.ATOMIC_MOVE,
              StandardCopyOption.REPLACE_EXISTING);
        } catch (AtomicMoveNotSupportedException e) {
          Files.move(file[0], file[1], StandardCopyOption.REPLACE_EXISTING);
        }
      } catch (IOException e) {
        throw cannotWrite(file[1]);
      }
    }
    staged.clear();
  }

  /** Removes whatever was staged and not committed. */
  @Override
  public void close() {
    for (Path[] file : staged) {
      try {
        Files.deleteIfExists(file[0]);
      } catch (IOException e) {
        // Left behind under its temporary name; the real name was never written.
      }
    }
    staged.clear();
  }

  private Path temporary(String name) {
    // The codec picks the format by extension, so the temporary name keeps it.
    Path temporary = directory.resolve(".partial-" + name);
    staged.add(new Path[] {temporary, directory.resolve(name)});
    return temporary;
  }

  private static HostException cannotWrite(Path path) {
    return new HostException(ExitStatus.CANNOT_WRITE, "cannot write " + path);
  }
}
