package org.vexel.desktop;

import java.io.File;

/**
 * The desktop counterpart of an Android {@code AssetManager}: the files under one directory,
 * addressed by relative names. Native code turns it into an {@code AAssetManager} with {@code
 * AAssetManager_fromJava}, valid while this object is open.
 */
public final class DirectoryAssetManager implements AutoCloseable {
  static {
    DesktopLibrary.load();
  }

  // Read by AAssetManager_fromJava; 0 once closed.
  private long nativeAssetManager;
  private final String directory;

  public DirectoryAssetManager(String directory) {
    if (!new File(directory).isDirectory()) {
      throw new IllegalArgumentException("not a directory: " + directory);
    }
    this.directory = directory;
    nativeAssetManager = nativeCreate(directory);
  }

  public String getDirectory() {
    return directory;
  }

  /**
   * The bytes of an asset, read through the native asset calls; null when there is no such asset
   * (absolute names and names that climb out of the directory find none).
   */
  public synchronized byte[] read(String name) {
    if (nativeAssetManager == 0) {
      throw new IllegalStateException("the asset manager is closed");
    }
    return nativeRead(nativeAssetManager, name);
  }

  @Override
  public synchronized void close() {
    if (nativeAssetManager != 0) {
      nativeDestroy(nativeAssetManager);
      nativeAssetManager = 0;
    }
  }

  private static native long nativeCreate(String directory);

  private static native void nativeDestroy(long manager);

  private static native byte[] nativeRead(long manager, String name);
}
