package com.quenda.tessel;

import static org.junit.jupiter.api.Assertions.assertEquals;

import org.junit.jupiter.api.Test;

class ConstantsTest {
  @Test
  void hostReadsTheExactSizingConstants() {
    assertEquals(5, Constants.getValsPerRect());
    assertEquals(1.05, Constants.getInpaintRectWidthRatio(), 0.0);
    assertEquals(1.15, Constants.getInpaintRectHeightRatio(), 0.0);
    assertEquals(0.0, Constants.getStandardOcrEnlargePercent(), 0.0);
    assertEquals(4, Constants.getMinInpaintSize());
  }
}
