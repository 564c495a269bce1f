package com.quenda.tessel.desktop.translate;

import com.quenda.tessel.desktop.HostException;
import java.util.ArrayList;
import java.util.List;

/**
 * Back-ends asked in order: each line takes the first translation any of them gives. A phrase
 * table in front of a machine translator overrides it for the phrases it lists.
 */
public final class FirstThatKnows implements Translator {
  private final List<Translator> backEnds;

  public FirstThatKnows(List<Translator> backEnds) {
    this.backEnds = List.copyOf(backEnds);
  }

  @Override
  public List<String> translate(List<String> lines) throws HostException {
    List<String> result = new ArrayList<>(lines);
    List<Integer> open = new ArrayList<>();
    for (int i = 0; i < lines.size(); i++) {
      result.set(i, null);
      open.add(i);
    }
    for (Translator backEnd : backEnds) {
      if (open.isEmpty()) {
        break;
      }
      List<String> asked = new ArrayList<>();
      for (int i : open) {
        asked.add(lines.get(i));
      }
      List<String> answers = backEnd.translate(asked);
      List<Integer> stillOpen = new ArrayList<>();
      for (int k = 0; k < open.size(); k++) {
        if (answers.get(k) == null) {
          stillOpen.add(open.get(k));
        } else {
          result.set(open.get(k), answers.get(k));
        }
      }
      open = stillOpen;
    }
    return result;
  }

  @Override
  public void close() {
    for (Translator backEnd : backEnds) {
      backEnd.close();
    }
  }

  @Override
  public String name() {
    List<String> names = new ArrayList<>();
    for (Translator backEnd : backEnds) {
      names.add(backEnd.name());
    }
    return String.join(", then ", names);
  }
}
