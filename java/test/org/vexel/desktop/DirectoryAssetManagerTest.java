package org.vexel.desktop;

import static org.junit.jupiter.api.Assertions.assertArrayEquals;
import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertNull;
import static org.junit.jupiter.api.Assertions.assertThrows;
import static org.junit.jupiter.api.Assertions.assertTrue;

import java.io.IOException;
import java.lang.reflect.InvocationTargetException;
import java.lang.reflect.Method;
import java.nio.charset.StandardCharsets;
import java.nio.file.Files;
import java.nio.file.Path;
import java.nio.file.Paths;
import org.junit.jupiter.api.Test;
import org.junit.jupiter.api.io.TempDir;
import org.vexel.KitProbe;

class DirectoryAssetManagerTest {
  @TempDir Path directory;

  @Test
  void servesFilesByRelativeNameToTheKitAndNothingOutsideItsDirectory() throws IOException {
    Files.createDirectories(directory.resolve("sub"));
    Files.write(directory.resolve("sub/a.txt"), "asset".getBytes(StandardCharsets.UTF_8));
    Files.write(directory.resolveSibling("outside.txt"), new byte[] {1});
    Files.copy(Paths.get("/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf"),
        directory.resolve("Bundled.ttf"));
    try (DirectoryAssetManager assets = new DirectoryAssetManager(directory.toString())) {
      assertArrayEquals("asset".getBytes(StandardCharsets.UTF_8), assets.read("sub/a.txt"));
      assertNull(assets.read("missing.txt"));
      assertNull(assets.read("../outside.txt"));
      assertNull(assets.read(directory.resolve("sub/a.txt").toString()));

      float width = KitProbe.measureWithAssetFont(assets, "Bundled.ttf", "Hello");
      assertTrue(width > 2.0f && width < 4.0f, "width " + width);
      IllegalStateException missing = assertThrows(IllegalStateException.class,
          () -> KitProbe.measureWithAssetFont(assets, "Absent.ttf", "x"));
      assertEquals("Vexel: font asset \"Absent.ttf\" not found", missing.getMessage());
    } finally {
      Files.deleteIfExists(directory.resolveSibling("outside.txt"));
    }
    assertThrows(IllegalArgumentException.class,
        () -> new DirectoryAssetManager(directory.resolve("none").toString()));
  }

  @Test
  void nullNamesAreNullPointerExceptionsNotCrashes() throws ReflectiveOperationException {
    try (DirectoryAssetManager assets = new DirectoryAssetManager(directory.toString())) {
      assertEquals(
          "name", assertThrows(NullPointerException.class, () -> assets.read(null)).getMessage());
      assertNull(assets.read("missing.txt"));
    }
    // The constructor checks its directory in Java first; the native side
    // must hold on its own.
    Method create = DirectoryAssetManager.class.getDeclaredMethod("nativeCreate", String.class);
    create.setAccessible(true);
    InvocationTargetException thrown =
        assertThrows(InvocationTargetException.class, () -> create.invoke(null, (Object) null));
    assertEquals(NullPointerException.class, thrown.getCause().getClass());
    assertEquals("directory", thrown.getCause().getMessage());
  }
}
