package com.quenda.tessel.desktop.video;

import static org.junit.jupiter.api.Assertions.assertEquals;

import java.util.List;
import java.util.Map;
import org.junit.jupiter.api.Test;

/** The stage times a video's JSON reports: median and p95 by nearest rank, stages in run order. */
class TimingsTest {
  @Test
  void percentilesAreSamplesTakenByNearestRank() {
    Timings timings = new Timings();
    for (int i = 100; i >= 1; i--) {
      timings.add("frame", i);
    }
    timings.add("ocr", 700);
    timings.add("encode", 3);
    timings.add("encode", 9);

    assertEquals(50, timings.median("frame"));
    assertEquals(95, timings.p95("frame"));
    assertEquals(100, timings.max("frame"));
    assertEquals(700, timings.median("ocr"));
    assertEquals(700, timings.p95("ocr"));
    // Of two samples the median is the lower, the p95 the higher.
    assertEquals(3, timings.median("encode"));
    assertEquals(9, timings.p95("encode"));
    // A stage that never ran reports zeros.
    assertEquals(0, timings.median("erase again"));
    assertEquals(0, timings.max("erase again"));

    Map<String, Object> json = timings.json();
    assertEquals(List.of("frame", "ocr", "encode"), List.copyOf(json.keySet()));
    assertEquals(
        List.of("median", "p95", "count"), List.copyOf(((Map<?, ?>) json.get("encode")).keySet()));
    assertEquals(List.of(3.0, 9.0, 2), List.copyOf(((Map<?, ?>) json.get("encode")).values()));
  }
}
