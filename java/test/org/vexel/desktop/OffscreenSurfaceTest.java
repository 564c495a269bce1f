package org.vexel.desktop;

import static org.junit.jupiter.api.Assertions.assertArrayEquals;
import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertFalse;
import static org.junit.jupiter.api.Assertions.assertThrows;
import static org.junit.jupiter.api.Assertions.assertTrue;

import org.junit.jupiter.api.Test;
import org.vexel.KitProbe;

class OffscreenSurfaceTest {
  @Test
  void aNewSurfaceHasItsSizeAndAnEmptyFrame() {
    try (OffscreenSurface surface = new OffscreenSurface(5, 3)) {
      assertEquals(5, surface.getWidth());
      assertEquals(3, surface.getHeight());
      assertArrayEquals(new byte[5 * 3 * 4], surface.readPixels());
      assertEquals(0, surface.getFrameCount());
    }
  }

  @Test
  void theKitDrawsIntoTheSurfaceThroughItsNativeWindow() {
    try (OffscreenSurface surface = new OffscreenSurface(4, 2)) {
      assertTrue(KitProbe.drawBackground(surface, 0xFF804020));
      assertEquals(1, surface.getFrameCount());
      byte[] pixels = surface.readPixels();
      assertEquals(4 * 2 * 4, pixels.length);
      for (int i = 0; i < pixels.length; i += 4) {
        assertEquals(0x20, pixels[i] & 0xFF);
        assertEquals(0x40, pixels[i + 1] & 0xFF);
        assertEquals(0x80, pixels[i + 2] & 0xFF);
        assertEquals(0xFF, pixels[i + 3] & 0xFF);
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
  }

  @Test
  void negativeSizesAreRejected() {
    assertThrows(IllegalArgumentException.class, () -> new OffscreenSurface(-1, 4));
    try (OffscreenSurface empty = new OffscreenSurface(0, 0)) {
      assertEquals(0, empty.readPixels().length);
    }
  }
}
