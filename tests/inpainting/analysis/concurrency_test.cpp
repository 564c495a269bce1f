#include <gtest/gtest.h>

#include <vector>

#include <tbb/parallel_for.h>
#include <opencv2/core.hpp>

#include "inpainting/analysis/font_color.h"
#include "inpainting/analysis/synthetic_patch.h"
#include "inpainting/analysis/text_mask.h"

namespace {

using namespace ocr_inpainting;

struct Analysis {
  cv::Mat mask, font_mask;
  int vertical_partition = -1;
  cv::Scalar color;
};

Analysis Analyse(const cv::Mat& patch) {
  Analysis a;
  GetMask(patch, a.mask, a.font_mask, a.vertical_partition);
  const cv::Mat filled = ocr_testing::TeleaFill(patch, a.mask);
  GetFontColor(patch, a.mask, filled, a.font_mask, a.color);
  return a;
}

TEST(AnalysisConcurrency, ParallelWorkersMatchTheSerialRun) {
  std::vector<cv::Mat> patches;
  for (const auto& spec : ocr_testing::VariedSpecs(48, 11))
    patches.push_back(ocr_testing::DrawTextPatch(spec).rgb);

  std::vector<Analysis> serial;
  for (const cv::Mat& patch : patches)
    serial.push_back(Analyse(patch));
  // Each patch twice, so that workers run the same inputs at the same time.
  std::vector<Analysis> parallel(2 * patches.size());
  tbb::parallel_for(size_t{0}, parallel.size(),
                    [&](size_t i) { parallel[i] = Analyse(patches[i % patches.size()]); });

  for (size_t i = 0; i < parallel.size(); ++i) {
    const Analysis& expected = serial[i % patches.size()];
    EXPECT_EQ(cv::norm(parallel[i].mask, expected.mask, cv::NORM_INF), 0) << i;
    EXPECT_EQ(cv::norm(parallel[i].font_mask, expected.font_mask, cv::NORM_INF), 0) << i;
    EXPECT_EQ(parallel[i].vertical_partition, expected.vertical_partition) << i;
    EXPECT_EQ(parallel[i].color, expected.color) << i;
  }
}

}  // namespace
