#include "inpainting/driver/patch_fill.h"

#include <gtest/gtest.h>

#include <cmath>
#include <vector>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"

namespace ocr_inpainting {
namespace {

cv::Mat AlphaOf(const cv::Mat& overlay) {
  cv::Mat alpha;
  cv::extractChannel(overlay, alpha, 3);
  return alpha;
}

// Alpha expected at distance d from the text for a ramp ending at `ramp_end`.
double ExpectedAlpha(double d, double ramp_end) {
  return std::clamp(255.0 - 255.0 * (d - 3.0) / (ramp_end - 3.0), 0.0, 255.0);
}

TEST(AddAlphaChannel, RampsFromTheTextToTheFarthestPixel) {
  cv::RNG rng(21);
  cv::Mat filled(10, 10, CV_8UC3);
  rng.fill(filled, cv::RNG::UNIFORM, 0, 256);
  cv::Mat mask = cv::Mat::zeros(10, 10, CV_8UC1);
  mask.at<uchar>(0, 0) = 255;

  ocr::log::ScopedCapture capture;
  cv::Mat overlay;
  AddAlphaChannel(filled, mask, &overlay);
  ASSERT_EQ(overlay.type(), CV_8UC4);
  ASSERT_EQ(overlay.size(), filled.size());

  // The farthest pixel is 9 * sqrt(2) away; that is inside 4..20, so no clamp.
  EXPECT_TRUE(capture.Contains("AddAlphaChannel: max_distance = 12.727922", ocr::log::kDebug));
  EXPECT_TRUE(
      capture.Contains("AddAlphaChannel: adjusted max_distance = 12.727922", ocr::log::kDebug));
  const cv::Mat alpha = AlphaOf(overlay);
  const double ramp_end = 9 * std::sqrt(2.0);
  for (int y = 0; y < 10; ++y) {
    for (int x = 0; x < 10; ++x) {
      const double d = std::hypot(x, y);
      EXPECT_NEAR(alpha.at<uchar>(y, x), ExpectedAlpha(d, ramp_end), 1.0) << x << "," << y;
    }
  }
  EXPECT_EQ(alpha.at<uchar>(0, 3), 255);
  EXPECT_EQ(alpha.at<uchar>(9, 9), 0);

  // The colour channels are the filled patch's, untouched.
  cv::Mat colour;
  cv::cvtColor(overlay, colour, cv::COLOR_RGBA2RGB);
  EXPECT_EQ(cv::norm(colour, filled, cv::NORM_INF), 0.0);
}

TEST(AddAlphaChannel, LargePatchWithLittleTextFadesOutWithin20Pixels) {
  const cv::Mat filled(100, 100, CV_8UC3, cv::Scalar(90, 90, 90));
  cv::Mat mask = cv::Mat::zeros(100, 100, CV_8UC1);
  mask.at<uchar>(0, 0) = 255;
  ocr::log::ScopedCapture capture;
  cv::Mat overlay;
  AddAlphaChannel(filled, mask, &overlay);
  EXPECT_TRUE(capture.Contains("AddAlphaChannel: adjusted max_distance = 20.000000"));
  const cv::Mat alpha = AlphaOf(overlay);
  EXPECT_EQ(alpha.at<uchar>(0, 3), 255);
  EXPECT_EQ(alpha.at<uchar>(0, 11), 135);  // 255 - 255 * 8 / 17
  EXPECT_EQ(alpha.at<uchar>(0, 20), 0);
  EXPECT_EQ(cv::countNonZero(alpha(cv::Rect(21, 21, 79, 79))), 0);
}

TEST(AddAlphaChannel, RampIsNeverSteeperThanOnePixel) {
  // Text everywhere but the last column: the largest distance is 1.
  const cv::Mat filled(6, 6, CV_8UC3, cv::Scalar(1, 2, 3));
  cv::Mat mask(6, 6, CV_8UC1, cv::Scalar(255));
  mask.col(5).setTo(0);
  ocr::log::ScopedCapture capture;
  cv::Mat overlay;
  AddAlphaChannel(filled, mask, &overlay);
  EXPECT_TRUE(capture.Contains("AddAlphaChannel: max_distance = 1.000000"));
  EXPECT_TRUE(capture.Contains("AddAlphaChannel: adjusted max_distance = 4.000000"));
  EXPECT_EQ(cv::countNonZero(AlphaOf(overlay) != 255), 0);
}

TEST(AddAlphaChannel, AllZeroMaskGivesATransparentOverlay) {
  const cv::Mat filled(30, 50, CV_8UC3, cv::Scalar(200, 100, 50));
  ocr::log::ScopedCapture capture;
  cv::Mat overlay;
  AddAlphaChannel(filled, cv::Mat::zeros(30, 50, CV_8UC1), &overlay);
  EXPECT_TRUE(capture.Contains("AddAlphaChannel: adjusted max_distance = 20.000000"));
  EXPECT_EQ(cv::countNonZero(AlphaOf(overlay)), 0);
}

// A one-pixel checkerboard survives only a fill at full resolution: halving
// the patch blurs it away everywhere, masked or not.
cv::Mat Checkerboard(int rows, int cols) {
  cv::Mat patch(rows, cols, CV_8UC3);
  for (int y = 0; y < rows; ++y) {
    for (int x = 0; x < cols; ++x)
      patch.at<cv::Vec3b>(y, x) =
          ((x + y) % 2 == 0) ? cv::Vec3b(250, 250, 250) : cv::Vec3b(0, 0, 0);
  }
  return patch;
}

TEST(InpaintingThreshold, FillsPatchesBelow21RowsAtFullSize) {
  const cv::Mat patch = Checkerboard(20, 40);
  cv::Mat mask = cv::Mat::zeros(20, 40, CV_8UC1);
  mask(cv::Rect(15, 6, 8, 8)).setTo(255);
  cv::Mat filled;
  InpaintingThreshold(patch, mask, filled);
  ASSERT_EQ(filled.size(), patch.size());
  ASSERT_EQ(filled.type(), patch.type());
  cv::Mat diff;
  cv::absdiff(filled, patch, diff);
  cv::cvtColor(diff, diff, cv::COLOR_RGB2GRAY);
  EXPECT_EQ(cv::countNonZero(diff & ~mask), 0) << "pixels outside the mask changed";
  EXPECT_GT(cv::countNonZero(diff & mask), 0) << "the mask was not filled";
}

TEST(InpaintingThreshold, FillsPatchesFrom21RowsAtHalfSize) {
  const cv::Mat patch = Checkerboard(21, 41);
  cv::Mat mask = cv::Mat::zeros(21, 41, CV_8UC1);
  mask(cv::Rect(15, 6, 8, 8)).setTo(255);
  cv::Mat filled;
  InpaintingThreshold(patch, mask, filled);
  ASSERT_EQ(filled.size(), patch.size());
  ASSERT_EQ(filled.type(), patch.type());
  // Far from the mask the checkerboard is averaged to grey.
  const cv::Mat far = filled(cv::Rect(30, 2, 8, 16));
  double low = 0;
  double high = 0;
  cv::minMaxLoc(far.reshape(1), &low, &high);
  EXPECT_GT(low, 60);
  EXPECT_LT(high, 190);
}

TEST(InpaintingThreshold, FillsTextFromAFlatBackgroundAtEitherSize) {
  for (const int rows : {12, 20, 21, 48}) {
    cv::Mat patch(rows, 60, CV_8UC3, cv::Scalar(180, 140, 60));
    cv::Mat mask = cv::Mat::zeros(rows, 60, CV_8UC1);
    const cv::Rect text(20, rows / 4, 20, rows / 2);
    patch(text).setTo(cv::Scalar(10, 10, 10));
    mask(text).setTo(255);
    cv::dilate(mask, mask, cv::Mat());
    cv::Mat filled;
    InpaintingThreshold(patch, mask, filled);
    EXPECT_LE(cv::norm(filled, cv::Mat(rows, 60, CV_8UC3, cv::Scalar(180, 140, 60)), cv::NORM_INF),
              6.0)
        << rows << " rows";
  }
}

}  // namespace
}  // namespace ocr_inpainting
