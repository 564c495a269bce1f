package com.quenda.tessel.desktop.photo;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.TranslateMain;
import java.io.ByteArrayOutputStream;
import java.io.PrintStream;
import java.nio.charset.StandardCharsets;
import java.nio.file.Files;
import java.nio.file.Path;
import java.util.HashSet;
import java.util.List;
import java.util.Locale;
import java.util.Set;
import java.util.regex.Matcher;
import java.util.regex.Pattern;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;
import org.opencv.core.Core;

/**
 * Photographs of real signs, through the whole photo mode as a user runs it: the words a person
 * reads on them are found and translated, and the JSON says which recogniser read each line.
 */
class RealPhotoTest {
  @TempDir static Path out;
  static ExitStatus status;
  static String err;

  @BeforeAll
  static void translate() {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
    Path photos = Path.of(System.getProperty("desktop.test.photos"));
    ByteArrayOutputStream errBytes = new ByteArrayOutputStream();
    status = TranslateMain.run(
        new String[] {"photo", photos.resolve("ic03test_r1308_dPICT0030.jpg").toString(),
            photos.resolve("ic03test_r1308_dPICT0045.jpg").toString(), "--from", "en", "--to", "es",
            "--out", out.toString(), "--quiet"},
        new PrintStream(new ByteArrayOutputStream(), true, StandardCharsets.UTF_8),
        new PrintStream(errBytes, true, StandardCharsets.UTF_8));
    err = errBytes.toString(StandardCharsets.UTF_8);
  }

  @Test
  void aBankPosterIsReadAndTranslated() throws Exception {
    assertEquals(ExitStatus.OK, status, err);
    String json = Files.readString(out.resolve("ic03test_r1308_dPICT0030.json"));
    Set<String> read = words(json, "text");
    for (String w : List.of("student", "accounts", "know", "anyone", "starting", "university")) {
      assertTrue(read.contains(w), w + " not read: " + read);
    }
    // Translated: Spanish words appear that were not on the poster.
    Set<String> translated = words(json, "translation");
    assertTrue(translated.contains("universidad"), "translations: " + translated);
    assertEquals(Set.of("learned-latin"), new HashSet<>(strings(json, "reader")), json);
  }

  @Test
  void anOpticiansSignIsReadWithoutGarbage() throws Exception {
    assertEquals(ExitStatus.OK, status, err);
    String json = Files.readString(out.resolve("ic03test_r1308_dPICT0045.json"));
    Set<String> read = words(json, "text");
    int found = 0;
    for (String w : List.of("one", "hour", "eyecare", "clinic", "contact", "lens", "centre")) {
      found += read.contains(w) ? 1 : 0;
    }
    assertTrue(found >= 6, found + " of 7 words read: " + read);
    // Nothing read that is not on the sign (3 letters or more, as a reader counts).
    Set<String> truth =
        Set.of("one", "hour", "the", "eyecare", "clinic", "contact", "lens", "centre");
    for (String w : read) {
      assertTrue(w.length() < 3 || truth.contains(w), "read a word not on the sign: " + w);
    }
  }

  static List<String> strings(String json, String key) {
    Matcher m = Pattern.compile("\"" + key + "\": \"((?:[^\"\\\\]|\\\\.)*)\"").matcher(json);
    List<String> out = new java.util.ArrayList<>();
    while (m.find()) {
      out.add(m.group(1));
    }
    return out;
  }

  static Set<String> words(String json, String key) {
    Set<String> out = new HashSet<>();
    for (String s : strings(json, key)) {
      for (String w : s.toLowerCase(Locale.ROOT).split("\\s+")) {
        String bare = w.replaceAll("[^\\p{L}\\p{N}]", "");
        if (!bare.isEmpty()) {
          out.add(bare);
        }
      }
    }
    return out;
  }
}
