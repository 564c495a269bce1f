package com.quenda.tessel.desktop.scenes;

import java.awt.image.BufferedImage;
import java.awt.image.DataBufferByte;
import java.util.Random;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/** Moves pictures between Java2D and OpenCV and gives them a camera's softness and grain. */
final class Pictures {
  private Pictures() {}

  static BufferedImage canvas(int width, int height) {
    return new BufferedImage(width, height, BufferedImage.TYPE_3BYTE_BGR);
  }

  /** The canvas as an 8-bit RGB matrix (a copy). */
  static Mat toRgb(BufferedImage image) {
    byte[] bgr = ((DataBufferByte) image.getRaster().getDataBuffer()).getData();
    Mat m = new Mat(image.getHeight(), image.getWidth(), CvType.CV_8UC3);
    m.put(0, 0, bgr);
    Imgproc.cvtColor(m, m, Imgproc.COLOR_BGR2RGB);
    return m;
  }

  /** Writes an 8-bit RGB matrix of the canvas's size back into it. */
  static void fromRgb(Mat rgb, BufferedImage image) {
    Mat bgr = new Mat();
    Imgproc.cvtColor(rgb, bgr, Imgproc.COLOR_RGB2BGR);
    bgr.get(0, 0, ((DataBufferByte) image.getRaster().getDataBuffer()).getData());
    bgr.release();
  }

  static void blur(Mat m, double sigma) {
    Imgproc.GaussianBlur(m, m, new Size(0, 0), sigma);
  }

  /**
   * Lens softness and sensor grain. The grain comes from {@code random}, not OpenCV's generator,
   * so that a scene is the same whatever else ran before it.
   */
  static void cameraFinish(Mat rgb, Random random, double sigmaBlur, double grain) {
    blur(rgb, sigmaBlur);
    int n = (int) rgb.total() * rgb.channels();
    float[] noise = new float[n];
    for (int i = 0; i < n; i++) {
      noise[i] = (float) (random.nextGaussian() * grain);
    }
    Mat noiseMat = new Mat(rgb.rows(), rgb.cols(), CvType.CV_32FC3);
    noiseMat.put(0, 0, noise);
    Mat f = new Mat();
    rgb.convertTo(f, CvType.CV_32FC3);
    Core.add(f, noiseMat, f);
    f.convertTo(rgb, CvType.CV_8UC3);
    f.release();
    noiseMat.release();
  }
}
