package com.quenda.tessel.demo;

import java.io.File;
import java.util.ArrayList;
import java.util.List;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.Rect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgcodecs.Imgcodecs;
import org.opencv.imgproc.Imgproc;

/** A grid of labelled, scaled-down RGB pictures written as one PNG file. */
final class ContactSheet {
  private static final Scalar BACKGROUND = new Scalar(40, 40, 40);
  private static final Scalar LABEL = new Scalar(255, 255, 255);
  private static final int LABEL_HEIGHT = 28;

  private final int columns;
  private final Size tileSize;
  private final List<Mat> tiles = new ArrayList<>();
  private final List<String> labels = new ArrayList<>();

  ContactSheet(int columns, Size tileSize) {
    this.columns = columns;
    this.tileSize = tileSize;
  }

  /** Adds a scaled copy of an RGB picture with a caption. */
  void add(Mat rgb, String label) {
    Mat tile = new Mat();
    Imgproc.resize(rgb, tile, tileSize, 0, 0, Imgproc.INTER_AREA);
    tiles.add(tile);
    labels.add(label);
  }

  /** Writes the sheet (with an optional footer line) and releases the tiles. */
  void write(File file, String footer) {
    int rows = (tiles.size() + columns - 1) / columns;
    int tileW = (int) tileSize.width;
    int cellH = (int) tileSize.height + LABEL_HEIGHT;
    int footerH = footer == null ? 0 : LABEL_HEIGHT;
    Mat sheet = new Mat(rows * cellH + footerH, columns * tileW, CvType.CV_8UC3, BACKGROUND);
    for (int i = 0; i < tiles.size(); ++i) {
      int x = (i % columns) * tileW;
      int y = (i / columns) * cellH;
      Mat cell = sheet.submat(new Rect(x, y + LABEL_HEIGHT, tileW, (int) tileSize.height));
      tiles.get(i).copyTo(cell);
      cell.release();
      caption(sheet, labels.get(i), new Point(x + 8, y + LABEL_HEIGHT - 8));
      tiles.get(i).release();
    }
    if (footer != null) {
      caption(sheet, footer, new Point(8, rows * cellH + LABEL_HEIGHT - 8));
    }
    tiles.clear();
    labels.clear();
    Mat bgr = new Mat();
    Imgproc.cvtColor(sheet, bgr, Imgproc.COLOR_RGB2BGR);
    if (!Imgcodecs.imwrite(file.getPath(), bgr)) {
      throw new IllegalStateException("cannot write " + file);
    }
    bgr.release();
    sheet.release();
  }

  private static void caption(Mat sheet, String text, Point origin) {
    Imgproc.putText(
        sheet, text, origin, Imgproc.FONT_HERSHEY_SIMPLEX, 0.55, LABEL, 1, Imgproc.LINE_AA);
  }
}
