package com.quenda.tessel.desktop;

/** Command line entry of the desktop host. */
public final class TranslateMain {
  private TranslateMain() {}

  public static void main(String[] args) {
    System.err.println("translate: not built yet");
    System.exit(ExitStatus.INTERNAL.code);
  }
}
