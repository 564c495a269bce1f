#include "quality/resolution/resolution_estimator.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <string>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"

namespace image_resolution {
namespace {

// A "dead leaves" texture: overlapping discs of random grey or colour with
// radii distributed as r^-3, drawn without anti-aliasing. Its power spectrum
// falls about as 1/f² like a natural scene's, with detail up to the pixel grid.
cv::Mat DeadLeaves(cv::Size size, uint64_t seed, int type = CV_8UC4) {
  cv::RNG rng(seed);
  cv::Mat image(size, type, cv::Scalar(128, 128, 128, 255));
  const double inv_min2 = 1.0 / (2.0 * 2.0);
  const double max_radius = std::min(size.width, size.height) / 8.0;
  const double inv_max2 = 1.0 / (max_radius * max_radius);
  for (int i = 0; i < size.area() / 30; ++i) {
    const double radius = 1.0 / std::sqrt(inv_min2 - rng.uniform(0.0, 1.0) * (inv_min2 - inv_max2));
    const cv::Point centre(rng.uniform(0, size.width), rng.uniform(0, size.height));
    const cv::Scalar colour(rng.uniform(0, 256), rng.uniform(0, 256), rng.uniform(0, 256), 255);
    cv::circle(image, centre, static_cast<int>(std::lround(radius)), colour, cv::FILLED,
               cv::LINE_8);
  }
  return image;
}

// The frame shrunk by `factor` and enlarged back, as a digital zoom does.
cv::Mat Enlarged(const cv::Mat& frame, double factor) {
  cv::Mat small, large;
  cv::resize(frame, small, cv::Size(), 1.0 / factor, 1.0 / factor, cv::INTER_AREA);
  cv::resize(small, large, frame.size(), 0, 0, cv::INTER_CUBIC);
  return large;
}

cv::Mat Blurred(const cv::Mat& frame, double sigma) {
  cv::Mat blurred;
  cv::GaussianBlur(frame, blurred, cv::Size(), sigma);
  return blurred;
}

double Estimate(const cv::Mat& frame) {
  return EstimateResolution(&frame);
}

const cv::Size kHd(1280, 720);

TEST(ResolutionEstimator, SharpTextureReadsFullResolution) {
  for (uint64_t seed : {1, 2, 3})
    EXPECT_GE(Estimate(DeadLeaves(kHd, seed)), 0.95) << "seed " << seed;
}

TEST(ResolutionEstimator, RgbaRgbAndGreyOfOneFrameAgree) {
  const cv::Mat rgba = Blurred(DeadLeaves(kHd, 4), 1.5);
  cv::Mat rgb, grey;
  cv::cvtColor(rgba, rgb, cv::COLOR_RGBA2RGB);
  cv::cvtColor(rgba, grey, cv::COLOR_RGBA2GRAY);
  const double expected = Estimate(grey);
  EXPECT_GT(expected, 0.0);
  EXPECT_LT(expected, 0.5);
  EXPECT_DOUBLE_EQ(Estimate(rgba), expected);
  EXPECT_DOUBLE_EQ(Estimate(rgb), expected);
}

// Enlarging by s leaves detail up to 1/s of the Nyquist limit. Where the
// estimate lands around 1/s depends on the interpolator's response near the
// old limit: with bicubic enlargement it reads 0.46..0.50 at s = 2 and
// 0.27..0.29 at s = 4 over seeds and frame sizes from 640×480 to 1920×1080
// (the ring medians blur the edge of the square pass band by some 8 %).
// A quarter either way still tells the three apart with room to spare.
TEST(ResolutionEstimator, EnlargedFramesReadTheReciprocalOfTheirScale) {
  const cv::Mat sharp = DeadLeaves(kHd, 5);
  const double full = Estimate(sharp);
  const double half = Estimate(Enlarged(sharp, 2.0));
  const double quarter = Estimate(Enlarged(sharp, 4.0));
  const double eighth = Estimate(Enlarged(sharp, 8.0));
  EXPECT_NEAR(half, 0.5, 0.5 * 0.25);
  EXPECT_NEAR(quarter, 0.25, 0.25 * 0.25);
  EXPECT_GT(full, half);
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

TEST(ResolutionEstimator, BlankGradientAndNoiseOnlyFramesHoldNoDetail) {
  const cv::Mat flat(kHd, CV_8UC4, cv::Scalar(90, 120, 200, 255));
  EXPECT_EQ(Estimate(flat), kNoDetail);

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
  cv::Mat noisy_wall;
  noise.convertTo(noisy_wall, CV_8U);
  EXPECT_EQ(Estimate(noisy_wall), kNoDetail);
}

TEST(ResolutionEstimator, FlatWindowsDoNotDecide) {
  // Four of the nine windows see a blank wall, one a blurred patch.
  cv::Mat frame = DeadLeaves(kHd, 8);
  const int cell_w = kHd.width / 3, cell_h = kHd.height / 3;
  frame(cv::Rect(0, 0, 2 * cell_w, 2 * cell_h)).setTo(cv::Scalar(200, 200, 200, 255));
  cv::Mat corner =
      frame(cv::Rect(2 * cell_w, 2 * cell_h, kHd.width - 2 * cell_w, kHd.height - 2 * cell_h));
  Blurred(corner, 3.0).copyTo(corner);
  EXPECT_GE(Estimate(frame), 0.95);
}

TEST(ResolutionEstimator, CombinesTheMedianOfWindowsWithDetail) {
  EXPECT_DOUBLE_EQ(CombineWindowCutoffs({0, 0, 0, 0, 0, 0.3, 0.5, 0.7, 0.9}), 0.6);
  EXPECT_DOUBLE_EQ(CombineWindowCutoffs({0.9, 0.2, 0, 1, 0.4, 0, 0.3, 0, 0}), 0.4);
  EXPECT_DOUBLE_EQ(CombineWindowCutoffs({0, 0, 0, 0, 0, 0, 0, 0, 0}), kNoDetail);
}

TEST(ResolutionEstimator, RegionOfALargerFrameReadsLikeItsCopy) {
  // A host may pass a submatrix: rows are then not contiguous.
  const cv::Mat frame = Blurred(DeadLeaves(cv::Size(1600, 900), 9), 1.2);
  const cv::Mat region = frame(cv::Rect(130, 70, 1280, 720));
  ASSERT_FALSE(region.isContinuous());
  EXPECT_DOUBLE_EQ(Estimate(region), Estimate(region.clone()));
}

TEST(ResolutionEstimator, LogsOneSummaryLinePerCall) {
  const cv::Mat frame = DeadLeaves(kHd, 10);
  ocr::log::ScopedCapture log;
  Estimate(frame);
  const std::vector<ocr::log::Record> records = log.Records();
  ASSERT_EQ(records.size(), 1u);
  EXPECT_EQ(records[0].priority, ocr::log::kDebug);
  EXPECT_EQ(records[0].text.rfind(
                "ImgResEstimate: 1280x720, 9 of 9 windows of 240 px with detail, estimate 1.000 "
                "of Nyquist, ",
                0),
            0u)
      << records[0].text;
}

// Bad input: a defined result and one error line saying why, never a crash.
struct BadInput {
  const char* name;
  cv::Mat frame;
  std::string message;
};

TEST(ResolutionEstimator, BadInputIsNotMeasuredAndSaysWhy) {
  const int three_d_sizes[] = {4, 200, 200};
  const BadInput cases[] = {
      {"empty", cv::Mat(), "ImgResEstimate: empty image"},
      {"16-bit", cv::Mat(kHd, CV_16UC3, cv::Scalar::all(1000)),
       "ImgResEstimate: unsupported image type CV_16UC3 (need 8-bit RGBA, RGB or grey)"},
      {"float", cv::Mat(kHd, CV_32FC1, cv::Scalar(0.5)),
       "ImgResEstimate: unsupported image type CV_32FC1 (need 8-bit RGBA, RGB or grey)"},
      {"two channels", cv::Mat(kHd, CV_8UC2, cv::Scalar::all(9)),
       "ImgResEstimate: unsupported image type CV_8UC2 (need 8-bit RGBA, RGB or grey)"},
      {"three dimensions", cv::Mat(3, three_d_sizes, CV_8UC1, cv::Scalar(1)),
       "ImgResEstimate: unsupported image with 3 dimensions (need 2)"},
      {"too short", cv::Mat(95, 400, CV_8UC4, cv::Scalar::all(1)),
       "ImgResEstimate: image 400x95 is too small (needs at least 96 pixels on each side)"},
      {"one pixel", cv::Mat(1, 1, CV_8UC3, cv::Scalar::all(1)),
       "ImgResEstimate: image 1x1 is too small (needs at least 96 pixels on each side)"},
  };
  for (const BadInput& bad : cases) {
    ocr::log::ScopedCapture log;
    EXPECT_EQ(Estimate(bad.frame), kNotMeasured) << bad.name;
    EXPECT_EQ(log.Texts(), std::vector<std::string>{bad.message}) << bad.name;
    EXPECT_TRUE(log.Contains(bad.message, ocr::log::kError)) << bad.name;
  }
  // The smallest accepted frame is measured.
  EXPECT_GT(Estimate(DeadLeaves(cv::Size(96, 96), 11)), 0.9);
}

TEST(ResolutionEstimator, NullAddressIsNotMeasuredAndSaysWhy) {
  ocr::log::ScopedCapture log;
  EXPECT_EQ(EstimateResolution(nullptr), kNotMeasured);
  EXPECT_EQ(log.Texts(), std::vector<std::string>{"ImgResEstimate: null image address"});
  EXPECT_TRUE(log.Contains("ImgResEstimate: null image address", ocr::log::kError));
}

}  // namespace
}  // namespace image_resolution
