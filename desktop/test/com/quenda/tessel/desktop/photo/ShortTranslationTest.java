package com.quenda.tessel.desktop.photo;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.TranslateMain;
import com.quenda.tessel.desktop.ocr.PhotoReader;
import com.quenda.tessel.desktop.ocr.RecognizedLine;
import com.quenda.tessel.desktop.scenes.Backdrop;
import com.quenda.tessel.desktop.scenes.SignScene;
import com.quenda.tessel.desktop.scenes.SignStyle;
import java.io.ByteArrayOutputStream;
import java.io.PrintStream;
import java.nio.charset.StandardCharsets;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.List;
import java.util.Locale;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.imgcodecs.Imgcodecs;
import org.opencv.imgproc.Imgproc;

/**
 * A sign of two lines whose translation is one word: the word goes on the first line, the second
 * line is erased and left empty, and none of the English is left.
 */
class ShortTranslationTest {
  @Test
  void theSpareLineIsErasedAndLeftEmpty(@TempDir Path dir) throws Exception {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    Path input = dir.resolve("door.png");
    new SignScene(1280, 720, Backdrop.FACADE, 3)
        .sign("PLEASE KEEP", 640, 300, 44, 0, SignStyle.DARK_ON_WHITE)
        .sign("THIS DOOR CLOSED", 640, 372, 44, 0, SignStyle.DARK_ON_WHITE)
        .render("door")
        .writePng(input);
    Path phrases = dir.resolve("phrases.tsv");
    Files.writeString(phrases, "please keep this door closed\tCERRADO\n");
    Path out = dir.resolve("out");
    ByteArrayOutputStream err = new ByteArrayOutputStream();
    ExitStatus status =
        TranslateMain.run(new String[] {"photo", input.toString(), "--to", "es", "--translations",
                              phrases.toString(), "--out", out.toString()},
            new PrintStream(new ByteArrayOutputStream(), true, StandardCharsets.UTF_8),
            new PrintStream(err, true, StandardCharsets.UTF_8));
    assertEquals(ExitStatus.OK, status, err.toString(StandardCharsets.UTF_8));

    String json = Files.readString(out.resolve("door.json"));
    assertTrue(json.contains("\"translation\": \"CERRADO\""), json);
    assertTrue(json.contains("\"translation\": \"\""), json);
    Mat drawn = Imgcodecs.imread(out.resolve("door.png").toString());
    Imgproc.cvtColor(drawn, drawn, Imgproc.COLOR_BGR2RGB);
    List<RecognizedLine> read = new PhotoReader("eng").read(drawn);
    String text =
        String.join(" ", read.stream().map(l -> l.text).toList()).toLowerCase(Locale.ROOT);
    assertTrue(!text.contains("door") && !text.contains("closed") && !text.contains("keep"), text);
  }
}
