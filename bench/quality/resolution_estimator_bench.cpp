// Speed of the resolution estimator on camera-sized frames, and the values it
// reads for a scale series and a defocus series of one sharp frame (reported
// as the "estimate" counter beside each timing).
#include <benchmark/benchmark.h>

#include <cmath>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "dead_leaves.h"
#include "quality/resolution/radial_spectrum.h"
#include "quality/resolution/resolution_estimator.h"

namespace {

using resolution_testing::DeadLeaves;
using resolution_testing::Enlarged;

const cv::Size kFrameSizes[] = {{1280, 720}, {1920, 1080}};

void BM_EstimateResolution(benchmark::State& state) {
  const cv::Mat frame = DeadLeaves(kFrameSizes[state.range(0)], 1);
  double estimate = 0.0;
  for (auto _ : state) {
    estimate = image_resolution::EstimateResolution(&frame);
    benchmark::DoNotOptimize(estimate);
  }
  state.SetLabel(std::to_string(frame.cols) + "x" + std::to_string(frame.rows) + " RGBA");
  state.counters["estimate"] = estimate;
}
BENCHMARK(BM_EstimateResolution)
    ->Arg(0)
    ->Arg(1)
    ->Unit(benchmark::kMillisecond)
    ->Repetitions(9)
    ->ReportAggregatesOnly(true);

// One window's share of the work on one thread: spectrum and ring medians.
void BM_RadialPowerProfile(benchmark::State& state) {
  const int side = static_cast<int>(state.range(0));
  cv::Mat grey;
  cv::cvtColor(DeadLeaves(cv::Size(side, side), 2), grey, cv::COLOR_RGBA2GRAY);
  const image_resolution::SpectrumPlan plan = image_resolution::MakeSpectrumPlan(side);
  for (auto _ : state)
    benchmark::DoNotOptimize(image_resolution::RadialPowerProfile(grey, plan));
}
BENCHMARK(BM_RadialPowerProfile)->Arg(240)->Arg(256)->Unit(benchmark::kMicrosecond);

// Shrunk by 2^range and enlarged back (bicubic, as a digital zoom).
void BM_ScaleSeries(benchmark::State& state) {
  const cv::Mat sharp = DeadLeaves(kFrameSizes[0], 3);
  const double factor = std::pow(2.0, static_cast<double>(state.range(0)));
  const cv::Mat frame = factor > 1.0 ? Enlarged(sharp, factor) : sharp;
  double estimate = 0.0;
  for (auto _ : state)
    benchmark::DoNotOptimize(estimate = image_resolution::EstimateResolution(&frame));
  state.counters["scale"] = 1.0 / factor;
  state.counters["estimate"] = estimate;
}
BENCHMARK(BM_ScaleSeries)->DenseRange(0, 3)->Unit(benchmark::kMillisecond);

// Gaussian defocus of sigma = range / 10 px.
void BM_BlurSeries(benchmark::State& state) {
  const double sigma = static_cast<double>(state.range(0)) / 10.0;
  cv::Mat frame;
  cv::GaussianBlur(DeadLeaves(kFrameSizes[0], 3), frame, cv::Size(), sigma);
  double estimate = 0.0;
  for (auto _ : state)
    benchmark::DoNotOptimize(estimate = image_resolution::EstimateResolution(&frame));
  state.counters["sigma"] = sigma;
  state.counters["estimate"] = estimate;
}
BENCHMARK(BM_BlurSeries)
    ->Arg(5)
    ->Arg(7)
    ->Arg(10)
    ->Arg(15)
    ->Arg(20)
    ->Arg(30)
    ->Arg(40)
    ->Unit(benchmark::kMillisecond);

}  // namespace
