package org.vexel.desktop;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertFalse;
import static org.junit.jupiter.api.Assertions.assertThrows;
import static org.junit.jupiter.api.Assertions.assertTrue;
import static org.junit.jupiter.api.Assumptions.assumeTrue;

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

  @Test
  void aSurfaceTooLargeForMemoryIsAnOutOfMemoryErrorNotARefusedSize() {
    // AddressSanitizer's allocator ends the process where the normal one throws.
    assumeTrue(System.getenv("ASAN_OPTIONS") == null, "not under AddressSanitizer");
    // Four terabytes of pixels: more than any machine this runs on commits.
    OutOfMemoryError error =
        assertThrows(OutOfMemoryError.class, () -> new OffscreenSurface(1_000_000, 1_000_000));
    assertEquals("std::bad_alloc", error.getMessage());
    try (OffscreenSurface surface = new OffscreenSurface(2, 2)) {
      assertEquals(16, surface.readPixels().length);
    }
  }
}
