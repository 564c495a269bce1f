package com.quenda.tessel.desktop.video;

/** When live frames arrive: at the camera's pace, or at a test's. */
interface FrameClock {
  /** Returns once frame {@code k} has arrived. */
  void awaitFrame(int k) throws InterruptedException;

  /** Milliseconds since frame {@code k} arrived. */
  double millisSince(int k);

  /**
   * Told when the worker has finished live keyframe {@code k} (read, translated, erased, caught
   * up), so that the frame loop can take it over: a test's clock paces its frames by it.
   */
  default void keyframeDone(int k) {}

  /** Frame k arrives k / fps seconds after the first call, as a camera delivers them. */
  static FrameClock realTime(double fps) {
    return new FrameClock() {
      private long startNanos = Long.MIN_VALUE;

      @Override
      public void awaitFrame(int k) throws InterruptedException {
        if (startNanos == Long.MIN_VALUE) {
          startNanos = System.nanoTime();
        }
        long wait = arrivalNanos(k) - System.nanoTime();
        if (wait > 0) {
          Thread.sleep(wait / 1_000_000, (int) (wait % 1_000_000));
        }
      }

      @Override
      public double millisSince(int k) {
        return (System.nanoTime() - arrivalNanos(k)) / 1e6;
      }

      private long arrivalNanos(int k) {
        return startNanos + (long) (k * 1e9 / fps);
      }
    };
  }
}
