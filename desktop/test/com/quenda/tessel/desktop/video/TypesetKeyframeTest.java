package com.quenda.tessel.desktop.video;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.Language;
import com.quenda.tessel.desktop.ocr.PhotoReader;
import com.quenda.tessel.desktop.scenes.CameraSequence;
import com.quenda.tessel.desktop.scenes.CameraSequence.Pose;
import com.quenda.tessel.desktop.scenes.PageScene;
import com.quenda.tessel.desktop.scenes.Scene;
import com.quenda.tessel.desktop.scenes.Scenes;
import com.quenda.tessel.desktop.translate.Translator;
import com.quenda.tessel.desktop.typeset.Face;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.Comparator;
import java.util.List;
import java.util.Locale;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;
import org.opencv.core.Core;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;

/**
 * A video of a printed two-line paragraph, filmed by a camera that pans, zooms and rolls: each
 * keyframe is typeset as a photo is, so the sentence running across the two lines is translated
 * whole and each line shows its share of it, in the page's serif face; and where each line's
 * translation is drawn, set at the keyframe, moves, turns and scales with the tracked line.
 */
class TypesetKeyframeTest {
  static final String SENTENCE = "El museo abre a las nueve y cierra a las seis todos los días.";
  // Where a text rectangle's ends may stand off the camera's own motion: the tracker's error on a
  // line (two pixels at its centre) grows towards the ends with the smallest error in angle.
  static final double MAX_END_ERROR_PX = 2.5;

  @TempDir Path dir;

  /** Translates the paragraph only as a whole; any other text comes back marked as a line. */
  static final class Paragraph implements Translator {
    @Override
    public List<String> translate(List<String> texts) {
      List<String> out = new ArrayList<>();
      for (String text : texts) {
        String lower = text.toLowerCase(Locale.ROOT);
        out.add(lower.contains("museum") && lower.contains("closes") ? SENTENCE : "[" + text + "]");
      }
      return out;
    }

    @Override
    public String name() {
      return "paragraph";
    }
  }

  @Test
  void eachLineShowsItsShareOfTheSentenceWhereItsTrackedLineNowStands() throws Exception {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    // The page's lines stand at the pitch of five: the paragraph's two, at the top, as printed.
    Scene page =
        new PageScene(Scenes.WIDTH, Scenes.HEIGHT, 11)
            .lines(List.of("The museum opens at nine and", "closes at six every day.", "", "", ""))
            .render("paragraph");
    CameraSequence camera = new CameraSequence(page, new Size(1280, 720),
        List.of(
            new Pose(640, 360, 0.8, 0), new Pose(670, 380, 0.9, 4), new Pose(620, 350, 0.85, -3)),
        40);
    VideoJob job = new VideoJob(new PhotoReader("eng"), new Paragraph(), Language.of("es"), false,
        KeyframeWork.delay(0), null);
    VideoResult result;
    try {
      result = VideoLoopTest.run(job, VideoLoopTest.source(camera, 30), dir.resolve("page"), false);
    } finally {
      page.release();
    }

    int checkedEnds = 0;
    double worst = 0;
    String worstAt = "";
    for (FrameRecord record : result.records) {
      List<FrameRecord.Drawn> lines = new ArrayList<>(record.lines());
      assertEquals(2, lines.size(), "frame " + record.frame() + ": " + lines);
      lines.sort(Comparator.comparingDouble(l -> l.readAt().center.y));
      String top = lines.get(0).translation();
      String bottom = lines.get(1).translation();
      assertTrue(top.startsWith("El museo") && !bottom.isBlank(), top + " / " + bottom);
      assertEquals(SENTENCE, top + " " + bottom);
      for (FrameRecord.Drawn line : lines) {
        assertEquals(Face.SERIF, line.face(), line.text());
        FrameRecord.Drawn atKeyframe = sameLineAt(result.records.get(line.keyframe()), line);
        for (Point end : ends(atKeyframe.textRect())) {
          Point expected = camera.carry(end, line.keyframe(), record.frame());
          Point drawnEnd = nearest(ends(line.textRect()), expected);
          double error = Math.hypot(expected.x - drawnEnd.x, expected.y - drawnEnd.y);
          if (error > worst) {
            worst = error;
            worstAt = "frame " + record.frame() + ", " + line.text();
          }
          ++checkedEnds;
        }
      }
    }
    assertEquals(4 * 40, checkedEnds);
    assertTrue(worst <= MAX_END_ERROR_PX, worstAt + ": a text end off by " + worst + " px");
  }

  /** The record of {@code line} in the frame of its keyframe, where its text rectangle was set. */
  private static FrameRecord.Drawn sameLineAt(FrameRecord keyframe, FrameRecord.Drawn line) {
    for (FrameRecord.Drawn drawn : keyframe.lines()) {
      if (drawn.id() == line.id() && drawn.keyframe() == line.keyframe()) {
        return drawn;
      }
    }
    throw new AssertionError("line " + line.id() + " not drawn on its keyframe");
  }

  /** The middles of a rectangle's two short sides: where its text starts and ends. */
  private static List<Point> ends(RotatedRect rect) {
    double radians = Math.toRadians(rect.angle);
    double dx = rect.size.width / 2 * Math.cos(radians);
    double dy = rect.size.width / 2 * Math.sin(radians);
    return List.of(new Point(rect.center.x - dx, rect.center.y - dy),
        new Point(rect.center.x + dx, rect.center.y + dy));
  }

  private static Point nearest(List<Point> points, Point to) {
    return points.stream()
        .min(Comparator.comparingDouble(p -> Math.hypot(p.x - to.x, p.y - to.y)))
        .orElseThrow();
  }
}
