package com.quenda.tessel.desktop.scenes;

import java.io.File;
import java.io.IOException;
import java.util.List;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;
import org.opencv.videoio.VideoWriter;

/**
 * Writes the main job's inputs: the bundled photo-like scenes and the notice with the engine
 * demo's ten English lines (which the demo's phrase tables translate into Japanese, Chinese and
 * German) as PNG files, and a short hand-held camera video of a station sign board. Generated, so
 * the repository keeps no pictures.
 */
public final class BundledInputs {
  /** The ten lines of the phrase tables under desktop/phrases. */
  public static final List<String> NOTICE_TEXT =
      List.of("Opening hours: Monday to Friday 9-18", "Please keep this door closed at all times",
          "Emergency exit", "Platform 3: trains to the city centre",
          "No smoking anywhere in the building", "Tickets are sold at the counter",
          "Fresh coffee and cake served daily until six", "Lost property is on the second floor",
          "Wet floor, please walk carefully", "Press the button for assistance");

  private BundledInputs() {}

  public static void main(String[] args) throws IOException {
    File directory = new File(args.length > 0 ? args[0] : "out/inputs");
    if (!directory.isDirectory() && !directory.mkdirs()) {
      throw new IOException("cannot create " + directory);
    }
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    for (String name : Scenes.names()) {
      write(Scenes.bundled(name), directory);
    }
    write(new PageScene(Scenes.WIDTH, Scenes.HEIGHT, 7)
              .lines(NOTICE_TEXT)
              .rotation(-2)
              .render("notice"),
        directory);
    writeVideo(cameraSequence(90), new File(directory, "camera.mp4"));
  }

  /**
   * A camera panning, zooming and rolling over the station scene: {@code frames} frames at 30 per
   * second (90 make the main job's three seconds).
   */
  public static CameraSequence cameraSequence(int frames) {
    List<CameraSequence.Pose> poses = List.of(new CameraSequence.Pose(640, 360, 1.0, 0),
        new CameraSequence.Pose(600, 340, 1.15, 4), new CameraSequence.Pose(700, 390, 1.3, -3),
        new CameraSequence.Pose(650, 360, 1.1, 1));
    return new CameraSequence(
        Scenes.bundled("station"), new Size(Scenes.WIDTH, Scenes.HEIGHT), poses, frames);
  }

  /** Writes every frame of {@code sequence} as an H.264 video at 30 frames per second. */
  public static void writeVideo(CameraSequence sequence, File file) throws IOException {
    VideoWriter writer = new VideoWriter(
        file.getPath(), VideoWriter.fourcc('a', 'v', 'c', '1'), 30, sequence.frameSize());
    if (!writer.isOpened()) {
      throw new IOException("cannot write " + file);
    }
    for (int k = 0; k < sequence.frameCount(); k++) {
      Mat rgb = sequence.frame(k);
      Mat bgr = new Mat();
      Imgproc.cvtColor(rgb, bgr, Imgproc.COLOR_RGB2BGR);
      writer.write(bgr);
      bgr.release();
      rgb.release();
    }
    writer.release();
    sequence.scene().release();
  }

  private static void write(Scene scene, File directory) throws IOException {
    try {
      scene.writePng(new File(directory, scene.name + ".png").toPath());
    } finally {
      scene.release();
    }
  }
}
