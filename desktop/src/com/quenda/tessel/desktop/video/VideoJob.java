package com.quenda.tessel.desktop.video;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Language;
import com.quenda.tessel.desktop.Progress;
import com.quenda.tessel.desktop.engine.Eraser;
import com.quenda.tessel.desktop.engine.FrameMeans;
import com.quenda.tessel.desktop.engine.OverlayDrawer;
import com.quenda.tessel.desktop.engine.Overlays;
import com.quenda.tessel.desktop.engine.Rects;
import com.quenda.tessel.desktop.ocr.PhotoReader;
import com.quenda.tessel.desktop.ocr.RecognizedLine;
import com.quenda.tessel.desktop.photo.LineResult;
import com.quenda.tessel.desktop.photo.PhotoResult;
import com.quenda.tessel.desktop.translate.Translator;
import com.quenda.tessel.desktop.typeset.Face;
import com.quenda.tessel.desktop.typeset.Typesetter;
import com.quenda.tessel.tracking.TrackingJNI;
import java.util.ArrayList;
import java.util.Arrays;
import java.util.LinkedHashMap;
import java.util.List;
import java.util.Map;
import java.util.concurrent.BlockingQueue;
import java.util.concurrent.ExecutionException;
import java.util.concurrent.ExecutorService;
import java.util.concurrent.Executors;
import java.util.concurrent.Future;
import java.util.concurrent.FutureTask;
import java.util.concurrent.LinkedBlockingQueue;
import org.opencv.core.Mat;
import org.opencv.core.RotatedRect;
import org.opencv.imgproc.Imgproc;

/**
 * Translates a video in place, frame by frame, the way a phone host drives the engine:
 *
 * <ol>
 *   <li>track: the tracker moves the lines' rectangles into the new frame;
 *   <li>keyframe: when the rules call for it, read, translate and erase the text of a frame
 *       ({@link KeyframeWork}) and start a new tracker on it; lines found again keep their ids;
 *   <li>erase again the lines whose patches no longer match the view;
 *   <li>draw: the frame with each visible line's patch and translation at its tracked place;
 *   <li>encode.
 * </ol>
 *
 * <p>Offline, a keyframe's work runs in line and holds its frame up. Live, frames arrive at the
 * source's rate and are never held up: the keyframe's work runs on a worker thread, and the frames
 * that arrive meanwhile are queued for it. When its result for frame k is ready, the worker starts
 * a tracker on frame k with the result's rectangles and runs it through the queued frames k+1..;
 * the frame loop, at frame k+m, runs it through what was queued since and through frame k+m, which
 * brings the rectangles to frame k+m before they are drawn. Until the first result, frames pass
 * through untouched.
 */
public final class VideoJob {
  // The frames queued for catching up while a live keyframe is worked on are bounded by their
  // size: 512 MiB is about 190 frames at 720p, 80 at 1080p, 20 at 4K. When the queue is full the
  // keyframe is given up: its frames are freed, its result is dropped when it comes, and a new
  // keyframe is taken on the frame after that.
  private static final long MAX_CATCH_UP_BYTES = 512L << 20;

  /**
   * A live keyframe's result with its tracker, run through the frames queued meanwhile (taking
   * {@code catchUpMillis} on the worker).
   */
  private record CaughtUp(
      KeyframeWork.Result result, long tracker, double[] rects, double catchUpMillis) {
    void release() {
      result.patches().release();
      if (tracker != 0) {
        TrackingJNI.releaseTracker(tracker);
      }
    }
  }

  /**
   * A live keyframe while the worker reads it: the result to come, why the keyframe was taken, and
   * the frames that arrived since, which the new tracker catches up through. Given up when those
   * frames outgrow their bound: they are freed, no more are queued, and the result is dropped when
   * it comes.
   */
  private static final class LiveKeyframe {
    final String reason;
    final BlockingQueue<Mat> framesSince = new LinkedBlockingQueue<>();
    Future<CaughtUp> result;
    boolean givenUp;

    LiveKeyframe(String reason) {
      this.reason = reason;
    }

    void queue(Mat frame) {
      if (!givenUp) {
        framesSince.add(frame.clone());
      }
    }

    void giveUpWhenOver(long frameBytes) {
      if (framesSince.size() * frameBytes > MAX_CATCH_UP_BYTES) {
        givenUp = true;
        releaseFrames();
      }
    }

    void releaseFrames() {
      for (Mat frame = framesSince.poll(); frame != null; frame = framesSince.poll()) {
        frame.release();
      }
    }
  }

  private final KeyframeWork work;
  private final Language target;
  private final boolean live;
  private final FrameClock clock;

  /** {@code extraOcrMillis} delays every OCR run: a hook to try the loop with a slow OCR. */
  public VideoJob(PhotoReader reader, Translator translator, Language target, boolean live,
      long extraOcrMillis) {
    this(reader, translator, target, live, KeyframeWork.delay(extraOcrMillis), null);
  }

  /**
   * Live with the frames arriving by {@code clock} (null: at the source's rate in real time), and
   * {@code afterOcr} run after each OCR (tests hold the OCR up).
   */
  VideoJob(PhotoReader reader, Translator translator, Language target, boolean live,
      KeyframeWork.AfterOcr afterOcr, FrameClock clock) {
    this.work = new KeyframeWork(reader, translator, target, afterOcr);
    this.target = target;
    this.live = live;
    this.clock = clock;
  }

  /** Runs the whole source through; {@code sink} receives every output frame. */
  public VideoResult run(FrameSource source, VideoSink sink, Progress progress)
      throws HostException {
    if (live) {
      work.warmUp();
    }
    Loop loop =
        new Loop(source, sink, progress, clock != null ? clock : FrameClock.realTime(source.fps()));
    try {
      return loop.run();
    } finally {
      loop.release();
    }
  }

  /** The state of one run. */
  private final class Loop {
    private final FrameSource source;
    private final VideoSink sink;
    private final Progress progress;
    private final Timings timings = new Timings();
    private final List<FrameRecord> records = new ArrayList<>();
    private final List<Map<String, Object>> keyframes = new ArrayList<>();
    private final List<Double> latencies = new ArrayList<>();
    private final ExecutorService worker;
    private final FrameClock arrivals;

    private OverlayDrawer drawer;
    private Face boundFace;
    private long tracker;
    private Mat keyframeRgba;
    private List<ShownLine> shown = new ArrayList<>();
    private long nextId;
    private long nextPatchId;
    private int lastKeyframe = Integer.MIN_VALUE;
    private List<Object> gainsKey;
    private double[] gainsValue;
    private final Mat rgbaFrame = new Mat();
    private Mat rgbaOf;

    // Live: the keyframe the worker is reading, if any; set when one was given up.
    private LiveKeyframe working;
    private boolean retakeKeyframe;
    private long startNanos;

    Loop(FrameSource source, VideoSink sink, Progress progress, FrameClock arrivals) {
      this.arrivals = arrivals;
      this.source = source;
      this.sink = sink;
      this.progress = progress;
      this.worker = live ? Executors.newSingleThreadExecutor(runnable -> {
        Thread thread = new Thread(runnable, "keyframe-worker");
        thread.setDaemon(true);
        return thread;
      })
                         : null;
    }

    VideoResult run() throws HostException {
      startNanos = System.nanoTime();
      int k = 0;
      for (Mat frame = nextFrame(k); frame != null; frame = nextFrame(++k)) {
        try {
          process(frame, k);
        } finally {
          frame.release();
        }
        progress.step(String.format("%s: frame %d", source.name(), k + 1));
      }
      double seconds = (System.nanoTime() - startNanos) / 1e9;
      return new VideoResult(k, k / seconds, keyframes, records, timings, latencies);
    }

    private Mat nextFrame(int k) throws HostException {
      if (live) {
        waitForArrival(k);
      }
      return source.next();
    }

    private void process(Mat frame, int k) throws HostException {
      if (k == 0) {
        drawer(frame); // as a phone starts its renderer with the surface, not at the first text
      }
      long start = System.nanoTime();
      Mat drawn = live ? liveStep(frame, k) : offlineStep(frame, k);
      double millis = (System.nanoTime() - start) / 1e6;
      timings.add("frame", millis);
      if (live && drawn != frame) {
        // What the keyframe worker costs the frame loop when both share the machine.
        timings.add(
            working != null ? "drawn frame, worker busy" : "drawn frame, worker idle", millis);
      }
      long encodeStart = System.nanoTime();
      sink.add(drawn);
      if (drawn != frame) {
        drawn.release();
      }
      timings.add("encode", (System.nanoTime() - encodeStart) / 1e6);
    }

    /**
     * Offline, one frame in step order: track; read the frame again when the rules call for it
     * (holding the frame up); erase again where patches went stale; draw.
     */
    private Mat offlineStep(Mat frame, int k) throws HostException {
      boolean lostAll = track(frame);
      String reason = keyframeReason(frame, k, lostAll);
      if (reason != null) {
        readKeyframe(frame, k, reason);
      }
      eraseAgainWhereNeeded(frame);
      return draw(frame, k);
    }

    /**
     * Live, one frame in step order, never waiting for the worker: track; take over a keyframe the
     * worker has finished; start a keyframe when the rules call for it, or queue the frame for the
     * one being read; draw.
     */
    private Mat liveStep(Mat frame, int k) throws HostException {
      boolean lostAll = track(frame);
      installFinishedWork(frame);
      String reason = keyframeReason(frame, k, lostAll);
      if (reason != null) {
        startKeyframe(frame, k, reason);
      } else if (working != null) {
        working.queue(frame);
      }
      return draw(frame, k);
    }

    /** Step 1: moves the shown lines into this frame; true when the tracker lost all of them. */
    private boolean track(Mat frame) {
      if (tracker == 0) {
        return false;
      }
      long start = System.nanoTime();
      double[] rects = TrackingJNI.updateTracker(tracker, frame.getNativeObjAddr());
      boolean lostAll = applyTracked(rects);
      timings.add("track", (System.nanoTime() - start) / 1e6);
      return lostAll;
    }

    private boolean applyTracked(double[] rects) {
      boolean any = false;
      for (int i = 0; i < shown.size(); i++) {
        boolean lost = rects == null || 5 * i + 4 >= rects.length || isZero(rects, i);
        shown.get(i).rect = lost ? null : Rects.at(rects, i);
        any |= !lost;
      }
      return !any;
    }

    /** Step 2: why this frame must be read again, or null. */
    private String keyframeReason(Mat frame, int k, boolean lostAll) {
      if (working != null) {
        return null;
      }
      if (lastKeyframe == Integer.MIN_VALUE) {
        return "first frame";
      }
      if (retakeKeyframe) {
        retakeKeyframe = false;
        return "last keyframe's result came too late";
      }
      if (shown.isEmpty()) {
        return k - lastKeyframe >= KeyframeRules.RETRY_FRAMES ? "no text on screen" : null;
      }
      if (lostAll) {
        return "tracking lost";
      }
      if (TrackingJNI.getCoverageLeft(tracker) < KeyframeRules.MIN_COVERAGE) {
        return "text leaving the view";
      }
      if (frameAccuracy(frame) < KeyframeRules.MIN_FRAME_ACCURACY) {
        return "view changed";
      }
      if (live && anyNeedsErasing(frame)) {
        // Live, erasing again goes through the worker as a keyframe: it must not hold a frame.
        return "patches out of date";
      }
      return null;
    }

    private double frameAccuracy(Mat frame) {
      return TrackingJNI.calculateFrameAccuracy(
          keyframeRgba.getNativeObjAddr(), rgba(frame).getNativeObjAddr());
    }

    /**
     * The frame as RGBA, as the renderer and the frame-accuracy measure take it: converted once a
     * frame, into the same buffer every time.
     */
    private Mat rgba(Mat frame) {
      if (rgbaOf != frame) {
        Imgproc.cvtColor(frame, rgbaFrame, Imgproc.COLOR_RGB2RGBA);
        rgbaOf = frame;
      }
      return rgbaFrame;
    }

    /** Offline: reads the frame, translates and erases its lines, and tracks them from here. */
    private void readKeyframe(Mat frame, int k, String reason) throws HostException {
      lastKeyframe = k;
      KeyframeWork.Result result = work.run(frame, k);
      long newTracker;
      try {
        newTracker = startTracker(frame, result);
      } catch (RuntimeException | Error e) {
        result.patches().release();
        throw e;
      }
      install(result, reason, frame, newTracker, null);
    }

    /** Live: hands a copy of the frame to the worker; the frames after it are queued for it. */
    private void startKeyframe(Mat frame, int k, String reason) {
      lastKeyframe = k;
      LiveKeyframe keyframe = new LiveKeyframe(reason);
      Mat copy = frame.clone();
      FutureTask<CaughtUp> task = new FutureTask<>(() -> {
        try {
          return catchUpOnWorker(work.run(copy, k), copy, keyframe.framesSince);
        } finally {
          copy.release();
        }
      }) {
        @Override
        protected void done() {
          arrivals.keyframeDone(k); // the result can be taken from here on
        }
      };
      worker.execute(task);
      keyframe.result = task;
      working = keyframe;
    }

    /**
     * Worker side of a live keyframe: a tracker on the keyframe's frame, run through every frame
     * queued since; the frame loop takes over with the frames queued after the last one here.
     */
    private CaughtUp catchUpOnWorker(
        KeyframeWork.Result result, Mat keyframe, BlockingQueue<Mat> queue) {
      long tracker = 0;
      try {
        tracker = startTracker(keyframe, result);
        double[] rects = null;
        long start = System.nanoTime();
        for (Mat later = queue.poll(); later != null; later = queue.poll()) {
          try {
            if (tracker != 0) {
              rects = TrackingJNI.updateTracker(tracker, later.getNativeObjAddr());
            }
          } finally {
            later.release();
          }
        }
        return new CaughtUp(result, tracker, rects, (System.nanoTime() - start) / 1e6);
      } catch (RuntimeException | Error e) {
        // Nobody will receive this result: free what it holds.
        new CaughtUp(result, tracker, null, 0).release();
        throw e;
      }
    }

    /** Live: takes a finished keyframe over and brings its rectangles to this frame. */
    private void installFinishedWork(Mat frame) throws HostException {
      if (working == null) {
        return;
      }
      if (!working.result.isDone()) {
        working.giveUpWhenOver(frame.total() * frame.elemSize());
        return;
      }
      LiveKeyframe done = working;
      working = null;
      CaughtUp caughtUp;
      try {
        caughtUp = result(done.result);
      } catch (HostException | RuntimeException | Error e) {
        done.releaseFrames(); // nobody else holds them now
        throw e;
      }
      if (done.givenUp) {
        caughtUp.release();
        done.releaseFrames();
        retakeKeyframe = true;
        return;
      }
      timings.add("catch-up on the worker", caughtUp.catchUpMillis());
      long start = System.nanoTime();
      double[] rects;
      try {
        rects = catchUpHere(caughtUp, done.framesSince, frame);
      } catch (RuntimeException | Error e) {
        caughtUp.release();
        done.releaseFrames();
        throw e;
      }
      timings.add("catch-up", (System.nanoTime() - start) / 1e6);
      install(caughtUp.result(), done.reason, frame, caughtUp.tracker(), rects);
      latencies.add(arrivals.millisSince(caughtUp.result().frame()));
    }

    /** Runs a caught-up tracker through the frames queued after the worker's last, then frame. */
    private double[] catchUpHere(CaughtUp caughtUp, BlockingQueue<Mat> queued, Mat frame) {
      double[] rects = caughtUp.rects();
      for (Mat later = queued.poll(); later != null; later = queued.poll()) {
        try {
          if (caughtUp.tracker() != 0) {
            rects = TrackingJNI.updateTracker(caughtUp.tracker(), later.getNativeObjAddr());
          }
        } finally {
          later.release();
        }
      }
      if (caughtUp.tracker() != 0) {
        rects = TrackingJNI.updateTracker(caughtUp.tracker(), frame.getNativeObjAddr());
      }
      return rects;
    }

    /**
     * Makes a keyframe's lines the shown ones, tracked by {@code newTracker}, at {@code rects} in
     * {@code frame} when given (live), else where they were read; ids kept for lines found again.
     */
    private void install(KeyframeWork.Result result, String reason, Mat frame, long newTracker,
        double[] rects) throws HostException {
      timings.add("ocr", result.ocrMillis());
      timings.add("translate", result.translateMillis());
      timings.add("erase", result.eraseMillis());
      keyframes.add(keyframeJson(result, reason));

      List<ShownLine> next = new ArrayList<>();
      for (int i = 0, p = 0; i < result.lines().size(); i++) {
        RecognizedLine line = result.lines().get(i);
        Typesetter.SetLine set = result.typeset().lines().get(i);
        if (set.text() == null) {
          continue;
        }
        ShownLine shownLine = new ShownLine(idFor(line), result.frame(), line, set, result.face(i));
        shownLine.replacePatch(result.patches().overlays.get(p), nextPatchId++,
            result.patches().colors[p], line.rect,
            Arrays.copyOfRange(result.means(), 3 * p, 3 * p + 3));
        next.add(shownLine);
        ++p;
      }
      releaseShown();
      shown = next;
      if (tracker != 0) {
        TrackingJNI.releaseTracker(tracker);
      }
      tracker = newTracker;
      if (rects != null) {
        applyTracked(rects);
      }
      if (keyframeRgba != null) {
        keyframeRgba.release();
      }
      // The reference for the view-change rule: the view the overlays were placed in.
      keyframeRgba = rgba(frame).clone();
    }

    /** A tracker of the result's translated lines on the frame they were read in; 0 for none. */
    private long startTracker(Mat keyframe, KeyframeWork.Result result) {
      List<RotatedRect> rects = result.translatedRects();
      return rects.isEmpty()
          ? 0
          : TrackingJNI.initializeTracker(keyframe.getNativeObjAddr(), Rects.pack(rects));
    }

    /** An old line's id when the same text stands in about the same place. */
    private long idFor(RecognizedLine line) {
      String key = KeyframeWork.key(line.text);
      for (ShownLine old : shown) {
        RotatedRect at = old.rect != null ? old.rect : old.read.rect;
        double reach = Math.max(at.size.height, line.rect.size.height);
        double dx = at.center.x - line.rect.center.x;
        double dy = at.center.y - line.rect.center.y;
        if (KeyframeWork.key(old.read.text).equals(key) && dx * dx + dy * dy < reach * reach) {
          return old.id;
        }
      }
      return nextId++;
    }

    private boolean anyNeedsErasing(Mat frame) {
      return !linesNeedingErasing(frame).isEmpty();
    }

    private List<ShownLine> linesNeedingErasing(Mat frame) {
      List<ShownLine> visible = visible();
      double[] gains = gains(frame, visible);
      List<ShownLine> stale = new ArrayList<>();
      for (int i = 0; i < visible.size(); i++) {
        ShownLine line = visible.get(i);
        if (KeyframeRules.needsErasing(
                line.erasedAt, line.rect, Arrays.copyOfRange(gains, 3 * i, 3 * i + 3))) {
          stale.add(line);
        }
      }
      return stale;
    }

    /**
     * Per visible line, three gains from the light its patch was cut in to the light under it in
     * {@code frame}. Asked for twice a frame (the erasing rule, then drawing): the second time,
     * with the same lines at the same places, the first answer is kept.
     */
    private double[] gains(Mat frame, List<ShownLine> visible) {
      List<Object> key = new ArrayList<>();
      key.add(frame);
      for (ShownLine line : visible) {
        key.add(line);
        key.add(line.rect);
        key.add(line.referenceMeans);
      }
      if (!key.equals(gainsKey)) {
        double[] means = FrameMeans.under(frame, patchRects(visible));
        gainsValue = new double[means.length];
        for (int i = 0; i < visible.size(); i++) {
          System.arraycopy(FrameMeans.gains(Arrays.copyOfRange(means, 3 * i, 3 * i + 3),
                               visible.get(i).referenceMeans),
              0, gainsValue, 3 * i, 3);
        }
        gainsKey = key;
      }
      return gainsValue;
    }

    /** Step 3 (offline): cuts new patches from this frame where the old ones no longer match. */
    private void eraseAgainWhereNeeded(Mat frame) throws HostException {
      List<ShownLine> stale = linesNeedingErasing(frame);
      if (stale.isEmpty()) {
        return;
      }
      long start = System.nanoTime();
      List<RotatedRect> rects = new ArrayList<>();
      for (ShownLine line : stale) {
        rects.add(line.eraseRect());
      }
      Eraser.Patches patches = Eraser.erase(frame, rects);
      double[] means = FrameMeans.under(frame, patches.patchRects);
      for (int i = 0; i < stale.size(); i++) {
        ShownLine line = stale.get(i);
        line.replacePatch(patches.overlays.get(i), nextPatchId++, patches.colors[i], line.rect,
            Arrays.copyOfRange(means, 3 * i, 3 * i + 3));
      }
      timings.add("erase again", (System.nanoTime() - start) / 1e6);
    }

    /**
     * Step 4: the frame with every visible line drawn over it, its translation in the rectangle
     * set at the keyframe carried along with the tracked line; the frame itself when none.
     */
    private Mat draw(Mat frame, int k) throws HostException {
      List<ShownLine> visible = visible();
      List<FrameRecord.Drawn> drawnLines = new ArrayList<>();
      for (ShownLine line : visible) {
        drawnLines.add(new FrameRecord.Drawn(line.id, line.read.text, line.translation, line.rect,
            line.keyframe, line.read.rect, line.textRect(), line.face));
      }
      records.add(new FrameRecord(k, drawnLines));
      if (visible.isEmpty()) {
        return frame;
      }
      long start = System.nanoTime();
      Mat drawn = drawByFace(frame, visible);
      timings.add("draw", (System.nanoTime() - start) / 1e6);
      return drawn;
    }

    /**
     * Draws {@code visible} one pass per face, as a photo is: the renderer builds a text object in
     * the font bound when it first meets that text, and keeps reusing it (font included) while the
     * text stays on screen. A keyframe of one face (the usual case) costs one pass and one font
     * binding per keyframe, and each further face one more pass over what the passes before drew.
     * A text already shown in one face and then asked for in another keeps the first.
     */
    private Mat drawByFace(Mat frame, List<ShownLine> visible) throws HostException {
      Map<Face, List<ShownLine>> byFace = new LinkedHashMap<>();
      for (ShownLine line : visible) {
        byFace.computeIfAbsent(line.face, f -> new ArrayList<>()).add(line);
      }
      double[] gains = gains(frame, visible);
      Mat drawn = frame;
      for (Map.Entry<Face, List<ShownLine>> pass : byFace.entrySet()) {
        List<ShownLine> lines = pass.getValue();
        double[] passGains = new double[3 * lines.size()];
        for (int j = 0; j < lines.size(); j++) {
          int i = visible.indexOf(lines.get(j));
          System.arraycopy(gains, 3 * i, passGains, 3 * j, 3);
        }
        bindFace(frame, pass.getKey());
        Mat next = drawer(frame).draw(rgba(drawn), overlays(lines, passGains));
        if (drawn != frame) {
          drawn.release();
        }
        drawn = next;
      }
      return drawn;
    }

    private Overlays overlays(List<ShownLine> lines, double[] gains) {
      int n = lines.size();
      String[] texts = new String[n];
      long[] ids = new long[n];
      long[] patches = new long[n];
      int[] colors = new int[n];
      List<RotatedRect> textRects = new ArrayList<>();
      for (int i = 0; i < n; i++) {
        ShownLine line = lines.get(i);
        texts[i] = line.translation;
        ids[i] = line.patchId;
        patches[i] = line.patch.getNativeObjAddr();
        colors[i] = line.color;
        textRects.add(line.textRect());
      }
      return new Overlays(
          texts, patchRects(lines), Rects.pack(textRects), ids, patches, colors, gains);
    }

    /** Binds {@code face} for the lines drawn next, when another face is bound. */
    private void bindFace(Mat frame, Face face) throws HostException {
      if (face != boundFace) {
        drawer(frame).setLanguage(target, face);
        boundFace = face;
      }
    }

    private List<ShownLine> visible() {
      List<ShownLine> visible = new ArrayList<>();
      for (ShownLine line : shown) {
        if (line.rect != null) {
          visible.add(line);
        }
      }
      return visible;
    }

    /** Where each line's patch goes: around what was erased, carried along with the line. */
    private double[] patchRects(List<ShownLine> lines) {
      List<RotatedRect> rects = new ArrayList<>();
      for (ShownLine line : lines) {
        rects.add(line.eraseRect());
      }
      return Eraser.enlarged(Rects.pack(rects));
    }

    /** The renderer, started on first use for the source's frame size. */
    private OverlayDrawer drawer(Mat frame) throws HostException {
      if (drawer == null) {
        drawer = new OverlayDrawer(frame.cols(), frame.rows());
      }
      return drawer;
    }

    private Map<String, Object> keyframeJson(KeyframeWork.Result result, String reason) {
      List<Object> lines = new ArrayList<>();
      for (int i = 0, p = 0; i < result.lines().size(); i++) {
        boolean translated = result.typeset().lines().get(i).text() != null;
        int color = translated ? result.patches().colors[p++] : 0;
        lines.add(LineResult.of(result.lines().get(i), result.typeset(), i, color).json());
      }
      Map<String, Object> json = new LinkedHashMap<>();
      json.put("frame", result.frame());
      json.put("reason", reason);
      json.put("lines", lines);
      json.put("blocks", PhotoResult.blocksJson(result.typeset().blocks()));
      return json;
    }

    private void waitForArrival(int k) throws HostException {
      try {
        arrivals.awaitFrame(k);
      } catch (InterruptedException e) {
        Thread.currentThread().interrupt();
        throw new HostException(ExitStatus.INTERNAL, "interrupted");
      }
    }

    private void releaseShown() {
      shown.forEach(ShownLine::release);
    }

    void release() {
      if (worker != null) {
        // Lets a keyframe already handed over run to its end, so that its result is freed here;
        // one dropped from the queue unrun would leave get() waiting for ever.
        worker.shutdown();
        try {
          if (working != null) {
            working.result.get().release();
          }
        } catch (InterruptedException | ExecutionException | RuntimeException e) {
          // The worker failed or was stopped; it holds nothing more to free.
        }
      }
      if (working != null) {
        working.releaseFrames();
      }
      releaseShown();
      if (tracker != 0) {
        TrackingJNI.releaseTracker(tracker);
      }
      if (keyframeRgba != null) {
        keyframeRgba.release();
      }
      rgbaFrame.release();
      if (drawer != null) {
        drawer.close();
      }
    }
  }

  private static CaughtUp result(Future<CaughtUp> future) throws HostException {
    try {
      return future.get();
    } catch (ExecutionException e) {
      if (e.getCause() instanceof HostException) {
        throw(HostException) e.getCause();
      }
      throw new HostException(ExitStatus.INTERNAL, "keyframe work failed: " + e.getCause(), e);
    } catch (InterruptedException e) {
      Thread.currentThread().interrupt();
      throw new HostException(ExitStatus.INTERNAL, "interrupted");
    }
  }

  private static boolean isZero(double[] rects, int i) {
    for (int j = 0; j < 5; j++) {
      if (rects[5 * i + j] != 0) {
        return false;
      }
    }
    return true;
  }
}
