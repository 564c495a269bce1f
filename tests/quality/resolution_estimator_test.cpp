#include "quality/resolution/resolution_estimator.h"

#include <gtest/gtest.h>

#include <cmath>
#include <string>
#include <vector>

#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "dead_leaves.h"
#include "quality/resolution/radial_spectrum.h"

namespace image_resolution {
namespace {

using resolution_testing::DeadLeaves;
using resolution_testing::Enlarged;

const cv::Size kHd(1280, 720);

double Estimate(const cv::Mat& frame) {
  return EstimateResolution(&frame);
}

cv::Mat Blurred(const cv::Mat& frame, double sigma) {
  cv::Mat blurred;
  cv::GaussianBlur(frame, blurred, cv::Size(), sigma);
  return blurred;
}

TEST(ResolutionEstimator, SharpTextureReadsFullResolution) {
  for (uint64_t seed : {1, 2, 3})
    EXPECT_GE(Estimate(DeadLeaves(kHd, seed)), 0.95) << "seed " << seed;
  EXPECT_GT(Estimate(DeadLeaves(cv::Size(96, 96), 11)), 0.9) << "smallest accepted frame";
}

// Enlarging by s leaves detail up to 1/s of the Nyquist limit. With bicubic
// enlargement the estimate reads 0.46..0.50 at s = 2 and 0.27..0.29 at s = 4
// over seeds and frame sizes from 640×480 to 1920×1080 (the ring medians blur
// the edge of the square pass band by some 8 %); a quarter either way still
// tells the three apart with room to spare.
TEST(ResolutionEstimator, EnlargedFramesReadTheReciprocalOfTheirScale) {
  const cv::Mat sharp = DeadLeaves(kHd, 5);
  const double half = Estimate(Enlarged(sharp, 2.0));
  const double quarter = Estimate(Enlarged(sharp, 4.0));
  const double eighth = Estimate(Enlarged(sharp, 8.0));
  EXPECT_NEAR(half, 0.5, 0.5 * 0.25);
  EXPECT_NEAR(quarter, 0.25, 0.25 * 0.25);
  EXPECT_GT(Estimate(sharp), half);
  EXPECT_GT(half, quarter);
  EXPECT_GT(quarter, eighth);
  EXPECT_GT(eighth, 0.0);
}

TEST(ResolutionEstimator, GaussianBlurLowersTheEstimateStepByStep) {
  const cv::Mat sharp = DeadLeaves(kHd, 6);
  double previous = Estimate(sharp);
  for (double sigma : {0.7, 1.0, 2.0, 4.0}) {
    const double blurred = Estimate(Blurred(sharp, sigma));
    EXPECT_LT(blurred, previous) << "sigma " << sigma;
    previous = blurred;
  }
  // The -10 dB point of a Gaussian of sigma 2 px lies at 0.24 of Nyquist.
  EXPECT_NEAR(Estimate(Blurred(sharp, 2.0)), 0.24, 0.24 * 0.25);
}

TEST(ResolutionEstimator, RgbaRgbGreyAndARegionOfOneFrameAgree) {
  // A host may pass a submatrix: rows are then not contiguous.
  const cv::Mat rgba =
      Blurred(DeadLeaves(cv::Size(1600, 900), 4), 1.5)(cv::Rect(130, 70, 1280, 720));
  ASSERT_FALSE(rgba.isContinuous());
  cv::Mat rgb, grey;
  cv::cvtColor(rgba, rgb, cv::COLOR_RGBA2RGB);
  cv::cvtColor(rgba, grey, cv::COLOR_RGBA2GRAY);
  const double expected = Estimate(grey);
  EXPECT_GT(expected, 0.0);
  EXPECT_LT(expected, 0.5);
  EXPECT_DOUBLE_EQ(Estimate(rgba), expected);
  EXPECT_DOUBLE_EQ(Estimate(rgba.clone()), expected);
  EXPECT_DOUBLE_EQ(Estimate(rgb), expected);
}

TEST(ResolutionEstimator, BlankGradientAndNoiseOnlyFramesHoldNoDetail) {
  EXPECT_EQ(Estimate(cv::Mat(kHd, CV_8UC4, cv::Scalar(90, 120, 200, 255))), kNoDetail);
  // Uneven lighting on a blank wall: a gradient, quantised to 8 bits.
  cv::Mat gradient(kHd, CV_8UC1);
  for (int y = 0; y < gradient.rows; ++y) {
    for (int x = 0; x < gradient.cols; ++x)
      gradient.at<uchar>(y, x) = cv::saturate_cast<uchar>(60 + x * 100.0 / kHd.width + y * 0.03);
  }
  EXPECT_EQ(Estimate(gradient), kNoDetail);
  // Sensor noise alone is no detail.
  cv::Mat noise(kHd, CV_32F);
  cv::RNG(7).fill(noise, cv::RNG::NORMAL, 128.0, 2.0);
  noise.convertTo(noise, CV_8U);
  EXPECT_EQ(Estimate(noise), kNoDetail);
  // Nor is loud white noise: far above the rounding, but no more in the
  // coarse band than in the finest.
  EXPECT_EQ(WindowCutoff(std::vector<float>(129, 50.0f)), kNoDetail);
}

TEST(ResolutionEstimator, MedianOfTheWindowsWithDetail) {
  EXPECT_DOUBLE_EQ(CombineWindowCutoffs({0, 0, 0, 0, 0, 0.3, 0.5, 0.7, 0.9}), 0.6);
  EXPECT_DOUBLE_EQ(CombineWindowCutoffs({0.9, 0.2, 0, 1, 0.4, 0, 0.3, 0, 0}), 0.4);
  EXPECT_DOUBLE_EQ(CombineWindowCutoffs({0, 0, 0, 0, 0, 0, 0, 0, 0}), kNoDetail);
}

// The noise floor constant rests on the profile's scale: white noise of
// variance s² reads s² ln 2 in every ring (the median of an exponential
// distribution). The end-to-end series do not see a scale error.
TEST(ResolutionEstimator, WhiteNoiseReadsItsVarianceTimesLn2InEveryRing) {
  const SpectrumPlan plan = MakeSpectrumPlan(240);
  cv::Mat window(240, 240, CV_32F);
  cv::RNG(1).fill(window, cv::RNG::NORMAL, 128.0, 10.0);
  window.convertTo(window, CV_8U);
  const std::vector<float> profile = RadialPowerProfile(window, plan);
  ASSERT_EQ(profile.size(), 121u);
  double log_sum = 0.0;
  for (int bin = 10; bin <= plan.bins; ++bin)
    log_sum += std::log(profile[bin]);
  // Variance 100 plus the rounding's 1/12.
  EXPECT_NEAR(std::exp(log_sum / (plan.bins - 9)), (100.0 + 1.0 / 12) * std::log(2.0), 5.0);
}

TEST(ResolutionEstimator, BadInputIsNotMeasuredAndSaysWhy) {
  const int three_d_sizes[] = {4, 200, 200};
  const std::string type_message = " (need 8-bit RGBA, RGB or grey)";
  const std::string size_message = " is too small (needs at least 96 pixels on each side)";
  const std::pair<cv::Mat, std::string> cases[] = {
      {cv::Mat(), "ImgResEstimate: empty image"},
      {cv::Mat(kHd, CV_16UC3), "ImgResEstimate: unsupported image type CV_16UC3" + type_message},
      {cv::Mat(kHd, CV_8UC2), "ImgResEstimate: unsupported image type CV_8UC2" + type_message},
      {cv::Mat(3, three_d_sizes, CV_8UC1),
       "ImgResEstimate: unsupported image with 3 dimensions (need 2)"},
      {cv::Mat(95, 400, CV_8UC4), "ImgResEstimate: image 400x95" + size_message},
  };
  for (const auto& [frame, message] : cases) {
    ocr::log::ScopedCapture log;
    EXPECT_EQ(Estimate(frame), kNotMeasured) << message;
    EXPECT_EQ(log.Texts(), std::vector<std::string>{message});
    EXPECT_TRUE(log.Contains(message, ocr::log::kError)) << message;
  }
  ocr::log::ScopedCapture log;
  EXPECT_EQ(EstimateResolution(nullptr), kNotMeasured);
  EXPECT_TRUE(log.Contains("ImgResEstimate: null image address", ocr::log::kError));
  EXPECT_EQ(log.Texts().size(), 1u);
}

}  // namespace
}  // namespace image_resolution
