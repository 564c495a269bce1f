package com.quenda.tessel.desktop.translate;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertFalse;
import static org.junit.jupiter.api.Assertions.assertNotNull;
import static org.junit.jupiter.api.Assertions.assertNull;
import static org.junit.jupiter.api.Assertions.assertTrue;

import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import java.util.List;
import java.util.Locale;
import org.junit.jupiter.api.Test;

/**
 * The real apertium, checked for what the host does with its answer rather than for one
 * dictionary's wording: lines kept apart and in order, its marks gone, lines of unknown words
 * untranslated.
 */
class ApertiumTranslatorTest {
  @Test
  void translatesLineByLineWithoutMarks() throws HostException {
    Translator translator = new ApertiumTranslator(Language.of("en"), Language.of("es"));
    // Without a blank line between them Apertium would move words across the first break.
    List<String> spanish = translator.translate(
        List.of("Please keep", "the door closed", "(xyzzy) Fresh coffee", "plugh"));
    assertEquals(4, spanish.size());
    for (String line : spanish.subList(0, 3)) {
      assertNotNull(line, spanish.toString());
      // Apertium marks unknown (*), untranslatable (#) and unmatched (@) words.
      assertFalse(line.matches(".*[*#@].*"), line);
    }
    assertFalse(spanish.get(0).toLowerCase(Locale.ROOT).contains("puerta"), spanish.toString());
    assertTrue(spanish.get(1).toLowerCase(Locale.ROOT).contains("puerta"), spanish.toString());
    // An unknown word stays as it was within a translated line; a line of nothing else is left
    // untranslated.
    assertTrue(spanish.get(2).contains("(xyzzy)"), spanish.get(2));
    assertTrue(spanish.get(2).toLowerCase(Locale.ROOT).contains("caf"), spanish.get(2));
    assertNull(spanish.get(3));
  }
}
