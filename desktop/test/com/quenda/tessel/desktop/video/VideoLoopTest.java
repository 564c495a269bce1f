package com.quenda.tessel.desktop.video;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertFalse;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.CommandLine;
import com.quenda.tessel.desktop.Language;
import com.quenda.tessel.desktop.TranslateMain;
import com.quenda.tessel.desktop.ocr.PhotoReader;
import com.quenda.tessel.desktop.scenes.CameraSequence;
import com.quenda.tessel.desktop.scenes.CameraSequence.Pose;
import com.quenda.tessel.desktop.scenes.Scenes;
import com.quenda.tessel.desktop.translate.Translators;
import java.io.ByteArrayOutputStream;
import java.io.PrintStream;
import java.nio.charset.StandardCharsets;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.List;
import java.util.Map;
import java.util.concurrent.CountDownLatch;
import java.util.concurrent.Semaphore;
import java.util.concurrent.TimeUnit;
import java.util.concurrent.atomic.AtomicBoolean;
import org.junit.jupiter.api.AfterAll;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.Size;
import org.opencv.imgcodecs.Imgcodecs;
import org.opencv.imgproc.Imgproc;

/**
 * The host loop on a generated 120-frame camera sequence with known motion: the camera moves over
 * a wall of signs, pans away until no sign is in view, and comes back. Every overlay must sit
 * where the text it was read from truly is, and the text must be read and translated again when
 * it comes back.
 */
class VideoLoopTest {
  // Twenty frames per leg: zoom and roll over the signs, pan down in two legs until no sign is in
  // view (frames 60-80 see bare wall and what lies below it), and back up in two legs. The pans
  // stay under 25 pixels a frame, as a hand-held camera does.
  static final List<Pose> POSES = List.of(new Pose(640, 360, 1.0, 0), new Pose(660, 370, 1.12, 3),
      new Pose(650, 680, 1.0, 1), new Pose(640, 1000, 1.0, 0), new Pose(640, 1000, 1.0, 0),
      new Pose(650, 680, 1.0, 1), new Pose(640, 360, 1.05, -2));
  // Live: the camera stays on the signs, zooming, rolling and panning, so that a slowed first
  // result still finds them in view.
  static final List<Pose> STEADY_POSES = List.of(new Pose(640, 360, 1.0, 0),
      new Pose(670, 380, 1.12, 4), new Pose(610, 340, 1.05, -3), new Pose(640, 360, 1.1, 2));
  static final int FRAMES = 120;
  static final double MAX_ERROR_PX = 2.0;

  @TempDir static Path dir;
  static CameraSequence sequence;
  static CameraSequence steady;

  @BeforeAll
  static void makeSequence() {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    sequence = new CameraSequence(Scenes.bundled("station"), new Size(1280, 720), POSES, FRAMES);
    steady = new CameraSequence(sequence.scene(), new Size(1280, 720), STEADY_POSES, FRAMES);
  }

  @AfterAll
  static void release() {
    sequence.scene().release();
  }

  /** The generated frames as a camera source at {@code fps} frames per second. */
  static FrameSource source(CameraSequence sequence, double fps) {
    return new FrameSource() {
      private int next;

      @Override
      public Mat next() {
        return next < sequence.frameCount() ? sequence.frame(next++) : null;
      }

      @Override
      public double fps() {
        return fps;
      }

      @Override
      public int frameCountHint() {
        return sequence.frameCount();
      }

      @Override
      public String name() {
        return "walk";
      }

      @Override
      public void close() {}
    };
  }

  static VideoResult translate(CameraSequence sequence, boolean live, long extraOcrMillis, Path out)
      throws Exception {
    // Live, frames come at 15 per second: the loop keeps up with that on two cores while the
    // worker runs OCR beside it and other tests run.
    return translate(source(sequence, live ? 15 : 30), live, extraOcrMillis, out);
  }

  /** Translates {@code source} from English to Spanish offline into {@code out}. */
  static VideoResult translate(FrameSource source, Path out) throws Exception {
    return translate(source, false, 0, out);
  }

  static VideoResult translate(FrameSource source, boolean live, long extraOcrMillis, Path out)
      throws Exception {
    VideoJob job = new VideoJob(new PhotoReader("eng"),
        Translators.create(Language.of("en"), Language.of("es"), null), Language.of("es"), live,
        extraOcrMillis);
    return run(job, source, out, live);
  }

  static VideoResult run(VideoJob job, FrameSource source, Path out, boolean live)
      throws Exception {
    String[] args = live
        ? new String[] {"video", "walk", "--out", out.toString(), "--live", "--quiet"}
        : new String[] {"video", "walk", "--out", out.toString(), "--quiet"};
    PrintStream quiet = new PrintStream(new ByteArrayOutputStream(), true, StandardCharsets.UTF_8);
    return VideoCommand.run(job, source, CommandLine.parse(args), quiet, quiet);
  }

  /** The largest distance between a drawn line's centre and where its text truly is. */
  static double worstError(CameraSequence sequence, VideoResult result, int fromFrame) {
    double worst = 0;
    for (FrameRecord record : result.records) {
      if (record.frame() < fromFrame) {
        continue;
      }
      for (FrameRecord.Drawn line : record.lines()) {
        Point truth = sequence.carry(line.readAt().center, line.keyframe(), record.frame());
        double error = Math.hypot(truth.x - line.rect().center.x, truth.y - line.rect().center.y);
        worst = Math.max(worst, error);
      }
    }
    return worst;
  }

  @Test
  void overlaysFollowTheTextAndAreReadAgainWhenItComesBack() throws Exception {
    Path out = dir.resolve("offline");
    VideoResult result = translate(sequence, false, 0, out);

    assertEquals(FRAMES, result.frames);
    double worst = worstError(sequence, result, 0);
    assertTrue(worst <= MAX_ERROR_PX, "worst error " + worst);
    // Nothing is drawn while no sign is in view...
    for (int k = 62; k < 78; k++) {
      assertEquals(List.of(), result.records.get(k).lines(), "frame " + k);
    }
    // ...and the signs are read and translated again once they are back.
    boolean readAgain = false;
    for (Map<String, Object> keyframe : result.keyframes) {
      readAgain |= (int) keyframe.get("frame") > 80 && !((List<?>) keyframe.get("lines")).isEmpty();
    }
    assertTrue(readAgain, "keyframes: " + result.keyframes);
    assertFalse(result.records.get(FRAMES - 1).lines().isEmpty());
    assertEquals("Abierto todos los días de nueve a cinco",
        result.records.get(FRAMES - 1)
            .lines()
            .stream()
            .filter(l -> l.text().startsWith("Open every"))
            .findFirst()
            .orElseThrow()
            .translation());
    for (String file : List.of("walk.mp4", "walk.preview.gif", "walk.json")) {
      assertTrue(Files.size(out.resolve(file)) > 0, file);
    }
  }

  @Test
  void liveFramesNeverWaitForTheOcrAndShowItsResultFromThenOn() throws Exception {
    // The test's clock hands out frames as fast as the loop takes them and lets the OCR of the
    // first keyframe finish only when frame 30 is asked for: if any frame waited for the OCR, the
    // loop would never get there.
    int releaseAt = 30;
    CountDownLatch ocrMayFinish = new CountDownLatch(1);
    AtomicBoolean releasedByTheClock = new AtomicBoolean();
    Semaphore keyframeDone = new Semaphore(0);
    AtomicBoolean keyframeWaited = new AtomicBoolean();
    KeyframeWork.AfterOcr held = frame -> {
      // Breaks the deadlock of a loop that waits for the OCR; the assertion below then fails.
      releasedByTheClock.compareAndSet(false, ocrMayFinish.await(60, TimeUnit.SECONDS));
    };
    FrameClock clock = new FrameClock() {
      @Override
      public void awaitFrame(int k) throws InterruptedException {
        if (k == releaseAt) {
          ocrMayFinish.countDown();
        } else if (k == releaseAt + 1) {
          // The next frame comes once the keyframe's translating, erasing and catching up are
          // done (bounded, so that a keyframe never done fails the test instead of hanging it).
          keyframeWaited.set(keyframeDone.tryAcquire(60, TimeUnit.SECONDS));
        }
      }

      @Override
      public void keyframeDone(int k) {
        keyframeDone.release();
      }

      @Override
      public double millisSince(int k) {
        return 0;
      }
    };
    VideoJob job = new VideoJob(new PhotoReader("eng"),
        Translators.create(Language.of("en"), Language.of("es"), null), Language.of("es"), true,
        held, clock);
    VideoResult result = run(job, source(steady, 15), dir.resolve("live"), true);

    assertTrue(releasedByTheClock.get(), "a frame before " + releaseAt + " waited for the OCR");
    assertTrue(keyframeWaited.get(), "the first keyframe's work was never reported done");
    int firstDrawn = -1;
    int drawn = 0;
    for (FrameRecord record : result.records) {
      if (!record.lines().isEmpty()) {
        firstDrawn = firstDrawn < 0 ? record.frame() : firstDrawn;
        ++drawn;
      }
    }
    // Nothing can be drawn before the OCR finished; from the first result on, every frame shows
    // the lines, where the text truly is.
    assertTrue(firstDrawn > releaseAt, "first overlay at frame " + firstDrawn);
    assertEquals(FRAMES - firstDrawn, drawn, "frames drawn from frame " + firstDrawn);
    double worst = worstError(steady, result, firstDrawn);
    assertTrue(worst <= MAX_ERROR_PX, "worst error " + worst);
    assertEquals(0, (int) result.keyframes.get(0).get("frame"));
  }

  @Test
  void badSourcesAreRefusedBeforeAnythingIsWritten() throws Exception {
    Path notVideo = Files.writeString(dir.resolve("clip.mp4"), "not a video");
    assertRefused(notVideo, 65, notVideo + ": not a video OpenCV can read");
    Path empty = Files.createDirectories(dir.resolve("no-frames"));
    assertRefused(empty, 67, empty + ": no frames (no images in it)");
    Path mixed = Files.createDirectories(dir.resolve("mixed"));
    Imgcodecs.imwrite(mixed.resolve("f1.png").toString(), sequence.frame(0));
    Mat small = new Mat();
    Imgproc.resize(sequence.frame(1), small, new Size(640, 360));
    Imgcodecs.imwrite(mixed.resolve("f2.png").toString(), small);
    assertRefused(mixed, 65, mixed + ": frame 1 is 640x360, the first was 1280x720");
  }

  static void assertRefused(Path input, int status, String message) throws Exception {
    Path out = Files.createTempDirectory(dir, "refused");
    ByteArrayOutputStream err = new ByteArrayOutputStream();
    int code = TranslateMain
                   .run(new String[] {"video", input.toString(), "--out", out.toString()},
                       new PrintStream(new ByteArrayOutputStream(), true, StandardCharsets.UTF_8),
                       new PrintStream(err, true, StandardCharsets.UTF_8))
                   .code;
    assertEquals(status, code, err.toString(StandardCharsets.UTF_8));
    assertEquals("translate: " + message + "\n", err.toString(StandardCharsets.UTF_8));
    try (var files = Files.list(out)) {
      assertEquals(List.of(), files.toList());
    }
  }
}
