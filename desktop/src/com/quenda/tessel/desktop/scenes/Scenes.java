package com.quenda.tessel.desktop.scenes;

import java.util.LinkedHashMap;
import java.util.List;
import java.util.Map;
import java.util.Random;
import java.util.function.Supplier;

/**
 * The bundled demo and test scenes, 1280×720, in English phrases that translate well. Each is
 * generated on demand, deterministically, so nothing binary is kept in the repository.
 */
public final class Scenes {
  public static final int WIDTH = 1280;
  public static final int HEIGHT = 720;

  /** Ten lines of a museum notice: the printed-page scene. */
  public static final List<String> PAGE_TEXT = List.of(
      "The museum is open every day from nine to five.", "Tickets are sold at the main entrance.",
      "Children under twelve do not pay.", "Please keep your bags with you at all times.",
      "The cafe on the first floor serves fresh coffee.",
      "Dogs are not allowed inside the building.", "The last entry is one hour before closing.",
      "Photographs are allowed without flash.", "Ask our staff if you need help.",
      "Thank you for your visit.");

  /** Short sign phrases. */
  public static final List<String> SIGN_PHRASES = List.of("Emergency exit", "No parking",
      "Please keep the door closed", "Open every day from nine to five", "Fresh coffee",
      "Tickets sold here", "Way out", "Closed on Sunday", "No smoking", "Toilets upstairs",
      "Please wait here", "Staff only", "Fresh bread every morning", "Mind the step");

  private static final Map<String, Supplier<Scene>> BUNDLED = new LinkedHashMap<>();

  static {
    BUNDLED.put("street", Scenes::street);
    BUNDLED.put("station", Scenes::station);
    BUNDLED.put("shop", Scenes::shop);
    BUNDLED.put("page", () -> page(3));
  }

  private Scenes() {}

  /** The names of the bundled scenes, in a stable order. */
  public static List<String> names() {
    return List.copyOf(BUNDLED.keySet());
  }

  /** Renders a bundled scene; the caller releases it. */
  public static Scene bundled(String name) {
    Supplier<Scene> s = BUNDLED.get(name);
    if (s == null) {
      throw new IllegalArgumentException("no bundled scene '" + name + "'; there are " + names());
    }
    return s.get();
  }

  static Scene street() {
    return new SignScene(WIDTH, HEIGHT, Backdrop.BRICK_WALL, 11)
        .sign("Emergency exit", 330, 150, 34, -8, SignStyle.WHITE_ON_GREEN)
        .sign("No parking", 940, 170, 40, 12, SignStyle.WHITE_ON_RED)
        .sign("Tickets sold here", 420, 420, 30, 0, SignStyle.DARK_ON_WHITE)
        .sign("Fresh coffee", 930, 520, 38, -20, SignStyle.BLACK_ON_YELLOW)
        .render("street");
  }

  static Scene station() {
    return new SignScene(WIDTH, HEIGHT, Backdrop.SKY_OVER_WALL, 23)
        .sign("Please keep the door closed", 640, 360, 28, 5, SignStyle.WHITE_ON_BLUE)
        .sign("Open every day from nine to five", 560, 560, 26, -3, SignStyle.DARK_ON_WHITE)
        .sign("Way out", 1080, 150, 36, 15, SignStyle.BLACK_ON_YELLOW)
        .sign("Tickets sold here", 250, 120, 30, -12, SignStyle.WHITE_ON_RED)
        .render("station");
  }

  static Scene shop() {
    return new SignScene(WIDTH, HEIGHT, Backdrop.FACADE, 37)
        .sign("Fresh coffee", 360, 330, 44, 0, SignStyle.BLACK_ON_YELLOW)
        .sign("Closed on Sunday", 920, 340, 28, 7, SignStyle.DARK_ON_WHITE)
        .sign("No smoking", 640, 620, 30, -14, SignStyle.WHITE_ON_RED)
        .render("shop");
  }

  /**
   * Four signs in the quarters of a 1280×720 street photograph, tilted by the given angles (up to
   * four), with phrases, sizes, colours and backdrop chosen by {@code seed}.
   */
  public static Scene tiltedSigns(long seed, double... angles) {
    Random r = new Random(seed);
    Backdrop[] backdrops = Backdrop.values();
    SignStyle[] styles = SignStyle.values();
    SignScene scene = new SignScene(WIDTH, HEIGHT, backdrops[r.nextInt(backdrops.length)], seed);
    for (int i = 0; i < Math.min(4, angles.length); i++) {
      String phrase = SIGN_PHRASES.get(r.nextInt(SIGN_PHRASES.size()));
      // Long phrases get smaller letters so that a tilted plate stays inside its quarter.
      double cap = Math.min(22 + r.nextInt(18), 520.0 / phrase.length());
      double cx = WIDTH / 4.0 * (1 + 2 * (i % 2)) + r.nextInt(41) - 20;
      double cy = HEIGHT / 4.0 * (1 + 2 * (i / 2)) + r.nextInt(41) - 20;
      scene.sign(phrase, cx, cy, cap, angles[i], styles[r.nextInt(styles.length)]);
    }
    return scene.render("signs-" + seed);
  }

  /** The museum notice as a photographed page turned by {@code rotation} degrees. */
  public static Scene page(double rotation) {
    return new PageScene(WIDTH, HEIGHT, 5).lines(PAGE_TEXT).rotation(rotation).render("page");
  }
}
