package org.vexel.desktop;

/**
 * The desktop counterpart of an Android {@code Surface}: an offscreen RGBA window of a fixed size.
 * Native code turns it into an {@code ANativeWindow} with {@code ANativeWindow_fromSurface}, as it
 * would a phone's surface; a renderer drawing into that window presents each frame here, where
 * {@link #readPixels()} reads it back.
 */
public final class OffscreenSurface implements AutoCloseable {
  static {
    DesktopLibrary.load();
  }

  // Read by ANativeWindow_fromSurface; 0 once closed.
  private long nativeWindow;
  private final int width;
  private final int height;

  /** A surface of {@code width} x {@code height} pixels (0 allowed, negative not). */
  public OffscreenSurface(int width, int height) {
    if (width < 0 || height < 0) {
      throw new IllegalArgumentException("surface size " + width + "x" + height + " is negative");
    }
    this.width = width;
    this.height = height;
    nativeWindow = nativeCreate(width, height);
  }

  public int getWidth() {
    return width;
  }

  public int getHeight() {
    return height;
  }

  /** The last presented frame: RGBA bytes, top row first; all zero before the first frame. */
  public synchronized byte[] readPixels() {
    return nativeReadPixels(handle());
  }

  /** How many frames have been presented. */
  public synchronized long getFrameCount() {
    return nativeFrameCount(handle());
  }

  /**
   * Drops this object's reference to the window; a renderer that still holds one keeps drawing into
   * it until it lets go.
   */
  @Override
  public synchronized void close() {
    if (nativeWindow != 0) {
      nativeRelease(nativeWindow);
      nativeWindow = 0;
    }
  }

  private long handle() {
    if (nativeWindow == 0) {
      throw new IllegalStateException("the surface is closed");
    }
    return nativeWindow;
  }

  private static native long nativeCreate(int width, int height);

  private static native void nativeRelease(long window);

  private static native byte[] nativeReadPixels(long window);

  private static native long nativeFrameCount(long window);
}
