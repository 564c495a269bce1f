package com.quenda.tessel.desktop.video;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.scenes.CameraSequence;
import com.quenda.tessel.desktop.scenes.CameraSequence.Pose;
import com.quenda.tessel.desktop.scenes.SceneLine;
import com.quenda.tessel.desktop.scenes.Scenes;
import java.nio.file.Path;
import java.util.List;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.core.Rect;
import org.opencv.core.Size;
import org.opencv.videoio.VideoCapture;

/**
 * A shadow falls on one sign while the camera holds still: the host erases the sign's lines again
 * in the new light, and what the viewer sees under the translation must darken with the wall, not
 * keep the bright patch of the first keyframe.
 */
class EraseAgainTest {
  static final int FRAMES = 40;
  static final int SHADOW_FROM = 15;
  static final double SHADOW = 0.6;

  @TempDir Path dir;

  @Test
  void aPatchCutAgainInNewLightIsTheOneDrawn() throws Exception {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    Pose still = new Pose(640, 360, 1.0, 0);
    CameraSequence camera = new CameraSequence(
        Scenes.bundled("station"), new Size(1280, 720), List.of(still, still), FRAMES);
    Rect line = lineBox(camera, "Open every");
    // The shadow covers the sign around the line, well past the patch.
    Rect shadow = new Rect(
        line.x - line.height, line.y - line.height, line.width + 2 * line.height, line.height * 3);
    FrameSource shaded = new ShadedSource(camera, shadow);
    Path out = dir.resolve("out");
    VideoResult result = VideoLoopTest.translate(shaded, out);
    camera.scene().release();

    assertTrue(result.records.get(FRAMES - 1)
                   .lines()
                   .stream()
                   .anyMatch(l -> l.text().startsWith("Open every")),
        "the line is still drawn at the end");
    Mat before = frameOf(out.resolve("walk.mp4"), SHADOW_FROM - 5);
    Mat after = frameOf(out.resolve("walk.mp4"), FRAMES - 5);
    double drawn = meanOver(after, line) / meanOver(before, line);
    // The encoder blurs a little; a patch kept from before the shadow leaves the box near 0.8.
    assertEquals(SHADOW, drawn, 0.07, "inside the line's box the video went to x" + drawn);
  }

  /** The upright box of the scene line whose text starts with {@code prefix}, in frame 0. */
  static Rect lineBox(CameraSequence camera, String prefix) {
    for (SceneLine line : camera.truth(0)) {
      if (line != null && line.text.startsWith(prefix)) {
        return line.rect.boundingRect();
      }
    }
    throw new AssertionError("no line " + prefix);
  }

  static double meanOver(Mat frame, Rect box) {
    Mat part = frame.submat(box);
    double[] mean = Core.mean(part).val;
    part.release();
    return (mean[0] + mean[1] + mean[2]) / 3;
  }

  static Mat frameOf(Path video, int k) {
    VideoCapture capture = new VideoCapture(video.toString());
    Mat frame = new Mat();
    for (int i = 0; i <= k; i++) {
      assertTrue(capture.read(frame), "frame " + i + " of " + video);
    }
    capture.release();
    return frame;
  }

  /** The camera's frames with the area {@code shadow} darkened from frame SHADOW_FROM on. */
  private static final class ShadedSource implements FrameSource {
    private final CameraSequence camera;
    private final Rect shadow;
    private int next;

    ShadedSource(CameraSequence camera, Rect shadow) {
      this.camera = camera;
      this.shadow = shadow;
    }

    @Override
    public Mat next() {
      if (next >= camera.frameCount()) {
        return null;
      }
      Mat frame = camera.frame(next);
      if (next++ >= SHADOW_FROM) {
        Mat area = frame.submat(shadow);
        area.convertTo(area, -1, SHADOW, 0);
        area.release();
      }
      return frame;
    }

    @Override
    public double fps() {
      return 30;
    }

    @Override
    public int frameCountHint() {
      return camera.frameCount();
    }

    @Override
    public String name() {
      return "walk";
    }

    @Override
    public void close() {}
  }
}
