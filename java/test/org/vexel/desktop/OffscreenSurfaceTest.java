package org.vexel.desktop;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertFalse;
import static org.junit.jupiter.api.Assertions.assertThrows;
import static org.junit.jupiter.api.Assertions.assertTrue;

import org.junit.jupiter.api.Test;
import org.vexel.KitProbe;

class OffscreenSurfaceTest {
  @Test
  void theKitDrawsIntoTheSurfaceThroughItsNativeWindow() {
    try (OffscreenSurface surface = new OffscreenSurface(4, 2)) {
      assertEquals(0, surface.getFrameCount());
      assertTrue(KitProbe.drawBackground(surface, 0xFF804020));
      assertEquals(1, surface.getFrameCount());
      byte[] pixels = surface.readPixels();
      assertEquals(4 * 2 * 4, pixels.length);
      int[] rgba = {0x20, 0x40, 0x80, 0xFF};
      for (int i = 0; i < pixels.length; i++) {
        assertEquals(rgba[i % 4], pixels[i] & 0xFF, "byte " + i);
      }
    }
  }

  @Test
  void objectsThatAreNoSurfaceGiveNoWindow() {
    assertFalse(KitProbe.drawBackground("not a surface", 0));
    OffscreenSurface closed = new OffscreenSurface(2, 2);
    closed.close();
    assertFalse(KitProbe.drawBackground(closed, 0));
    assertThrows(IllegalStateException.class, closed::readPixels);
    assertThrows(IllegalArgumentException.class, () -> new OffscreenSurface(-1, 4));
  }
}
