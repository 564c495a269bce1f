// Tracker start and update at 1280 x 720 with ten text regions, against a
// full-frame LK + RANSAC baseline on the same points; frame accuracy and blur
// at the same size. Counters give the centre error in pixels against the
// known camera motion: after one update (err_1) and after the 30-frame
// sequence (err_30, the worst region of the last frame).
#include <benchmark/benchmark.h>

#include <cstdlib>
#include <iostream>
#include <streambuf>
#include <vector>

#include <opencv2/imgproc.hpp>

#include "full_frame_baseline.h"
#include "moving_text_scene.h"
#include "quality/blur_measure.h"
#include "tracking/frame_accuracy.h"
#include "tracking/ocr_tracker_rot_rect.h"

namespace {

using tracking_testing::MeasureCentreError;
using tracking_testing::MovingTextScene;

// The tracker prints every homography on standard output; keep it off the
// benchmark's report while measuring (the formatting is still paid for).
class MutedStdout {
 public:
  MutedStdout() : saved_(std::cout.rdbuf(&null_)) {}
  ~MutedStdout() { std::cout.rdbuf(saved_); }

 private:
  struct NullBuffer : std::streambuf {
    int overflow(int c) override { return c; }
  } null_;
  std::streambuf* saved_;
};

struct Inputs {
  MovingTextScene scene;
  cv::Mat frame0, frame1, rgba0, rgba1;
  std::vector<cv::RotatedRect> rects0;
  std::vector<cv::Point2f> corners0;
  std::vector<cv::Point2f> points0;  // the tracker's features on frame 0

  Inputs() {
    frame0 = scene.Frame(0);
    frame1 = scene.Frame(1);
    cv::cvtColor(frame0, rgba0, cv::COLOR_RGB2RGBA);
    cv::cvtColor(frame1, rgba1, cv::COLOR_RGB2RGBA);
    rects0 = scene.TruthRects(0);
    for (const cv::RotatedRect& rect : rects0) {
      cv::Point2f p[4];
      rect.points(p);
      corners0.insert(corners0.end(), p, p + 4);
    }
    cv::Mat gray0;
    cv::cvtColor(frame0, gray0, cv::COLOR_RGB2GRAY);
    points0 = zeph::OcrTracker::GetTrackingPoints(corners0, gray0);
  }
};

const Inputs& SharedInputs() {
  static const Inputs inputs;
  return inputs;
}

// Worst centre error on the last frame after tracking the whole sequence.
template <typename StepFn>
double SequenceError(StepFn step) {
  const MovingTextScene& scene = SharedInputs().scene;
  std::vector<cv::RotatedRect> rects;
  for (int k = 1; k < scene.frame_count(); ++k)
    rects = step(scene.Frame(k));
  return MeasureCentreError(rects, scene.TruthRects(scene.frame_count() - 1)).max;
}

void BM_StartTracker(benchmark::State& state) {
  const Inputs& in = SharedInputs();
  for (auto _ : state) {
    zeph::OcrTrackerRotRect tracker;
    tracker.StartTracker(in.frame0, in.rects0);
    benchmark::DoNotOptimize(tracker.GetCoverageLeft());
  }
  state.counters["regions"] = static_cast<double>(in.rects0.size());
  state.counters["points"] = static_cast<double>(in.points0.size());
}

void BM_UpdateTracker(benchmark::State& state) {
  const Inputs& in = SharedInputs();
  MutedStdout muted;
  zeph::OcrTrackerRotRect started;
  started.StartTracker(in.frame0, in.rects0);
  std::vector<cv::RotatedRect> out;
  for (auto _ : state) {
    state.PauseTiming();
    zeph::OcrTrackerRotRect tracker = started;
    state.ResumeTiming();
    tracker.UpdateTracker(in.frame1, &out);
    benchmark::DoNotOptimize(out.data());
  }
  state.counters["err_1"] = MeasureCentreError(out, in.scene.TruthRects(1)).max;
  zeph::OcrTrackerRotRect tracker = started;
  state.counters["err_30"] = SequenceError([&tracker](const cv::Mat& frame) {
    std::vector<cv::RotatedRect> rects;
    tracker.UpdateTracker(frame, &rects);
    return rects;
  });
}

void BM_FullFrameLkBaseline(benchmark::State& state) {
  const Inputs& in = SharedInputs();
  const tracking_bench::FullFrameBaseline started(in.frame0, in.points0, in.corners0);
  std::vector<cv::RotatedRect> out;
  for (auto _ : state) {
    state.PauseTiming();
    tracking_bench::FullFrameBaseline baseline = started;
    state.ResumeTiming();
    baseline.Update(in.frame1);
    out = baseline.Rects();
    benchmark::DoNotOptimize(out.data());
  }
  state.counters["err_1"] = MeasureCentreError(out, in.scene.TruthRects(1)).max;
  tracking_bench::FullFrameBaseline baseline = started;
  state.counters["err_30"] = SequenceError([&baseline](const cv::Mat& frame) {
    baseline.Update(frame);
    return baseline.Rects();
  });
}

void BM_FrameAccuracy(benchmark::State& state) {
  const Inputs& in = SharedInputs();
  for (auto _ : state)
    benchmark::DoNotOptimize(zeph::CalculateFrameAccuracy(in.rgba0, in.rgba1));
}

void BM_Blur(benchmark::State& state) {
  const Inputs& in = SharedInputs();
  for (auto _ : state)
    benchmark::DoNotOptimize(image_quality::CalculateBlur(in.rgba1));
}

// OpenCV spreads work over its own threads: wall time is what a frame costs.
#define TRACKING_BENCHMARK(fn)        \
  BENCHMARK(fn)                       \
      ->Unit(benchmark::kMillisecond) \
      ->UseRealTime()                 \
      ->Repetitions(9)                \
      ->ReportAggregatesOnly(true)

TRACKING_BENCHMARK(BM_StartTracker);
TRACKING_BENCHMARK(BM_UpdateTracker);
TRACKING_BENCHMARK(BM_FullFrameLkBaseline);
TRACKING_BENCHMARK(BM_FrameAccuracy);
TRACKING_BENCHMARK(BM_Blur);

}  // namespace

int main(int argc, char** argv) {
  // The tracker logs every update; keep those lines off standard error
  // unless asked for (they are still formatted, as on a phone).
  setenv("OCRAR_LOG_LEVEL", "6", 0);
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv))
    return 1;
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  return 0;
}
