package com.quenda.tessel.desktop.video;

import java.util.ArrayList;
import java.util.LinkedHashMap;
import java.util.List;
import java.util.Map;

/** One translated video: what was read at each keyframe, what was drawn, how long it took. */
public final class VideoResult {
  public final int frames;
  public final double outputFps;
  public final List<Map<String, Object>> keyframes;
  public final List<FrameRecord> records;
  final Timings timings;
  /** Live: per keyframe, milliseconds from its frame's arrival to its first overlay. */
  public final List<Double> latencies;

  VideoResult(int frames, double outputFps, List<Map<String, Object>> keyframes,
      List<FrameRecord> records, Timings timings, List<Double> latencies) {
    this.frames = frames;
    this.outputFps = outputFps;
    this.keyframes = keyframes;
    this.records = records;
    this.timings = timings;
    this.latencies = latencies;
  }

  /** The longest a frame was held in the loop, tracking to drawing, encoding aside. */
  public double longestFrameMillis() {
    return timings.max("frame");
  }

  public double medianMillis(String stage) {
    return timings.median(stage);
  }

  public double p95Millis(String stage) {
    return timings.p95(stage);
  }

  /** The report, as NAME.json holds it. */
  public Map<String, Object> json(String video, String codec, boolean live) {
    Map<String, Object> json = new LinkedHashMap<>();
    json.put("frames", frames);
    json.put("video", video);
    json.put("codec", codec);
    json.put("live", live);
    json.put("keyframes", new ArrayList<Object>(keyframes));
    json.put("output_fps", outputFps);
    json.put("timings_ms", timings.json());
    if (live) {
      json.put("latency_ms", new ArrayList<Object>(latencies));
    }
    return json;
  }
}
