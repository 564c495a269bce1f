// Speed of the per-patch analysis on a typical line patch (capped at 240
// columns by the pipeline): the mask, and the colour given mask and fill.
#include <benchmark/benchmark.h>

#include <cstdlib>

#include "inpainting/analysis/font_color.h"
#include "inpainting/analysis/synthetic_patch.h"
#include "inpainting/analysis/text_mask.h"

namespace {

ocr_testing::SyntheticPatch LinePatch(int width) {
  ocr_testing::PatchSpec spec;
  spec.size = {width, width / 5};
  spec.lines = {"Exit 12 open"};
  spec.font_scale = width / 240.0;
  spec.background = ocr_testing::Background::kTexture;
  spec.background_color2 = cv::Scalar::all(6);
  return ocr_testing::DrawTextPatch(spec);
}

void BM_GetMask(benchmark::State& state) {
  setenv("OCRAR_LOG_LEVEL", "6", 0);
  const auto patch = LinePatch(static_cast<int>(state.range(0)));
  for (auto _ : state) {
    cv::Mat mask, font_mask;
    int vertical_partition = -1;
    ocr_inpainting::GetMask(patch.rgb, mask, font_mask, vertical_partition);
    benchmark::DoNotOptimize(mask.data);
  }
}
BENCHMARK(BM_GetMask)->Arg(120)->Arg(240)->Unit(benchmark::kMicrosecond);

void BM_GetFontColor(benchmark::State& state) {
  setenv("OCRAR_LOG_LEVEL", "6", 0);
  const auto patch = LinePatch(static_cast<int>(state.range(0)));
  cv::Mat mask, font_mask;
  int vertical_partition = -1;
  ocr_inpainting::GetMask(patch.rgb, mask, font_mask, vertical_partition);
  const cv::Mat filled = ocr_testing::TeleaFill(patch.rgb, mask);
  for (auto _ : state) {
    cv::Scalar color;
    ocr_inpainting::GetFontColor(patch.rgb, mask, filled, font_mask, color);
    benchmark::DoNotOptimize(color);
  }
}
BENCHMARK(BM_GetFontColor)->Arg(120)->Arg(240)->Unit(benchmark::kMicrosecond);

}  // namespace
