package com.quenda.tessel.desktop.scenes;

import java.awt.Color;

/** Colour schemes of street signs: the plate and its lettering. */
public enum SignStyle {
  WHITE_ON_BLUE(new Color(22, 66, 150), new Color(245, 245, 240)),
  BLACK_ON_YELLOW(new Color(245, 200, 30), new Color(25, 25, 25)),
  WHITE_ON_RED(new Color(190, 30, 35), new Color(250, 248, 245)),
  DARK_ON_WHITE(new Color(238, 238, 232), new Color(35, 40, 50)),
  WHITE_ON_GREEN(new Color(20, 120, 70), new Color(245, 250, 245));

  public final Color plate;
  public final Color ink;

  SignStyle(Color plate, Color ink) {
    this.plate = plate;
    this.ink = ink;
  }
}
