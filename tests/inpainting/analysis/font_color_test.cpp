#include "inpainting/analysis/font_color.h"

#include <gtest/gtest.h>

#include <opencv2/core.hpp>

#include "common/log.h"
#include "inpainting/analysis/synthetic_patch.h"
#include "inpainting/analysis/text_mask.h"

namespace {

using namespace ocr_inpainting;
using ocr::log::kDebug;
using ocr::log::kError;
using ocr_testing::Background;
using ocr_testing::PatchSpec;

const cv::Scalar kBlack(0, 0, 0, 0);

TEST(GetWeightedMean, WeighsEachPixelBySumOfWeights) {
  cv::Mat src(1, 3, CV_8UC3);
  src.at<cv::Vec3b>(0) = {10, 20, 30};
  src.at<cv::Vec3b>(1) = {110, 120, 130};
  src.at<cv::Vec3b>(2) = {255, 255, 255};
  const cv::Mat weights = (cv::Mat_<uchar>(1, 3) << 1, 3, 0);
  const cv::Scalar mean = GetWeightedMean(src, weights);
  EXPECT_NEAR(mean[0], 85.0, 1e-4);
  EXPECT_NEAR(mean[1], 95.0, 1e-4);
  EXPECT_NEAR(mean[2], 105.0, 1e-4);
}

TEST(GetWeightedMean, RefusesBadInputWithBlackAndItsOwnMessage) {
  const cv::Mat rgb(4, 4, CV_8UC3, cv::Scalar::all(50));
  const cv::Mat ones(4, 4, CV_8UC1, cv::Scalar(1));
  struct Case {
    cv::Mat src, weights;
    const char* log;
  } cases[] = {
      {rgb, cv::Mat::zeros(4, 4, CV_8UC1), "GetWeightedMean: Weights sum to zero"},
      {cv::Mat(4, 4, CV_8UC1, cv::Scalar(9)), ones,
       "GetWeightedMean: Bad number of src channels: 1"},
      {rgb, cv::Mat(4, 4, CV_8UC3, cv::Scalar::all(1)),
       "GetWeightedMean: Bad number of weights channels: 3"},
      {rgb, cv::Mat(4, 5, CV_8UC1, cv::Scalar(1)),
       "GetWeightedMean: weights doesn't match dimensions of src"},
  };
  for (const Case& c : cases) {
    ocr::log::ScopedCapture capture;
    EXPECT_EQ(GetWeightedMean(c.src, c.weights), kBlack) << c.log;
    EXPECT_TRUE(capture.Contains(c.log)) << c.log;
  }
}

TEST(GetFontColor, EmptyPatchIsBlackWithBothErrorLines) {
  ocr::log::ScopedCapture capture;
  const cv::Mat empty;
  cv::Scalar color(1, 2, 3);
  EXPECT_EQ(GetFontColor(empty, empty, empty, empty, color), -1);
  EXPECT_EQ(color, kBlack);
  EXPECT_TRUE(
      capture.Contains("DetectTextColor was passed empty image; defaulting to black", kError));
  EXPECT_TRUE(
      capture.Contains(" Inpainting_Process: Error in DetectTextColor for Inpainting", kError));
}

TEST(GetFontColor, UnchangedFillGivesBlackNotACrash) {
  const cv::Mat patch(20, 40, CV_8UC3, cv::Scalar(90, 120, 200));
  const cv::Mat mask(20, 40, CV_8UC1, cv::Scalar(255));
  ocr::log::ScopedCapture capture;
  cv::Scalar color;
  EXPECT_EQ(GetFontColor(patch, mask, patch, mask, color), 0);
  EXPECT_EQ(color, kBlack);
  EXPECT_TRUE(capture.Contains("GetWeightedMean: Weights sum to zero"));
}

// Mask and fill as the pipeline makes them; the fill is the true background,
// so the measure sees exactly the drawn text.
cv::Scalar MeasureColor(const ocr_testing::SyntheticPatch& patch) {
  cv::Mat mask, font_mask;
  int vertical_partition = -1;
  GetMask(patch.rgb, mask, font_mask, vertical_partition);
  cv::Scalar color;
  EXPECT_EQ(GetFontColor(patch.rgb, mask, patch.background, font_mask, color), 0);
  return color;
}

TEST(GetFontColor, FindsDrawnColourOnFlatGradientAndTexturedBackgrounds) {
  PatchSpec dark, light, red, blue;
  light.text_color = {240, 240, 240};
  light.background_color = {30, 40, 50};
  red.text_color = {200, 30, 30};
  red.background = Background::kGradient;
  red.background_color = {250, 240, 200};
  blue.text_color = {30, 30, 160};
  blue.background = Background::kTexture;
  blue.background_color = {220, 210, 190};
  blue.background_color2 = {8, 8, 8};
  for (const PatchSpec& spec : {dark, light, red, blue}) {
    const cv::Scalar color = MeasureColor(ocr_testing::DrawTextPatch(spec));
    for (int c = 0; c < 3; ++c)
      EXPECT_NEAR(color[c], spec.text_color[c], 6.0) << spec.text_color << " -> " << color;
  }
}

TEST(GetFontColor, ShortPatchKeepsFullHeightAndWeakTextIsEnhanced) {
  PatchSpec spec;
  spec.size = {60, 6};
  spec.lines = {"-----"};
  spec.font_scale = 0.5;
  spec.thickness = 1;
  spec.text_color = {150, 150, 150};
  spec.background_color = {210, 210, 210};
  ocr::log::ScopedCapture capture;
  const cv::Scalar color = MeasureColor(ocr_testing::DrawTextPatch(spec));
  EXPECT_TRUE(capture.Contains("GetFontColor: x_margin=7 y_margin=0", kDebug));
  EXPECT_TRUE(capture.Contains("GetFontColor: text_roi: (7,0,46,6)", kDebug));
  EXPECT_EQ(capture.Count("DetectTextColor - Average color has sufficient contrast"), 0);
  EXPECT_LT(color[0], 150.0);
}

TEST(GetFontColor, EmptyFontMaskFallsBackToTheInpaintingMask) {
  PatchSpec spec;
  spec.text_color = {30, 60, 150};
  const auto patch = ocr_testing::DrawTextPatch(spec);
  cv::Mat mask, font_mask;
  int vertical_partition = -1;
  GetMask(patch.rgb, mask, font_mask, vertical_partition);
  cv::Scalar color;
  EXPECT_EQ(
      GetFontColor(patch.rgb, mask, patch.background, cv::Mat::zeros(mask.size(), CV_8UC1), color),
      0);
  for (int c = 0; c < 3; ++c)
    EXPECT_NEAR(color[c], spec.text_color[c], 12.0) << color;
}

TEST(DetectTextColor, BlackTextIsKeptAndReportedAsSufficient) {
  const cv::Mat image(4, 4, CV_8UC3, cv::Scalar(5, 5, 5));
  const cv::Mat weights(4, 4, CV_8UC1, cv::Scalar(255));
  ocr::log::ScopedCapture capture;
  cv::Scalar color;
  EXPECT_EQ(DetectTextColor(image, weights, cv::Scalar(90, 90, 90), &color), 0);
  EXPECT_NEAR(color[0], 5.0, 1e-4);
  EXPECT_TRUE(capture.Contains("ForceColorContrast - color is already black", kDebug));
  EXPECT_TRUE(capture.Contains("DetectTextColor - Average color has sufficient contrast", kDebug));
}

}  // namespace
