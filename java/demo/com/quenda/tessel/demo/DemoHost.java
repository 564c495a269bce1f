package com.quenda.tessel.demo;

import com.quenda.tessel.Constants;
import java.io.File;
import java.io.IOException;
import java.util.List;
import org.opencv.core.Core;
import org.opencv.core.Mat;

/**
 * Drives the engine the way a phone host does, on a deterministic generated camera sequence
 * (printed text lines under a known camera motion). Each demo step is its own class; pictures and
 * reports go to the output directory (first argument, default "out").
 */
public final class DemoHost {
  private DemoHost() {}

  public static void main(String[] args) throws IOException {
    File out = new File(args.length > 0 ? args[0] : "out");
    if (!out.isDirectory() && !out.mkdirs()) {
      throw new IOException("cannot create " + out);
    }
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    System.out.printf("engine constants: %d values per rectangle, min inpaint size %d%n",
        Constants.getValsPerRect(), Constants.getMinInpaintSize());

    DemoSequence sequence = DemoSequence.createDefault();
    System.out.printf(
        "input: %d frames of %.0fx%.0f, %d text lines; pan, rotation and zoom with blurred frames%n",
        sequence.frameCount(), sequence.frameSize().width, sequence.frameSize().height,
        sequence.lines().size());

    // The engine prints each frame's homography on standard output while tracking.
    List<TrackingStep.FrameResult> tracking = new TrackingStep(sequence).run(out);
    System.out.println();
    System.out.println("tracking (coverage left, blur, frame accuracy against frame 0,");
    System.out.println("          centre error against the true rectangles in pixels):");
    TrackingStep.print(tracking, System.out);
    System.out.printf(
        "wrote %s and %s%n", new File(out, "tracking.png"), new File(out, "tracking.txt"));

    // The first frame's rectangles stand for the OCR result to be erased.
    Mat first = sequence.frame(0);
    InpaintingDemo.Result inpainting = InpaintingDemo.run(first, sequence.truthRects(0), out);
    first.release();
    System.out.println();
    InpaintingDemo.print(inpainting, System.out);
    System.out.printf("wrote %s%n", inpainting.picture);

    // Every frame drawn with the translations over the erased lines.
    TranslationStep.Summary translation =
        new TranslationStep(sequence, tracking, inpainting).run(out);
    for (Mat overlay : inpainting.overlays) {
      overlay.release();
    }
    System.out.println();
    TranslationStep.print(translation, System.out);
    System.out.printf("wrote %s and %s%n", translation.still, translation.animation);
  }
}
