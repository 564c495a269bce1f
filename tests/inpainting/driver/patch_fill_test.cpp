#include "inpainting/driver/patch_fill.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "inpainting/driver/font_color_columns.h"

namespace ocr_inpainting {
namespace {

cv::Mat AlphaOf(const cv::Mat& filled, const cv::Mat& mask) {
  cv::Mat overlay;
  AddAlphaChannel(filled, mask, &overlay);
  cv::Mat alpha;
  cv::extractChannel(overlay, alpha, 3);
  return alpha;
}

TEST(AddAlphaChannel, RampsFromTheTextToTheFarthestPixel) {
  cv::Mat filled(10, 10, CV_8UC3);
  cv::RNG(21).fill(filled, cv::RNG::UNIFORM, 0, 256);
  cv::Mat mask = cv::Mat::zeros(10, 10, CV_8UC1);
  mask.at<uchar>(0, 0) = 255;

  ocr::log::ScopedCapture capture;
  cv::Mat overlay;
  AddAlphaChannel(filled, mask, &overlay);
  ASSERT_EQ(overlay.type(), CV_8UC4);
  ASSERT_EQ(overlay.size(), filled.size());
  // The colour channels are the filled patch's, untouched.
  cv::Mat colour;
  cv::cvtColor(overlay, colour, cv::COLOR_RGBA2RGB);
  EXPECT_EQ(cv::norm(colour, filled, cv::NORM_INF), 0.0);

  // The farthest pixel is 9 * sqrt(2) away; that is inside 4..20, so no clamp.
  EXPECT_TRUE(capture.Contains("AddAlphaChannel: max_distance = 12.727922", ocr::log::kDebug));
  EXPECT_TRUE(
      capture.Contains("AddAlphaChannel: adjusted max_distance = 12.727922", ocr::log::kDebug));
  const cv::Mat alpha = AlphaOf(filled, mask);
  for (int y = 0; y < 10; ++y) {
    for (int x = 0; x < 10; ++x) {
      const double t = (std::hypot(x, y) - 3.0) / (9 * std::sqrt(2.0) - 3.0);
      EXPECT_NEAR(alpha.at<uchar>(y, x), std::clamp(255.0 - 255.0 * t, 0.0, 255.0), 1.0)
          << x << "," << y;
    }
  }
  EXPECT_EQ(alpha.at<uchar>(0, 3), 255);
  EXPECT_EQ(alpha.at<uchar>(9, 9), 0);
}

TEST(AddAlphaChannel, ClampsTheRampEndTo4To20) {
  const cv::Mat filled(100, 100, CV_8UC3, cv::Scalar::all(90));
  cv::Mat corner = cv::Mat::zeros(100, 100, CV_8UC1);
  corner.at<uchar>(0, 0) = 255;
  cv::Mat almost_all(100, 100, CV_8UC1, cv::Scalar(255));
  almost_all.col(99).setTo(0);
  ocr::log::ScopedCapture capture;

  // Little text in a large patch: the overlay fades out within 20 pixels.
  const cv::Mat little = AlphaOf(filled, corner);
  EXPECT_EQ(little.at<uchar>(0, 3), 255);
  EXPECT_EQ(little.at<uchar>(0, 11), 135);  // 255 - 255 * 8 / 17
  EXPECT_EQ(little.at<uchar>(0, 20), 0);
  EXPECT_EQ(cv::countNonZero(little(cv::Rect(21, 21, 79, 79))), 0);
  // No text at all: fully transparent.
  EXPECT_EQ(cv::countNonZero(AlphaOf(filled, cv::Mat::zeros(100, 100, CV_8UC1))), 0);
  EXPECT_EQ(capture.Count("AddAlphaChannel: adjusted max_distance = 20.000000"), 2);
  // Text everywhere but the last column (largest distance 1): the ramp is
  // never steeper than 255 per pixel, so everything stays opaque.
  EXPECT_EQ(cv::countNonZero(AlphaOf(filled, almost_all) != 255), 0);
  EXPECT_TRUE(capture.Contains("AddAlphaChannel: max_distance = 1.000000"));
  EXPECT_TRUE(capture.Contains("AddAlphaChannel: adjusted max_distance = 4.000000"));
}

// A one-pixel checkerboard survives only a fill at full resolution: halving
// the patch blurs it away everywhere, masked or not.
TEST(InpaintingThreshold, FillsAtFullSizeBelow21RowsAndAtHalfSizeFrom21) {
  for (const int rows : {20, 21}) {
    cv::Mat patch(rows, 40, CV_8UC3);
    for (int y = 0; y < rows; ++y) {
      for (int x = 0; x < 40; ++x)
        patch.at<cv::Vec3b>(y, x) = cv::Vec3b::all((x + y) % 2 == 0 ? 250 : 0);
    }
    cv::Mat mask = cv::Mat::zeros(rows, 40, CV_8UC1);
    mask(cv::Rect(15, 6, 8, 8)).setTo(255);
    cv::Mat filled;
    InpaintingThreshold(patch, mask, filled);
    ASSERT_EQ(filled.size(), patch.size());
    ASSERT_EQ(filled.type(), patch.type());
    if (rows == 20) {
      cv::Mat diff;
      cv::absdiff(filled, patch, diff);
      cv::cvtColor(diff, diff, cv::COLOR_RGB2GRAY);
      EXPECT_EQ(cv::countNonZero(diff & ~mask), 0) << "pixels outside the mask changed";
      EXPECT_GT(cv::countNonZero(diff & mask), 0) << "the mask was not filled";
    } else {
      // Far from the mask the checkerboard is averaged to grey.
      double low = 0;
      double high = 0;
      cv::minMaxLoc(filled(cv::Rect(30, 2, 8, 16)).reshape(1), &low, &high);
      EXPECT_GT(low, 60);
      EXPECT_LT(high, 190);
    }
  }
}

}  // namespace
}  // namespace ocr_inpainting

TEST(FontColorColumns, PartitionPicksTheTextSideOfThePatch) {
  // 40 columns: a split in the right half keeps the left piece, one in the
  // left half the right piece, anything outside the patch all columns.
  EXPECT_EQ(ocr_inpainting::FontColorColumns(30, 40), cv::Range(0, 30));
  EXPECT_EQ(ocr_inpainting::FontColorColumns(20, 40), cv::Range(0, 20));
  EXPECT_EQ(ocr_inpainting::FontColorColumns(19, 40), cv::Range(19, 40));
  EXPECT_EQ(ocr_inpainting::FontColorColumns(5, 40), cv::Range(5, 40));
  EXPECT_EQ(ocr_inpainting::FontColorColumns(0, 40), cv::Range(0, 40));
  EXPECT_EQ(ocr_inpainting::FontColorColumns(-1, 40), cv::Range(0, 40));
  EXPECT_EQ(ocr_inpainting::FontColorColumns(40, 40), cv::Range(0, 40));
}
