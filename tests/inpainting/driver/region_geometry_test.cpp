#include "inpainting/driver/region_geometry.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <string>
#include <vector>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"

namespace ocr_inpainting {
namespace {

cv::Mat RandomImage(int rows, int cols, int type, uint64_t seed) {
  cv::Mat image(rows, cols, type);
  cv::RNG(seed).fill(image, cv::RNG::UNIFORM, 0, 256);
  return image;
}

std::vector<cv::Point2f> Corners(const cv::RotatedRect& rect) {
  cv::Point2f points[4];
  rect.points(points);
  return {points, points + 4};
}

// Centre and size within `tolerance`, angle within 1e-3.
void ExpectNear(const cv::RotatedRect& actual, const cv::RotatedRect& expected, double tolerance,
                const std::string& what) {
  EXPECT_NEAR(actual.center.x, expected.center.x, tolerance) << what;
  EXPECT_NEAR(actual.center.y, expected.center.y, tolerance) << what;
  EXPECT_NEAR(actual.size.width, expected.size.width, tolerance) << what;
  EXPECT_NEAR(actual.size.height, expected.size.height, tolerance) << what;
  EXPECT_NEAR(actual.angle, expected.angle, 1e-3) << what;
}

// Size of the patch of `rect` under `cap`, and whether the reduction was logged.
void ExpectPatchSize(const cv::RotatedRect& rect, int cap, const cv::Size& expected,
                     const std::string& log) {
  ocr::log::ScopedCapture capture;
  cv::Size size;
  cv::Mat transform;
  GetSizeAndTransform(rect, size, transform, cap);
  EXPECT_EQ(size, expected) << rect.size;
  EXPECT_EQ(capture.Texts(), log.empty() ? std::vector<std::string>{} : std::vector{log});
}

TEST(GetSizeAndTransform, RoundsSidesUpAndCapsTheLongerSide) {
  ExpectPatchSize({{20, 20}, {10.2f, 3.0f}, 0}, kLinePatchCap, {11, 3}, "");
  ExpectPatchSize({{400, 300}, {500, 100}, 0}, kLinePatchCap, {240, 48},
                  "Inpainting_Process: reducing size of large rectangle w: 500 h: 100");
  ExpectPatchSize({{400, 300}, {100, 1000}, 30}, kBlockPatchCap, {36, 360},
                  "Inpainting_Process: reducing size of large rectangle w: 100 h: 1000");
  ExpectPatchSize({{400, 300}, {240, 17}, 0}, kLinePatchCap, {240, 17}, "");
}

TEST(GetWarpedImage, CutsAnUprightRectangleExactly) {
  const cv::Mat image = RandomImage(60, 100, CV_8UC3, 3);
  ocr::log::ScopedCapture capture;
  cv::Mat patch;
  GetWarpedImage(image, {{50, 20}, {40, 10}, 0}, patch);
  ASSERT_EQ(patch.size(), cv::Size(40, 10));
  EXPECT_EQ(cv::norm(patch, image(cv::Rect(30, 15, 40, 10)), cv::NORM_INF), 0.0);
  EXPECT_TRUE(capture.Contains("Inpainting_Process:  rotated.rows = 10 , rotated.cols = 40",
                               ocr::log::kInfo));

  // Beyond the image edge the border is replicated, never black.
  const cv::Mat flat(20, 20, CV_8UC3, cv::Scalar(10, 20, 30));
  GetWarpedImage(flat, {{0, 0}, {30, 30}, 17}, patch);
  ASSERT_EQ(patch.size(), cv::Size(30, 30));
  EXPECT_EQ(cv::norm(patch, cv::Mat(30, 30, CV_8UC3, cv::Scalar(10, 20, 30)), cv::NORM_INF), 0.0);
}

TEST(GetWarpedImage, LeavesThePatchAloneForRectanglesWithoutArea) {
  const cv::Mat image = RandomImage(50, 50, CV_8UC3, 9);
  const float nan = std::numeric_limits<float>::quiet_NaN();
  const struct {
    cv::RotatedRect rect;
    const char* message;
  } cases[] = {
      {{{25, 25}, {0, 10}, 0}, "Inpainting_Process:  dst_size.area() = 0"},
      // Two negative sides make a positive area, and still no patch.
      {{{25, 25}, {-4.5f, -3}, 0}, "Inpainting_Process:  dst_size.area() = 12"},
      {{{25, 25}, {-20, 6}, 0}, "Inpainting_Process:  dst_size.area() = -120"},
      {{{25, 25}, {nan, 6}, 0}, "Inpainting_Process:  dst_size.area() = 0"},
  };
  for (const auto& c : cases) {
    ocr::log::ScopedCapture capture;
    cv::Mat patch(2, 2, CV_8UC1, cv::Scalar(7));
    GetWarpedImage(image, c.rect, patch);
    EXPECT_EQ(patch.size(), cv::Size(2, 2)) << c.message;
    EXPECT_EQ(patch.at<uchar>(0, 0), 7) << c.message;
    EXPECT_TRUE(capture.Contains(c.message, ocr::log::kWarn)) << c.message;
  }
}

TEST(GetWarpedImageVector, CutsEveryImageAlongTheSameRectangle) {
  const std::vector<cv::Mat> images = {RandomImage(80, 90, CV_8UC3, 17),
                                       RandomImage(80, 90, CV_8UC1, 19)};
  const cv::RotatedRect rect({45, 40}, {50, 16}, 33);
  std::vector<cv::Mat> patches;
  GetWarpedImageVector(images, rect, patches);
  ASSERT_EQ(patches.size(), 2u);
  for (size_t i = 0; i < 2; ++i) {
    cv::Mat alone;
    GetWarpedImage(images[i], rect, alone);
    EXPECT_EQ(cv::norm(patches[i], alone, cv::NORM_INF), 0.0) << i;
  }

  std::vector<cv::Mat> nothing(5);
  GetWarpedImageVector({images[0], images[1], images[0]}, {{45, 40}, {0, 16}, 0}, nothing);
  ASSERT_EQ(nothing.size(), 3u);
  for (const cv::Mat& patch : nothing)
    EXPECT_TRUE(patch.empty());
}

TEST(WarpPositions, FoldsAnglesIntoMinus45To45) {
  const cv::Mat identity = (cv::Mat_<double>(2, 3) << 1, 0, 0, 0, 1, 0);
  const struct {
    float angle;
    cv::Size2f size;
    float folded_angle;
  } cases[] = {
      {0, {40, 10}, 0},    {30, {40, 10}, 30},  {-30, {40, 10}, -30}, {-60, {10, 40}, 30},
      {60, {10, 40}, -30}, {90, {10, 40}, 0},   {-90, {10, 40}, 0},   {-45, {40, 10}, -45},
      {180, {40, 10}, 0},  {120, {10, 40}, 30}, {10, {40, 10}, 10},   {-10, {40, 10}, -10},
  };
  for (const auto& c : cases) {
    std::vector<cv::RotatedRect> out;
    WarpPositions(identity, {cv::RotatedRect({50, 20}, {40, 10}, c.angle)}, out);
    ASSERT_EQ(out.size(), 1u);
    ExpectNear(out[0], {{50, 20}, c.size, c.folded_angle}, 1e-3,
               "angle " + std::to_string(c.angle));
  }
}

// The transform maps the patch onto the whole rectangle, also when the patch
// is capped (here 500x150 onto 360x108, a scale of 0.72).
TEST(WarpPositions, ExpressesRectanglesInThePatchFrame) {
  const cv::RotatedRect block({300, 200}, {500, 150}, 25);
  cv::Size size;
  cv::Mat transform;
  GetSizeAndTransform(block, size, transform, kBlockPatchCap);
  ASSERT_EQ(size, cv::Size(360, 108));
  // A line 40 pixels above the block's centre line, along its length.
  const double t = 25 * CV_PI / 180;
  const cv::Point2f line_centre(static_cast<float>(300 + 40 * std::sin(t)),
                                static_cast<float>(200 - 40 * std::cos(t)));
  std::vector<cv::RotatedRect> out;
  WarpPositions(transform, {block, cv::RotatedRect(line_centre, {300, 40}, 25)}, out);
  ASSERT_EQ(out.size(), 2u);
  ExpectNear(out[0], {{180, 54}, {360, 108}, 0}, 1e-2, "block");
  ExpectNear(out[1], {{180, 25.2f}, {216, 28.8f}, 0}, 1e-2, "line");
}

TEST(ComputeBoundingRect, SpansSideBySideUprightRectangles) {
  const cv::RotatedRect box =
      ComputeBoundingRect({cv::RotatedRect({20, 20}, {20, 10}, 0), {{50, 20}, {20, 10}, 0}});
  // Union of the integer bounds (10, 15, 21x11) and (40, 15, 21x11).
  EXPECT_FLOAT_EQ(box.angle, 0.0f);
  EXPECT_FLOAT_EQ(box.size.width, 51.0f);
  EXPECT_FLOAT_EQ(box.size.height, 11.0f);
  EXPECT_FLOAT_EQ(box.center.x, 35.5f);
  EXPECT_FLOAT_EQ(box.center.y, 20.5f);
}

TEST(ComputeBoundingRect, EnclosesTurnedLinesAtTheirMeanAngle) {
  const double t = 28 * CV_PI / 180;
  const cv::Point2f down(static_cast<float>(-std::sin(t)), static_cast<float>(std::cos(t)));
  std::vector<cv::RotatedRect> lines;
  for (int k = 0; k < 3; ++k) {
    const cv::Point2f centre = cv::Point2f(400, 300) + down * (26.0f * k);
    lines.emplace_back(centre, cv::Size2f(180.0f - 30 * k, 22), 26.0f + 2 * k);
  }
  const cv::RotatedRect box = ComputeBoundingRect(lines);
  EXPECT_NEAR(box.angle, 28.0f, 1e-4);
  // Every corner of every line lies inside the enclosing rectangle ...
  const std::vector<cv::Point2f> outline = Corners(box);
  for (const cv::RotatedRect& line : lines) {
    for (const cv::Point2f& corner : Corners(line))
      EXPECT_GE(cv::pointPolygonTest(outline, corner, true), -1e-3);
  }
  // ... and it is not much larger than the lines need.
  EXPECT_LT(box.size.area(), 1.25f * (180 + 2) * (3 * 26 + 2));
}

}  // namespace
}  // namespace ocr_inpainting
