package com.quenda.tessel.desktop.translate;

import static org.junit.jupiter.api.Assertions.assertEquals;

import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import java.util.Arrays;
import java.util.List;
import org.junit.jupiter.api.Test;

/** The real apertium: lines kept apart, its marks gone, lines of unknown words untranslated. */
class ApertiumTranslatorTest {
  @Test
  void translatesLineByLineWithoutMarks() throws HostException {
    Translator translator = new ApertiumTranslator(Language.of("en"), Language.of("es"));
    // Without a blank line between them Apertium would move words across the first break.
    assertEquals(
        Arrays.asList("Complacer mantener", "La puerta cerró", "(xyzzy) Café fresco", null),
        translator.translate(
            List.of("Please keep", "the door closed", "(xyzzy) Fresh coffee", "plugh")));
  }
}
