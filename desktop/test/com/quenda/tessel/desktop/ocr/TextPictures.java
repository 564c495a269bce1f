package com.quenda.tessel.desktop.ocr;

import com.quenda.tessel.desktop.scenes.Fonts;
import java.awt.Color;
import java.awt.Font;
import java.awt.Graphics2D;
import java.awt.RenderingHints;
import java.awt.image.BufferedImage;
import java.awt.image.DataBufferByte;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.imgproc.Imgproc;

/** Plain pictures of text for the reading tests: dark lines on white, as a screenshot. */
final class TextPictures {
  private TextPictures() {}

  /** {@code lines} in 40 px sans, one under the other, left-aligned at x 60. */
  static Mat lines(int width, int height, String... lines) {
    return lines(Fonts.SANS, width, height, lines);
  }

  /** {@code lines} in 40 px {@code font}, one under the other, left-aligned at x 60. */
  static Mat lines(Font font, int width, int height, String... lines) {
    BufferedImage picture = new BufferedImage(width, height, BufferedImage.TYPE_3BYTE_BGR);
    Graphics2D g = picture.createGraphics();
    g.setColor(Color.WHITE);
    g.fillRect(0, 0, width, height);
    g.setColor(Color.DARK_GRAY);
    g.setRenderingHint(
        RenderingHints.KEY_TEXT_ANTIALIASING, RenderingHints.VALUE_TEXT_ANTIALIAS_ON);
    g.setFont(font.deriveFont(40f));
    for (int i = 0; i < lines.length; i++) {
      g.drawString(lines[i], 60, 90 + 80 * i);
    }
    g.dispose();
    Mat rgb = new Mat(height, width, CvType.CV_8UC3);
    rgb.put(0, 0, ((DataBufferByte) picture.getRaster().getDataBuffer()).getData());
    Imgproc.cvtColor(rgb, rgb, Imgproc.COLOR_BGR2RGB);
    return rgb;
  }

  /** The picture turned by 180°. */
  static Mat upsideDown(Mat rgb) {
    Mat turned = new Mat();
    Core.rotate(rgb, turned, Core.ROTATE_180);
    return turned;
  }
}
