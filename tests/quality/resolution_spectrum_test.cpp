// The estimator's parts: window layout, the calibration of the radial
// spectrum, and the cut-off rule on profiles built by hand.
#include <gtest/gtest.h>

#include <cmath>
#include <vector>

#include <opencv2/core.hpp>

#include "quality/resolution/radial_spectrum.h"
#include "quality/resolution/spectral_cutoff.h"
#include "quality/resolution/window_grid.h"

namespace image_resolution {
namespace {

TEST(ResolutionWindowGrid, WindowSideFitsACellAndSuitsTheDft) {
  EXPECT_EQ(ChooseWindowSide(cv::Size(1280, 720)), 240);
  EXPECT_EQ(ChooseWindowSide(cv::Size(1920, 1080)), 256);  // capped
  EXPECT_EQ(ChooseWindowSide(cv::Size(720, 1280)), 240);   // portrait
  EXPECT_EQ(ChooseWindowSide(cv::Size(640, 480)), 160);
  EXPECT_EQ(ChooseWindowSide(cv::Size(400, 200)), 64);  // 66 is not 2^a 3^b 5^c
  EXPECT_EQ(ChooseWindowSide(cv::Size(96, 96)), 32);
  EXPECT_EQ(ChooseWindowSide(cv::Size(95, 4000)), 0);
}

TEST(ResolutionWindowGrid, NineDisjointWindowsCentredInTheirCells) {
  const WindowGrid windows = LayOutWindows(cv::Size(1280, 721), 240);
  EXPECT_EQ(windows[0], cv::Rect(93, 0, 240, 240));
  // Cells by integer division: x 0 | 426 | 853 | 1280, y 0 | 240 | 480 | 721.
  EXPECT_EQ(windows[4], cv::Rect(519, 240, 240, 240));
  EXPECT_EQ(windows[8], cv::Rect(946, 480, 240, 240));
  for (int i = 0; i < kWindowCount; ++i) {
    for (int j = 0; j < i; ++j)
      EXPECT_TRUE((windows[i] & windows[j]).empty()) << "windows " << j << " and " << i;
  }
}

// The noise floor constant rests on this: white noise of variance s² reads
// s² ln 2 in every ring (the median of an exponential distribution).
TEST(ResolutionSpectrum, WhiteNoiseReadsItsVarianceTimesLn2InEveryRing) {
  const SpectrumPlan plan = MakeSpectrumPlan(240);
  cv::Mat noise(240, 240, CV_32F);
  cv::RNG(1).fill(noise, cv::RNG::NORMAL, 128.0, 10.0);
  cv::Mat window;
  noise.convertTo(window, CV_8U);
  const std::vector<float> profile = RadialPowerProfile(window, plan);
  ASSERT_EQ(profile.size(), 121u);
  double log_sum = 0.0;
  for (int bin = 10; bin <= plan.bins; ++bin)
    log_sum += std::log(profile[bin]);
  // Variance 100 plus the rounding's 1/12.
  EXPECT_NEAR(std::exp(log_sum / (plan.bins - 9)), (100.0 + 1.0 / 12) * std::log(2.0), 5.0);
}

TEST(ResolutionSpectrum, GradientAndFlatWindowsStayAtTheRoundingFloor) {
  const SpectrumPlan plan = MakeSpectrumPlan(128);
  cv::Mat gradient(128, 128, CV_8UC1);
  for (int y = 0; y < 128; ++y) {
    for (int x = 0; x < 128; ++x)
      gradient.at<uchar>(y, x) = cv::saturate_cast<uchar>(20 + 1.5 * x + 0.4 * y);
  }
  // The plane is removed; what is left is the rounding of its values (and,
  // in the lowest rings, which the cut-off does not read, the taper's leak).
  const std::vector<float> sloped = RadialPowerProfile(gradient, plan);
  for (int bin = 3; bin <= plan.bins; ++bin)
    EXPECT_LT(sloped[bin], kNoiseFloorMargin * kRoundingNoiseMedian) << "ring " << bin;
  for (float power : RadialPowerProfile(cv::Mat(128, 128, CV_8UC1, cv::Scalar(77)), plan))
    EXPECT_LT(power, 1e-6f);
}

// A profile that falls as 1/f² (flat once whitened) up to bin `edge` and
// `drop` (a power ratio) lower from there on.
std::vector<float> NaturalProfile(int bins, int edge, double drop, double level = 1e4) {
  std::vector<float> profile(bins + 1, 0.0f);
  for (int bin = 1; bin <= bins; ++bin) {
    const double f = static_cast<double>(bin) / bins;
    profile[bin] = static_cast<float>(level / (f * f) * (bin >= edge ? drop : 1.0));
  }
  return profile;
}

TEST(ResolutionCutoff, FlatWhitenedSpectrumReadsOne) {
  EXPECT_EQ(WindowCutoff(NaturalProfile(128, 129, 1.0)), 1.0);
}

TEST(ResolutionCutoff, StepDownIsFoundAtItsFrequency) {
  // Smoothing over two bins each side moves the -10 dB crossing of a -30 dB
  // step one bin early; interpolation puts it within a bin of the step.
  EXPECT_NEAR(WindowCutoff(NaturalProfile(128, 65, 1e-3)), 64.0 / 128, 1.0 / 128);
  EXPECT_NEAR(WindowCutoff(NaturalProfile(128, 33, 1e-3)), 32.0 / 128, 1.0 / 128);
  // A drop of less than 10 dB is not a cut-off.
  EXPECT_EQ(WindowCutoff(NaturalProfile(128, 65, 0.2)), 1.0);
}

TEST(ResolutionCutoff, SpectrumSinkingToTheNoiseFloorEndsTheDetail) {
  // Weak content: the whitened level never drops, but above bin 24 the
  // power is below four times the rounding noise.
  std::vector<float> profile = NaturalProfile(128, 129, 1.0, 0.0);
  for (int bin = 1; bin <= 128; ++bin) {
    const double f = bin / 128.0;
    profile[bin] = static_cast<float>(std::max(
        kRoundingNoiseMedian, kNoiseFloorMargin * kRoundingNoiseMedian * 0.0144 / (f * f)));
  }
  // 4 × floor × (0.12 / f)² meets 4 × floor at f = 0.12.
  EXPECT_NEAR(WindowCutoff(profile), 0.12, 2.0 / 128);
}

TEST(ResolutionCutoff, NoDetailWhenTheCoarseBandDoesNotRise) {
  std::vector<float> rounding(129, static_cast<float>(kRoundingNoiseMedian));
  EXPECT_EQ(WindowCutoff(rounding), kNoDetail);
  // Loud white noise: far above the rounding, but no more in the coarse
  // band than in the finest.
  std::vector<float> white(129, 50.0f);
  EXPECT_EQ(WindowCutoff(white), kNoDetail);
}

}  // namespace
}  // namespace image_resolution
