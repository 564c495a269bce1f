package com.quenda.tessel.desktop.video;

import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.translate.Translator;
import java.util.ArrayList;
import java.util.HashMap;
import java.util.List;
import java.util.Map;

/**
 * A translator that asks its back-end once per text: the blocks read again at the next keyframe
 * are mostly the same, and their answers (failures too) are kept for the run.
 */
final class RememberingTranslator implements Translator {
  private final Translator backEnd;
  private final Map<String, String> known = new HashMap<>();

  RememberingTranslator(Translator backEnd) {
    this.backEnd = backEnd;
  }

  @Override
  public List<String> translate(List<String> texts) throws HostException {
    List<String> missing = new ArrayList<>();
    for (String text : texts) {
      if (!known.containsKey(text) && !missing.contains(text)) {
        missing.add(text);
      }
    }
    if (!missing.isEmpty()) {
      List<String> answers = backEnd.translate(missing);
      for (int i = 0; i < missing.size(); i++) {
        known.put(missing.get(i), answers.get(i));
      }
    }
    List<String> out = new ArrayList<>();
    for (String text : texts) {
      out.add(known.get(text));
    }
    return out;
  }

  @Override
  public String name() {
    return backEnd.name();
  }
}
