#include "inpainting/analysis/color_contrast.h"

#include <gtest/gtest.h>

#include <cmath>

#include <opencv2/core.hpp>

#include "common/log.h"

namespace {

using namespace ocr_inpainting;
using ocr::log::kDebug;

double Luminance(const cv::Scalar& color) {
  cv::Scalar linear;
  GetLinearRGBColor(color, linear);
  return GetEffectiveLuminance(linear);
}

TEST(SrgbTransfer, RoundTripsEveryEncodedValue) {
  for (double v = 0; v <= 255; v += 0.25)
    EXPECT_NEAR(SRGBConvert(SRGBReverseConvert(v)), v, 1e-9) << v;
}

TEST(SrgbTransfer, LinearSegmentEndsAt003928NotAt004045) {
  // 10.1 / 255 = 0.0396 lies between the two published thresholds.
  EXPECT_DOUBLE_EQ(SRGBReverseConvert(10.1), std::pow(10.1 / (255 * 1.055) + 0.055 / 1.055, 2.4));
  EXPECT_DOUBLE_EQ(SRGBReverseConvert(10.0), 10.0 / (255 * 12.92));
  EXPECT_DOUBLE_EQ(SRGBReverseConvert(255), 1.0);
  // Encoding neither rounds nor clamps.
  EXPECT_GT(SRGBConvert(1.2), 255.0);
}

TEST(ContrastRatio, WhiteOnBlackIs21EitherWay) {
  EXPECT_DOUBLE_EQ(GetContrastRatio(1.0, 0.0), 21.0);
  EXPECT_DOUBLE_EQ(GetContrastRatio(0.0, 1.0), 21.0);
  EXPECT_NEAR(Luminance(cv::Scalar(255, 255, 255)), 1.0, 1e-12);
}

TEST(RgbColorEnhance, EachChannelTestUsesTheScaleInForce) {
  ocr::log::ScopedCapture capture;
  cv::Scalar linear(0.4, 0.8, 0.1);
  RGBColorEnhance(linear, 3.0);  // R limits to 2.5, then G to 1.25
  EXPECT_DOUBLE_EQ(linear[0], 0.5);
  EXPECT_DOUBLE_EQ(linear[1], 1.0);
  EXPECT_DOUBLE_EQ(linear[2], 0.125);
  EXPECT_TRUE(capture.Contains("RGB enhanced color = (0.5000,1.0000,0.1250)", kDebug));

  cv::Scalar with_zero(0.0, 0.25, 0.0);  // a zero channel never limits
  RGBColorEnhance(with_zero, 2.0);
  EXPECT_EQ(with_zero, cv::Scalar(0.0, 0.5, 0.0));
}

TEST(ColorSpaces, HlsLightnessStaysOn0To255AndLabRoundTrips) {
  cv::Scalar hls;
  Rgb2Hsl(cv::Scalar(200, 100, 50), &hls);
  EXPECT_FLOAT_EQ(hls[1], 125.0f);

  const cv::Scalar white_lab = GetLabColor(cv::Scalar(255, 255, 255));
  EXPECT_NEAR(white_lab[0], 100.0, 0.5);
  EXPECT_NEAR(white_lab[1], 0.0, 0.5);
  cv::RNG rng(7);
  for (int i = 0; i < 50; ++i) {
    const cv::Scalar color(rng.uniform(0, 256), rng.uniform(0, 256), rng.uniform(0, 256));
    cv::Scalar back;
    GetRgbColor(GetLabColor(color), &back);
    for (int c = 0; c < 3; ++c)
      EXPECT_NEAR(back[c], color[c], 1.0) << color;
  }
}

struct Refusal {
  cv::Scalar background;
  cv::Scalar text;
  const char* log;
};

TEST(ForceColorContrast, LeavesColourWhenContrastSufficientUndecidableOrBlack) {
  const Refusal cases[] = {
      {{0, 0, 0}, {255, 255, 255}, "ForceColorContrast - Existing color contrast = 21.00"},
      {{120, 60, 30},
       {120, 60, 30},
       "ForceColorContrast - contrast is too low to detect the right enhancement direction"},
      // Ratio 2.95 against a luminance of 0.0015.
      {{90, 90, 90}, {5, 5, 5}, "ForceColorContrast - color is already black"},
  };
  for (const Refusal& c : cases) {
    ocr::log::ScopedCapture capture;
    cv::Scalar color = c.text;
    EXPECT_TRUE(ForceColorContrast(c.background, &color));
    EXPECT_EQ(color, c.text);
    EXPECT_TRUE(capture.Contains(c.log, kDebug)) << c.log;
  }
}

TEST(ForceColorContrast, DarkensGreyTextOnLightBackgroundDampedByLightness) {
  ocr::log::ScopedCapture capture;
  const cv::Scalar background(200, 200, 200);
  cv::Scalar color(110, 110, 110);  // ratio about 2.9
  EXPECT_FALSE(ForceColorContrast(background, &color));

  const double lb = Luminance(background);
  const double lc = Luminance(cv::Scalar(110, 110, 110));
  const double factor = ((lb + 0.05) / 4.5 - 0.05) / lc;
  const double corrected = (factor - 1) * (1 - 110 * 0.7 / 255) + 1;
  const double expected = SRGBConvert(SRGBReverseConvert(110) * corrected);
  for (int c = 0; c < 3; ++c)
    EXPECT_NEAR(color[c], expected, 1e-9);
  EXPECT_LT(color[0], 110);
  // Damped, so the target ratio is not reached in one pass.
  EXPECT_LT(GetContrastRatio(lb, Luminance(color)), 4.5);
  char line[160];
  std::snprintf(line, sizeof line,
                "ForceColorContrast - enhancement in RGB linear space: original = %.2f, corrected "
                "= %.2f, sat = 110.00",
                factor, corrected);
  EXPECT_TRUE(capture.Contains(line, kDebug));
}

TEST(ForceColorContrast, MidDarkBackgroundAimsAt001Plus0003OverLb) {
  const cv::Scalar background(128, 128, 128);  // luminance 0.216 < 4.5 * 0.06
  cv::Scalar color(70, 70, 70);
  const double lb = Luminance(background);
  const double lc = Luminance(color);
  const double corrected = ((0.01 + 0.003 / lb) / lc - 1) * (1 - 70 * 0.7 / 255) + 1;
  EXPECT_FALSE(ForceColorContrast(background, &color));
  EXPECT_NEAR(Luminance(color), lc * corrected, 1e-9);
}

TEST(ForceColorContrast, BrighteningStopsAtASaturatedChannelWithoutSecondPass) {
  const cv::Scalar background(60, 60, 60);
  cv::Scalar color(255, 100, 100);  // ratio about 3.8, red already at 1.0
  EXPECT_FALSE(ForceColorContrast(background, &color));
  EXPECT_DOUBLE_EQ(color[0], 255.0);
  EXPECT_NEAR(color[1], 100.0, 1e-9);
  EXPECT_LT(GetContrastRatio(Luminance(background), Luminance(color)), 4.5);
}

}  // namespace
