package org.vexel.android;

import com.quenda.tessel.NativeLibrary;
import java.nio.ByteBuffer;

/**
 * The overlay renderer's entry points. Call on the render thread: {@link #setAssetManager} before
 * {@link #initFromSurface}, {@link #renderOneFrame} once per camera frame, {@link #shutDown} when
 * the surface goes away. Calls before initialisation are harmless.
 *
 * <p>On a phone {@code assetManager} is an {@code android.content.res.AssetManager} and {@code
 * surface} an {@code android.view.Surface}; on the desktop they are an {@code
 * org.vexel.desktop.DirectoryAssetManager} and an {@code org.vexel.desktop.OffscreenSurface}.
 *
 * <p>A failure while drawing is logged and the frame goes on with what can still be drawn; no
 * call throws for its inputs (angles of any value, NaN, missing or short arrays included). The
 * one exception that can reach the caller is {@link OutOfMemoryError}, from {@link
 * #renderOneFrame}, {@link #setTranslationLanguage} and {@link #setTranslationLanguageFont}, when
 * native memory runs out while copying the caller's strings and records.
 */
public final class VexelJNI {
  static {
    NativeLibrary.load();
  }

  private VexelJNI() {}

  /** The asset manager the default fonts are read through. */
  public static native void setAssetManager(Object assetManager);

  /**
   * Builds the renderer on the surface's window, with the camera image of {@code backgroundWidth}
   * x {@code backgroundHeight} fitted into it. A live renderer is shut down first. Returns false
   * only when building it failed with an error (logged).
   */
  public static native boolean initFromSurface(
      Object surface, int backgroundWidth, int backgroundHeight);

  /** Destroys the renderer and releases the window. */
  public static native void shutDown();

  /** The display orientation in degrees (0, 90, 180 or 270). */
  public static native void setOrientation(int orientation);

  /** The language of the translated texts, which selects their font. */
  public static native void setTranslationLanguage(String language);

  /**
   * Binds a font to a language: a file name after "/system/fonts/" names a platform font, any
   * other path an asset. An empty or null path returns the language to its default font.
   */
  public static native void setTranslationLanguageFont(String language, String fontPath);

  /**
   * Draws one frame: the camera image and, for each of the n texts, its inpainted patch and the
   * translated string.
   *
   * @param imageMatAddr native address of the camera frame (8-bit RGBA), 0 to keep the last one
   * @param texts the translated strings; n is its length
   * @param patchRects 5 values per text (centre x, centre y, width, height, angle in degrees) in
   *     image pixels: where the patch was cut
   * @param textRects 5 values per text: where the text is drawn
   * @param ids per text the id of its patch's content. The renderer keeps each text's patch
   *     between frames and takes new pixels only when the id differs from the one it holds for
   *     that text (a new texture only when the size changes too). So every new patch needs a new
   *     id, also a patch cut again for the same line (in new light, say): under the old id the old
   *     pixels stay on screen. Only the low 32 bits count.
   * @param patchMatAddrs per text the native address of its RGBA patch matrix
   * @param colorScales 3 per text: per-channel multipliers of patch and text colour, or null
   * @param colorShifts 3 per text: per-channel offsets (0..255 units), or null
   * @param colors per text the colour as 0xAABBGGRR, or null for opaque black
   */
  public static native void renderOneFrame(long imageMatAddr, String[] texts, double[] patchRects,
      double[] textRects, long[] ids, long[] patchMatAddrs, double[] colorScales,
      double[] colorShifts, int[] colors);

  /**
   * A direct buffer over a matrix's pixels, of rows x cols x channel-element size bytes (the
   * channel count is not counted in).
   */
  public static native ByteBuffer GetMatByteBuffer(long matAddr);

  /** Whether the last rendered frame carried at least one text. */
  public static native boolean getRenderTranslate();
}
