package com.quenda.tessel.demo;

import com.quenda.tessel.Constants;
import java.io.File;

/** Drives the engine the way a phone host does, on a bundled default input. */
public final class DemoHost {
  private DemoHost() {}

  public static void main(String[] args) {
    File out = new File(args.length > 0 ? args[0] : "out");
    out.mkdirs();
    System.out.printf("engine constants: %d values per rectangle, min inpaint size %d%n",
        Constants.getValsPerRect(), Constants.getMinInpaintSize());
  }
}
