package com.quenda.tessel.desktop.video;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertNull;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.Language;
import com.quenda.tessel.desktop.ocr.PhotoReader;
import com.quenda.tessel.desktop.ocr.RecognizedLine;
import com.quenda.tessel.desktop.scenes.Scene;
import com.quenda.tessel.desktop.scenes.Scenes;
import com.quenda.tessel.desktop.translate.Translator;
import java.util.ArrayList;
import java.util.List;
import java.util.Locale;
import org.junit.jupiter.api.Test;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.core.RotatedRect;

/**
 * One keyframe's work on a real frame: a line the translator cannot translate is left as it
 * stands (not erased, not tracked), and lines read again at the next keyframe are not sent to the
 * translator a second time.
 */
class KeyframeWorkTest {
  /** Knows every sign but "Way out"; records what it was asked. */
  static final class Signs implements Translator {
    final List<List<String>> asked = new ArrayList<>();

    @Override
    public List<String> translate(List<String> lines) {
      asked.add(List.copyOf(lines));
      List<String> out = new ArrayList<>();
      for (String line : lines) {
        out.add(line.toLowerCase(Locale.ROOT).startsWith("way out") ? null : "ES " + line);
      }
      return out;
    }

    @Override
    public String name() {
      return "signs";
    }
  }

  /** Before a live video's first frame: a sign read, translated and erased, not a keyframe. */
  @Test
  void warmingUpTranslatesASignWithoutCountingAsAKeyframe() throws Exception {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    Signs translator = new Signs();
    List<Integer> ocrFrames = new ArrayList<>();
    KeyframeWork work =
        new KeyframeWork(new PhotoReader("eng"), translator, Language.of("es"), ocrFrames::add);
    work.warmUp();
    assertEquals(List.of(), ocrFrames);
    assertEquals(List.of(List.of("OPEN")), translator.asked);
  }

  @Test
  void anUntranslatedLineIsLeftAsItStandsAndTextsAreTranslatedOnce() throws Exception {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    Scene station = Scenes.bundled("station");
    Signs translator = new Signs();
    List<Integer> ocrFrames = new ArrayList<>();
    KeyframeWork work =
        new KeyframeWork(new PhotoReader("eng"), translator, Language.of("es"), ocrFrames::add);
    Mat frame = station.rgb;

    KeyframeWork.Result first = work.run(frame, 0);
    KeyframeWork.Result again = work.run(frame, 7);
    station.release();

    assertEquals(List.of(0, 7), ocrFrames);
    assertEquals(4, first.lines().size(), "" + first.lines());
    int wayOut = -1;
    for (int i = 0; i < first.lines().size(); i++) {
      if (first.lines().get(i).text.startsWith("Way out")) {
        wayOut = i;
      }
    }
    assertTrue(wayOut >= 0, "" + first.lines());
    assertNull(first.translations().get(wayOut));
    // Three patches, three colours, three tracked rectangles: "Way out" keeps its own pixels.
    assertEquals(3, first.patches().overlays.size());
    assertEquals(3, first.patches().colors.length);
    assertEquals(9, first.means().length);
    List<RotatedRect> tracked = first.translatedRects();
    assertEquals(3, tracked.size());
    RecognizedLine wayOutLine = first.lines().get(wayOut);
    assertTrue(tracked.stream().noneMatch(r -> r == wayOutLine.rect));
    // The second keyframe's lines were all known: none was sent to the translator again.
    assertEquals(4, translator.asked.stream().mapToInt(List::size).sum(), "" + translator.asked);
    assertEquals(first.translations(), again.translations());
    first.patches().release();
    again.patches().release();
  }
}
