package com.quenda.tessel.desktop.video;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertFalse;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.Language;
import com.quenda.tessel.desktop.engine.Rects;
import com.quenda.tessel.desktop.ocr.PhotoReader;
import com.quenda.tessel.desktop.scenes.CameraSequence;
import com.quenda.tessel.desktop.scenes.CameraSequence.Pose;
import com.quenda.tessel.desktop.scenes.Scene;
import com.quenda.tessel.desktop.scenes.SceneLine;
import com.quenda.tessel.desktop.scenes.Scenes;
import com.quenda.tessel.desktop.translate.Translators;
import com.quenda.tessel.tracking.TrackingJNI;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.List;
import java.util.Map;
import java.util.concurrent.Semaphore;
import java.util.concurrent.TimeUnit;
import org.junit.jupiter.api.AfterAll;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;

/**
 * Lines the engine's tracker cannot follow. It compares a line's angle with the last frame's as a
 * plain difference and, after rejecting a frame, with the zeros it answered: a line turning past
 * 180 degrees, or a line steeper than 35 degrees after any rejected frame, comes back as zeros on
 * every frame after. The host must read the text again rather than show nothing from then on.
 */
class TrackerLossTest {
  static final Size FRAME = new Size(1280, 720);
  static final String UPSIDE_DOWN = "Open every day";

  @TempDir static Path dir;
  static Scene station;

  @BeforeAll
  static void scene() {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    station = Scenes.bundled("station");
  }

  @AfterAll
  static void release() {
    station.release();
  }

  /**
   * A camera turning from {@code fromRoll} to {@code toRoll} in half the frames, then still.
   */
  static CameraSequence rolling(double fromRoll, double toRoll, int frames) {
    Pose to = new Pose(640, 360, 1, toRoll);
    return new CameraSequence(
        station, FRAME, List.of(new Pose(640, 360, 1, fromRoll), to, to), frames);
  }

  /**
   * Tracks the lines starting with {@code prefixes} from frame 0; per frame, their angles or null.
   */
  static List<double[]> tracked(
      CameraSequence camera, Mat glitch, int glitchAt, String... prefixes) {
    List<RotatedRect> start = new ArrayList<>();
    for (String prefix : prefixes) {
      for (SceneLine line : camera.truth(0)) {
        if (line != null && line.text.startsWith(prefix)) {
          start.add(line.rect);
        }
      }
    }
    assertEquals(prefixes.length, start.size(), "lines in view");
    List<double[]> angles = new ArrayList<>();
    Mat first = camera.frame(0);
    long tracker = TrackingJNI.initializeTracker(first.getNativeObjAddr(), Rects.pack(start));
    first.release();
    try {
      for (int k = 1; k < camera.frameCount(); k++) {
        Mat frame = k == glitchAt ? glitch : camera.frame(k);
        double[] rects = TrackingJNI.updateTracker(tracker, frame.getNativeObjAddr());
        if (frame != glitch) {
          frame.release();
        }
        boolean zero = true;
        double[] a = new double[start.size()];
        for (int i = 0; i < start.size(); i++) {
          a[i] = rects[5 * i + 4];
          zero &= rects[5 * i + 2] == 0 && rects[5 * i + 3] == 0 && rects[5 * i] == 0;
        }
        angles.add(zero ? null : a);
      }
    } finally {
      TrackingJNI.releaseTracker(tracker);
    }
    return angles;
  }

  @Test
  void theEngineLosesAnUpsideDownLineForGoodOnceItTurnsPast180() {
    // The sign's line stands at -3 degrees: upside down (camera rolled 178) it reads at 175.
    // A 12-degree turn near 0 is followed to the end...
    List<double[]> level = tracked(rolling(-2, 10, 36), null, -1, UPSIDE_DOWN);
    assertEquals(7, level.get(level.size() - 1)[0], 0.5);
    assertFalse(level.contains(null));
    // ...the same turn across 180 is followed up to 180, then never again, also while the camera
    // holds still.
    List<double[]> upsideDown = tracked(rolling(178, 190, 36), null, -1, UPSIDE_DOWN);
    int lostAt = upsideDown.indexOf(null);
    assertTrue(lostAt > 3 && lostAt < 20, "lost at frame " + (lostAt + 1));
    assertTrue(upsideDown.get(lostAt - 1)[0] > 177, "last angle " + upsideDown.get(lostAt - 1)[0]);
    for (int k = lostAt; k < upsideDown.size(); k++) {
      assertEquals(null, upsideDown.get(k), "frame " + (k + 1));
    }
  }

  @Test
  void theEngineLosesASteepLineForGoodAfterOneRejectedFrame() {
    // Camera rolled 30: "Way out" stands at 45 degrees. One frame from a camera turned 40 degrees
    // further is rejected; the unchanged view after it is rejected too, to the end.
    CameraSequence still = rolling(30, 30, 30);
    CameraSequence turned = rolling(70, 70, 2);
    Mat glitch = turned.frame(0);
    List<double[]> angles = tracked(still, glitch, 5, "Way out", "Open every");
    glitch.release();
    assertEquals(45, angles.get(3)[0], 0.5);
    for (int k = 4; k < angles.size(); k++) {
      assertEquals(null, angles.get(k), "frame " + (k + 1));
    }
  }

  @Test
  void theHostReadsALineLostPast180AgainAndKeepsShowingIt() throws Exception {
    int frames = 48;
    CameraSequence camera = rolling(176, 188, frames);
    VideoResult result =
        VideoLoopTest.translate(VideoLoopTest.source(camera, 30), dir.resolve("flip"));

    for (FrameRecord record : result.records) {
      assertTrue(record.lines().stream().anyMatch(l -> l.text().startsWith(UPSIDE_DOWN)),
          "frame " + record.frame() + " shows " + record.lines());
    }
    boolean readAgain = false;
    for (Map<String, Object> keyframe : result.keyframes) {
      readAgain |= "tracking lost".equals(keyframe.get("reason"));
    }
    assertTrue(readAgain, "keyframes: " + result.keyframes);
    assertTrue(VideoLoopTest.worstError(camera, result, 0) <= VideoLoopTest.MAX_ERROR_PX);
  }

  @Test
  void liveTheHostReadsALineLostPast180AgainAsSoonAsTheWorkerIsFree() throws Exception {
    int frames = 48;
    int firstShown = 5;
    int readAgainBy = 40;
    CameraSequence camera = rolling(176, 188, frames);
    Semaphore keyframesDone = new Semaphore(0);
    List<Integer> unpaced = new ArrayList<>();
    // Frames come as fast as the loop takes them, except that frame 5 waits for the first
    // keyframe's work and frame 40 for a second one: the line turns past 180 near frame 14.
    FrameClock clock = new FrameClock() {
      @Override
      public void awaitFrame(int k) throws InterruptedException {
        // Bounded, so that a keyframe never reported done fails the test instead of hanging it.
        if ((k == firstShown || k == readAgainBy)
            && !keyframesDone.tryAcquire(60, TimeUnit.SECONDS)) {
          unpaced.add(k);
        }
      }

      @Override
      public double millisSince(int k) {
        return 0;
      }

      @Override
      public void keyframeDone(int k) {
        keyframesDone.release();
      }
    };
    VideoJob job = new VideoJob(new PhotoReader("eng"),
        Translators.create(Language.of("en"), Language.of("es"), null), Language.of("es"), true,
        KeyframeWork.delay(0), clock);
    VideoResult result =
        VideoLoopTest.run(job, VideoLoopTest.source(camera, 30), dir.resolve("live"), true);

    for (int k = readAgainBy; k < frames; k++) {
      assertTrue(
          result.records.get(k).lines().stream().anyMatch(l -> l.text().startsWith(UPSIDE_DOWN)),
          "frame " + k + " shows " + result.records.get(k).lines());
    }
    assertEquals("tracking lost", result.keyframes.get(1).get("reason"), "" + result.keyframes);
    assertEquals(List.of(), unpaced, "frames that waited in vain for a keyframe's work");
  }
}
