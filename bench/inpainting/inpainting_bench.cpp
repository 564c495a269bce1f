// Speed of the inpainting request (10 text lines on a 1280x720 frame, through
// the bridge's C++ core) against the Otsu + full-resolution Telea baseline in
// the same run, and of the colour statistics request on 20 rectangles.
// Prints the ratio of the medians when run with repetitions, e.g.
//   inpainting_bench --benchmark_repetitions=15 --benchmark_report_aggregates_only=true

#include <benchmark/benchmark.h>
#include <tbb/task_arena.h>

#include <cstdio>
#include <map>
#include <string>
#include <vector>

#include <opencv2/imgproc.hpp>

#include "inpainting/driver/color_statistics.h"
#include "inpainting/driver/inpainting_request.h"
#include "otsu_telea_baseline.h"
#include "text_scene_support.h"

namespace {

const ocr_testing::TextScene& RequestScene() {
  static const ocr_testing::TextScene scene =
      ocr_testing::MakeRandomTextScene(ocr_testing::Background::kPhoto, {1280, 720}, 10, 2024);
  return scene;
}

void BM_InpaintingRequest10Lines(benchmark::State& state) {
  const ocr_testing::TextScene& scene = RequestScene();
  std::vector<cv::Mat> overlays(scene.rects.size());
  std::vector<cv::Mat*> outputs;
  for (cv::Mat& overlay : overlays)
    outputs.push_back(&overlay);
  std::vector<int32_t> colors;
  for (auto _ : state) {
    const int status =
        ocr_inpainting::AnswerInpaintingRequest(scene.frame, scene.values, outputs, colors);
    benchmark::DoNotOptimize(status);
  }
}
BENCHMARK(BM_InpaintingRequest10Lines)->Unit(benchmark::kMillisecond)->UseRealTime();

// The same request with TBB held to the calling thread, to separate the
// pipeline's own cost from what the parallel loops gain.
void BM_InpaintingRequest10LinesOneThread(benchmark::State& state) {
  tbb::task_arena one_thread(1);
  one_thread.execute([&] { BM_InpaintingRequest10Lines(state); });
}
BENCHMARK(BM_InpaintingRequest10LinesOneThread)->Unit(benchmark::kMillisecond)->UseRealTime();

void BM_OtsuTeleaBaseline10Lines(benchmark::State& state) {
  const ocr_testing::TextScene& scene = RequestScene();
  for (auto _ : state) {
    ocr_bench::BaselineResult result = ocr_bench::OtsuTeleaBaseline(scene.frame, scene.rects);
    benchmark::DoNotOptimize(result.frame.data);
  }
}
BENCHMARK(BM_OtsuTeleaBaseline10Lines)->Unit(benchmark::kMillisecond)->UseRealTime();

void BM_CalculateMeansStdDevs20Rects(benchmark::State& state) {
  // The host passes a half-resolution frame with full-resolution rectangles.
  static const ocr_testing::TextScene scene =
      ocr_testing::MakeRandomTextScene(ocr_testing::Background::kTexture, {1280, 720}, 20, 77);
  cv::Mat half;
  cv::resize(scene.frame, half, cv::Size(640, 360), 0, 0, cv::INTER_AREA);
  std::vector<double> means(20 * 3);
  std::vector<double> deviations(20 * 3);
  for (auto _ : state) {
    const int status = ocr_inpainting::CalculateRectMeansStdDevs(
        half, scene.values.data(), scene.values.size(), means.data(), means.size(),
        deviations.data(), deviations.size());
    benchmark::DoNotOptimize(status);
  }
}
BENCHMARK(BM_CalculateMeansStdDevs20Rects)->Unit(benchmark::kMicrosecond)->UseRealTime();

// Console output (without colour codes) plus the medians, for the ratios
// printed at the end.
class MedianReporter : public benchmark::ConsoleReporter {
 public:
  MedianReporter() : ConsoleReporter(OO_Tabular) {}

  void ReportRuns(const std::vector<Run>& runs) override {
    for (const Run& run : runs) {
      if (run.aggregate_name == "median")
        medians_[run.run_name.function_name] = run.GetAdjustedRealTime();
    }
    ConsoleReporter::ReportRuns(runs);
  }
  void PrintRatio(const std::string& numerator, const std::string& denominator) const {
    const auto n = medians_.find(numerator);
    const auto d = medians_.find(denominator);
    if (n != medians_.end() && d != medians_.end() && d->second > 0)
      std::printf("median %s / %s = %.3f\n", numerator.c_str(), denominator.c_str(),
                  n->second / d->second);
  }

 private:
  std::map<std::string, double> medians_;
};

}  // namespace

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv))
    return 1;
  MedianReporter reporter;
  benchmark::RunSpecifiedBenchmarks(&reporter);
  reporter.PrintRatio("BM_InpaintingRequest10Lines", "BM_OtsuTeleaBaseline10Lines");
  reporter.PrintRatio("BM_InpaintingRequest10LinesOneThread", "BM_OtsuTeleaBaseline10Lines");
  benchmark::Shutdown();
  return 0;
}
