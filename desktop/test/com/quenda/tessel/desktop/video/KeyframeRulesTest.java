package com.quenda.tessel.desktop.video;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertFalse;
import static org.junit.jupiter.api.Assertions.assertTrue;

import org.junit.jupiter.api.Test;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;

/** When a shown line's patch is cut again, by what the renderer could no longer absorb. */
class KeyframeRulesTest {
  static final double[] SAME_LIGHT = {1, 1, 1};

  static RotatedRect line(double height, double angle) {
    return new RotatedRect(new Point(300, 200), new Size(8 * height, height), angle);
  }

  @Test
  void aQuarterInSizeOrTenDegreesOfTurnIsAbsorbedMoreIsNot() {
    RotatedRect cut = line(40, 5);
    assertFalse(KeyframeRules.needsErasing(cut, line(40, 5), SAME_LIGHT));
    assertFalse(KeyframeRules.needsErasing(cut, line(49, 5), SAME_LIGHT));
    assertTrue(KeyframeRules.needsErasing(cut, line(51, 5), SAME_LIGHT));
    assertFalse(KeyframeRules.needsErasing(cut, line(33, 5), SAME_LIGHT));
    assertTrue(KeyframeRules.needsErasing(cut, line(31, 5), SAME_LIGHT));
    assertFalse(KeyframeRules.needsErasing(cut, line(40, -4.5), SAME_LIGHT));
    assertTrue(KeyframeRules.needsErasing(cut, line(40, 15.5), SAME_LIGHT));
  }

  @Test
  void aLineUpsideDownTurnsTheShortWayRound() {
    // Tracked angles of a line standing on its head jump between +180 and -180.
    assertFalse(KeyframeRules.needsErasing(line(40, 179), line(40, -179), SAME_LIGHT));
    assertFalse(KeyframeRules.needsErasing(line(40, -176), line(40, 178), SAME_LIGHT));
    assertTrue(KeyframeRules.needsErasing(line(40, 175), line(40, -170), SAME_LIGHT));
    assertEquals(2, KeyframeRules.turnDegrees(179, -179), 1e-9);
    assertEquals(15, KeyframeRules.turnDegrees(175, -170), 1e-9);
    assertEquals(180, KeyframeRules.turnDegrees(-90, 90), 1e-9);
    assertEquals(10, KeyframeRules.turnDegrees(355, 5), 1e-9);
  }

  @Test
  void aThirdMoreOrLessLightInAnyChannelNeedsANewPatch() {
    RotatedRect at = line(40, 0);
    assertFalse(KeyframeRules.needsErasing(at, at, new double[] {1.3, 0.76, 1}));
    assertTrue(KeyframeRules.needsErasing(at, at, new double[] {1, 1, 1.34}));
    // A shadow of 60 %: the gains are 0.6 in every channel.
    assertTrue(KeyframeRules.needsErasing(at, at, new double[] {0.6, 0.6, 0.6}));
    assertTrue(KeyframeRules.needsErasing(at, at, new double[] {1, 0.74, 1}));
  }
}
