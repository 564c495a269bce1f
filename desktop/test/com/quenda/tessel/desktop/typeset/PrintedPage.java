package com.quenda.tessel.desktop.typeset;

import com.quenda.tessel.desktop.ocr.PhotoReader;
import com.quenda.tessel.desktop.ocr.RecognizedLine;
import java.awt.Color;
import java.awt.Font;
import java.awt.Graphics2D;
import java.awt.RenderingHints;
import java.awt.font.FontRenderContext;
import java.awt.font.TextLayout;
import java.awt.geom.Rectangle2D;
import java.awt.image.BufferedImage;
import java.awt.image.DataBufferByte;
import java.io.File;
import java.util.ArrayList;
import java.util.List;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * A white page with dark lines printed on it, and the lines as a reader reports them: each line's
 * text and the box hugging its ink.
 */
final class PrintedPage {
  static final String NOTO = "/usr/share/fonts/truetype/noto/";
  static final String DEJAVU = "/usr/share/fonts/truetype/dejavu/";

  private final BufferedImage image;
  private final Graphics2D g;
  final List<RecognizedLine> lines = new ArrayList<>();

  PrintedPage(int width, int height) {
    image = new BufferedImage(width, height, BufferedImage.TYPE_3BYTE_BGR);
    g = image.createGraphics();
    g.setColor(new Color(245, 243, 238));
    g.fillRect(0, 0, width, height);
    g.setRenderingHint(
        RenderingHints.KEY_TEXT_ANTIALIASING, RenderingHints.VALUE_TEXT_ANTIALIAS_ON);
    g.setRenderingHint(
        RenderingHints.KEY_FRACTIONALMETRICS, RenderingHints.VALUE_FRACTIONALMETRICS_ON);
    g.setColor(new Color(30, 30, 35));
  }

  static Font font(String path, float size) throws Exception {
    return Font.createFont(Font.TRUETYPE_FONT, new File(path)).deriveFont(size);
  }

  /**
   * Prints {@code texts} one under the other, {@code pitch} apart, from baseline {@code y}: flush
   * left at {@code x}, centred on it or flush right against it.
   */
  PrintedPage paragraph(Font font, Align align, double x, double y, double pitch, String... texts) {
    for (int i = 0; i < texts.length; i++) {
      line(font, align, x, y + i * pitch, texts[i]);
    }
    return this;
  }

  /** Prints one line and records its ink box. */
  RecognizedLine line(Font font, Align align, double x, double baseline, String text) {
    FontRenderContext context = g.getFontRenderContext();
    TextLayout layout = new TextLayout(text, font, context);
    double advance = layout.getAdvance();
    double start = switch (align) {
      case LEFT, JUSTIFIED -> x;
      case CENTRE -> x - advance / 2;
      case RIGHT -> x - advance;
    };
    layout.draw(g, (float) start, (float) baseline);
    Rectangle2D ink = layout.getBounds();
    RecognizedLine line = new RecognizedLine(text,
        new RotatedRect(new Point(start + ink.getCenterX(), baseline + ink.getCenterY()),
            new Size(ink.getWidth(), ink.getHeight()), 0),
        90, PhotoReader.LATIN);
    lines.add(line);
    return line;
  }

  /** The page, 8-bit RGB. */
  Mat rgb() {
    byte[] bgr = ((DataBufferByte) image.getRaster().getDataBuffer()).getData();
    Mat m = new Mat(image.getHeight(), image.getWidth(), CvType.CV_8UC3);
    m.put(0, 0, bgr);
    Imgproc.cvtColor(m, m, Imgproc.COLOR_BGR2RGB);
    return m;
  }

  /** The texts of the lines at {@code indices}. */
  List<String> texts(List<Integer> indices) {
    List<String> texts = new ArrayList<>();
    for (int i : indices) {
          texts.add(lines.get(i).text);
        }
        return texts;
    }
  }
