#include <gtest/gtest.h>

#include <cmath>

#include <opencv2/core.hpp>

#include "common/log.h"
#include "inpainting/analysis/color_contrast.h"
#include "inpainting/analysis/font_color.h"

namespace {

using namespace ocr_inpainting;
using ocr::log::kDebug;
using ocr::log::kError;

const cv::Scalar kBlack(0, 0, 0, 0);

double Luminance(const cv::Scalar& color) {
  cv::Scalar linear;
  GetLinearRGBColor(color, linear);
  return GetEffectiveLuminance(linear);
}

TEST(ColorContrast, SrgbTransferAndContrastRatio) {
  for (double v = 0; v <= 255; v += 0.25)
    EXPECT_NEAR(SRGBConvert(SRGBReverseConvert(v)), v, 1e-9) << v;
  // The linear segment ends at 0.03928, not 0.04045: 10.1 / 255 = 0.0396
  // lies between the two published thresholds.
  EXPECT_DOUBLE_EQ(SRGBReverseConvert(10.1), std::pow(10.1 / (255 * 1.055) + 0.055 / 1.055, 2.4));
  EXPECT_DOUBLE_EQ(SRGBReverseConvert(10.0), 10.0 / (255 * 12.92));
  // Encoding neither rounds nor clamps.
  EXPECT_GT(SRGBConvert(1.2), 255.0);

  EXPECT_NEAR(Luminance(cv::Scalar(255, 255, 255)), 1.0, 1e-12);
  EXPECT_DOUBLE_EQ(GetContrastRatio(1.0, 0.0), 21.0);
  EXPECT_DOUBLE_EQ(GetContrastRatio(0.0, 1.0), 21.0);
}

TEST(ForceColorContrast, LeavesColourWhenContrastSufficientUndecidableOrBlack) {
  const struct {
    cv::Scalar background, text;
    const char* log;
  } cases[] = {
      {{0, 0, 0}, {255, 255, 255}, "ForceColorContrast - Existing color contrast = 21.00"},
      {{120, 60, 30},
       {120, 60, 30},
       "ForceColorContrast - contrast is too low to detect the right enhancement direction"},
      // Ratio 2.95 against a luminance of 0.0015.
      {{90, 90, 90}, {5, 5, 5}, "ForceColorContrast - color is already black"},
  };
  for (const auto& c : cases) {
    ocr::log::ScopedCapture capture;
    cv::Scalar color = c.text;
    EXPECT_TRUE(ForceColorContrast(c.background, &color));
    EXPECT_EQ(color, c.text);
    EXPECT_TRUE(capture.Contains(c.log, kDebug)) << c.log;
  }
}

TEST(ForceColorContrast, MovesWeakTextTowardsTheTargetDampedByLightness) {
  // Grey text on grey, darkened or brightened towards ratio 4.5; on a
  // background too dark for that ratio (luminance under 4.5 x 0.06) dark
  // text aims at 0.01 + 0.003 / Lb instead.
  for (const auto& [background, text] :
       {std::pair{200.0, 110.0}, std::pair{128.0, 70.0}, std::pair{60.0, 110.0}}) {
    const double lb = Luminance(cv::Scalar::all(background));
    const double lc = Luminance(cv::Scalar::all(text));
    const double target = lc > lb            ? (lb + 0.05) * 4.5 - 0.05
                          : lb >= 4.5 * 0.06 ? (lb + 0.05) / 4.5 - 0.05
                                             : 0.01 + 0.003 / lb;
    const double corrected = (target / lc - 1) * (1 - text * 0.7 / 255) + 1;
    cv::Scalar color = cv::Scalar::all(text);
    EXPECT_FALSE(ForceColorContrast(cv::Scalar::all(background), &color));
    for (int c = 0; c < 3; ++c)
      EXPECT_NEAR(color[c], SRGBConvert(SRGBReverseConvert(text) * corrected), 1e-9);
    EXPECT_EQ(color[0] > text, lc > lb);
    // Damped, so the target ratio is not reached in one pass.
    EXPECT_LT(GetContrastRatio(lb, Luminance(color)), 4.5);
  }
}

TEST(RGBColorEnhance, ScalesUniformlySoTheFirstChannelAtOneLimitsAll) {
  // The hue is kept: no channel outgrows the others.
  cv::Scalar linear(0.9, 0.5, 0.1);
  RGBColorEnhance(linear, 3.0);
  EXPECT_DOUBLE_EQ(linear[0], 1.0);
  EXPECT_DOUBLE_EQ(linear[1], 0.5 / 0.9);
  EXPECT_DOUBLE_EQ(linear[2], 0.1 / 0.9);
}

TEST(GetWeightedMean, RefusesBadInputWithBlackAndItsOwnMessage) {
  const cv::Mat rgb(4, 4, CV_8UC3, cv::Scalar::all(50));
  const cv::Mat ones(4, 4, CV_8UC1, cv::Scalar(1));
  const struct {
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
  for (const auto& c : cases) {
    ocr::log::ScopedCapture capture;
    EXPECT_EQ(GetWeightedMean(c.src, c.weights), kBlack) << c.log;
    EXPECT_TRUE(capture.Contains(c.log, kError)) << c.log;
  }
}

TEST(GetFontColor, EmptyPatchOrUnchangedFillGiveBlack) {
  ocr::log::ScopedCapture capture;
  const cv::Mat empty;
  cv::Scalar color(1, 2, 3);
  EXPECT_EQ(GetFontColor(empty, empty, empty, empty, color), -1);
  EXPECT_EQ(color, kBlack);
  EXPECT_TRUE(
      capture.Contains("DetectTextColor was passed empty image; defaulting to black", kError));
  EXPECT_TRUE(
      capture.Contains(" Inpainting_Process: Error in DetectTextColor for Inpainting", kError));

  // A fill that changed nothing leaves no weights: black, not a crash.
  capture.Clear();
  const cv::Mat patch(20, 40, CV_8UC3, cv::Scalar(90, 120, 200));
  const cv::Mat mask(20, 40, CV_8UC1, cv::Scalar(255));
  EXPECT_EQ(GetFontColor(patch, mask, patch, mask, color), 0);
  EXPECT_EQ(color, kBlack);
  EXPECT_TRUE(capture.Contains("GetWeightedMean: Weights sum to zero", kError));
}

}  // namespace
