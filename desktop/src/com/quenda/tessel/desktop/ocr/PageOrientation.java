package com.quenda.tessel.desktop.ocr;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import java.io.IOException;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.List;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.imgcodecs.Imgcodecs;

/**
 * The recogniser's orientation detection (page segmentation mode 0) on a whole picture: how far
 * the picture must be turned clockwise for its text to stand upright. Only a confident answer
 * counts; too little text, or a failure of the detection, means "leave it".
 */
final class PageOrientation {
  /** Below this the detector is guessing (it reports about 0.5 to 1.5 on texture). */
  static final double MIN_CONFIDENCE = 2.0;

  private PageOrientation() {}

  /** 0, 90, 180 or 270. */
  static int clockwiseTurn(TesseractProgram program, Mat grey) throws HostException {
    Path png = null;
    try {
      png = Files.createTempFile("photo-reader-osd", ".png");
      if (!Imgcodecs.imwrite(png.toString(), grey)) {
        throw new IOException("cannot write " + png);
      }
      String out = program.run(List.of(png.toString(), "stdout", "--psm", "0"));
      return parse(out);
    } catch (IOException e) {
      throw new HostException(ExitStatus.INTERNAL,
          "cannot prepare the picture for orientation detection: " + e.getMessage(), e);
    } catch (HostException e) {
      if (e.status == ExitStatus.CHILD_FAILED) {
        return 0; // "too few characters" ends the program with a failure status
      }
      throw e;
    } finally {
      if (png != null) {
        png.toFile().delete();
      }
    }
  }

  static int parse(String osd) {
    int rotate = 0;
    double confidence = 0;
    for (String line : osd.split("\n")) {
      String[] kv = line.split(":", 2);
      if (kv.length < 2) {
        continue;
      }
      try {
        if (kv[0].trim().equals("Rotate")) {
          rotate = Integer.parseInt(kv[1].trim());
        } else if (kv[0].trim().equals("Orientation confidence")) {
          confidence = Double.parseDouble(kv[1].trim());
        }
      } catch (NumberFormatException e) {
        return 0;
      }
    }
    boolean valid = rotate == 90 || rotate == 180 || rotate == 270;
    return valid && confidence >= MIN_CONFIDENCE ? rotate : 0;
  }

  /** Turns a picture clockwise by a multiple of 90°. */
  static Mat turn(Mat m, int clockwise) {
    Mat out = new Mat();
    switch (clockwise) {
      case 90:
        Core.rotate(m, out, Core.ROTATE_90_CLOCKWISE);
        break;
      case 180:
        Core.rotate(m, out, Core.ROTATE_180);
        break;
      case 270:
        Core.rotate(m, out, Core.ROTATE_90_COUNTERCLOCKWISE);
        break;
      default:
        m.copyTo(out);
    }
    return out;
  }
}
