package com.quenda.tessel.desktop.typeset;

import static org.junit.jupiter.api.Assertions.assertEquals;
import static org.junit.jupiter.api.Assertions.assertTrue;

import java.awt.Font;
import org.junit.jupiter.api.BeforeAll;
import org.junit.jupiter.api.Test;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;

/** The rectangle given for erasing holds the whole ink of a line's first and last letters. */
class InkEndsTest {
  @BeforeAll
  static void loadOpenCv() {
    System.loadLibrary(Core.NATIVE_LIBRARY_NAME);
  }

  @Test
  void lettersClippedByTheReadersBoxAreTakenWhole() throws Exception {
    Font serif = PrintedPage.font(PrintedPage.NOTO + "NotoSerif-Regular.ttf", 40);
    PrintedPage page = new PrintedPage(900, 200);
    RotatedRect ink = page.line(serif, Align.LEFT, 100, 110, "Wavy jelly by the way").rect;
    Mat rgb = page.rgb();
    // A reader's box that cuts into the first "W" and the last "y" and misses the tops.
    RotatedRect clipped = new RotatedRect(new Point(ink.center.x, ink.center.y + 2),
        new Size(ink.size.width - 24, ink.size.height - 4), 0);
    assertTrue(darkOutside(rgb, clipped) > 0);

    InkEnds.Cover cover = InkEnds.of(rgb, clipped);

    assertEquals(0, darkOutside(rgb, cover.erase()));
    // Along the line the cover runs from the first letter's ink to the last's.
    assertEquals(ink.center.x - ink.size.width / 2, left(cover.along()), 1.5);
    assertEquals(ink.center.x + ink.size.width / 2, right(cover.along()), 1.5);
    assertEquals(clipped.size.height, cover.along().size.height, 1e-9);
  }

  @Test
  void descendersOfTheLineAboveAreNotTaken() throws Exception {
    Font sans = PrintedPage.font(PrintedPage.NOTO + "NotoSans-Regular.ttf", 40);
    PrintedPage page = new PrintedPage(900, 260);
    page.line(sans, Align.LEFT, 100, 90, "gypsy jog quip");
    RotatedRect caps = page.line(sans, Align.LEFT, 100, 134, "HELLO THERE").rect;
    Mat rgb = page.rgb();
    // A loose box, as a segmenting reader draws it: the descenders above reach into its top, clear
    // of this line's capitals.
    double boxTop = 97;
    double capsTop = caps.center.y - caps.size.height / 2;
    double bottom = caps.center.y + caps.size.height / 2;
    assertTrue(capsTop > 103 && boxTop < 99, "caps from " + capsTop);
    RotatedRect box = new RotatedRect(new Point(caps.center.x, (boxTop + bottom) / 2),
        new Size(caps.size.width, bottom - boxTop), 0);

    InkEnds.Cover cover = InkEnds.of(rgb, box);

    double padding = InkEnds.ERASE_ACROSS_PAD * box.size.height;
    double top = cover.erase().center.y - cover.erase().size.height / 2;
    assertEquals(boxTop - padding, top, 0.5);
  }

  /** Pixels darker than mid-grey (ink, not its antialiased fringe) outside {@code rect}. */
  private static int darkOutside(Mat rgb, RotatedRect rect) {
    int count = 0;
    for (int y = 0; y < rgb.rows(); y++) {
      for (int x = 0; x < rgb.cols(); x++) {
        boolean dark = rgb.get(y, x)[1] < 128;
        boolean inside = Math.abs(x + 0.5 - rect.center.x) <= rect.size.width / 2
            && Math.abs(y + 0.5 - rect.center.y) <= rect.size.height / 2;
        count += dark && !inside ? 1 : 0;
      }
    }
    return count;
  }

  private static double left(RotatedRect r) {
    return r.center.x - r.size.width / 2;
  }

  private static double right(RotatedRect r) {
    return r.center.x + r.size.width / 2;
  }
}
