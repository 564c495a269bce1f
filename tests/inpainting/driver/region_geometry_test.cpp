#include "inpainting/driver/region_geometry.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <vector>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "inpainting/driver/min_area_rect.h"

namespace ocr_inpainting {
namespace {

cv::Mat RandomImage(int rows, int cols, int type, uint64_t seed) {
  cv::RNG rng(seed);
  cv::Mat image(rows, cols, type);
  rng.fill(image, cv::RNG::UNIFORM, 0, 256);
  return image;
}

cv::Point2d Apply(const cv::Mat& transform, double x, double y) {
  return {
      transform.at<double>(0, 0) * x + transform.at<double>(0, 1) * y + transform.at<double>(0, 2),
      transform.at<double>(1, 0) * x + transform.at<double>(1, 1) * y + transform.at<double>(1, 2)};
}

// OpenCV 3's RotatedRect::points and boundingRect, written out.
void OpenCv3Points(const cv::RotatedRect& r, cv::Point2f pt[4]) {
  const double angle = r.angle * CV_PI / 180.0;
  const float b = static_cast<float>(std::cos(angle)) * 0.5f;
  const float a = static_cast<float>(std::sin(angle)) * 0.5f;
  pt[0].x = r.center.x - a * r.size.height - b * r.size.width;
  pt[0].y = r.center.y + b * r.size.height - a * r.size.width;
  pt[1].x = r.center.x + a * r.size.height - b * r.size.width;
  pt[1].y = r.center.y - b * r.size.height - a * r.size.width;
  pt[2].x = 2 * r.center.x - pt[0].x;
  pt[2].y = 2 * r.center.y - pt[0].y;
  pt[3].x = 2 * r.center.x - pt[1].x;
  pt[3].y = 2 * r.center.y - pt[1].y;
}

cv::Rect OpenCv3BoundingRect(const cv::RotatedRect& r) {
  cv::Point2f pt[4];
  OpenCv3Points(r, pt);
  cv::Rect box(cvFloor(std::min(std::min(std::min(pt[0].x, pt[1].x), pt[2].x), pt[3].x)),
               cvFloor(std::min(std::min(std::min(pt[0].y, pt[1].y), pt[2].y), pt[3].y)),
               cvCeil(std::max(std::max(std::max(pt[0].x, pt[1].x), pt[2].x), pt[3].x)),
               cvCeil(std::max(std::max(std::max(pt[0].y, pt[1].y), pt[2].y), pt[3].y)));
  box.width -= box.x - 1;
  box.height -= box.y - 1;
  return box;
}

std::vector<cv::Point2f> Corners(const cv::RotatedRect& rect) {
  cv::Point2f points[4];
  rect.points(points);
  return {points, points + 4};
}

// The patch geometry rests on the corner order and bounds of OpenCV 3; the
// installed OpenCV must give exactly the same.
TEST(RotatedRectConventions, CornersAndBoundsMatchOpenCv3) {
  cv::RNG rng(7);
  for (int i = 0; i < 2000; ++i) {
    const cv::RotatedRect rect(cv::Point2f(rng.uniform(-50.f, 900.f), rng.uniform(-50.f, 900.f)),
                               cv::Size2f(rng.uniform(0.f, 400.f), rng.uniform(0.f, 400.f)),
                               rng.uniform(-180.f, 180.f));
    cv::Point2f actual[4];
    cv::Point2f expected[4];
    rect.points(actual);
    OpenCv3Points(rect, expected);
    for (int k = 0; k < 4; ++k)
      ASSERT_EQ(actual[k], expected[k]) << "corner " << k << " of rectangle " << i;
    ASSERT_EQ(rect.boundingRect(), OpenCv3BoundingRect(rect)) << "rectangle " << i;
  }
  // Angle 0: bottom-left, top-left, top-right, bottom-right.
  const std::vector<cv::Point2f> corners = Corners({{50, 20}, {40, 10}, 0});
  EXPECT_EQ(corners, (std::vector<cv::Point2f>{{30, 25}, {30, 15}, {70, 15}, {70, 25}}));
}

TEST(MinAreaRectOpenCv3, ReportsAnglesInMinus90To0) {
  // Upright box 40 wide, 10 high: OpenCV 3 says -90 with the sides as seen along that angle.
  const cv::RotatedRect upright = MinAreaRectOpenCv3(Corners({{50, 20}, {40, 10}, 0}));
  EXPECT_FLOAT_EQ(upright.angle, -90.0f);
  EXPECT_FLOAT_EQ(upright.size.width, 10.0f);
  EXPECT_FLOAT_EQ(upright.size.height, 40.0f);
  EXPECT_FLOAT_EQ(upright.center.x, 50.0f);
  EXPECT_FLOAT_EQ(upright.center.y, 20.0f);

  const cv::RotatedRect turned = MinAreaRectOpenCv3(Corners({{50, 20}, {40, 10}, -60}));
  EXPECT_NEAR(turned.angle, -60.0f, 1e-4);
  EXPECT_NEAR(turned.size.width, 40.0f, 1e-4);
  EXPECT_NEAR(turned.size.height, 10.0f, 1e-4);

  cv::RNG rng(11);
  for (int i = 0; i < 500; ++i) {
    const cv::RotatedRect rect({rng.uniform(0.f, 500.f), rng.uniform(0.f, 500.f)},
                               {rng.uniform(1.f, 300.f), rng.uniform(1.f, 300.f)},
                               rng.uniform(-180.f, 180.f));
    const cv::RotatedRect box = MinAreaRectOpenCv3(Corners(rect));
    ASSERT_GE(box.angle, -90.0f);
    ASSERT_LT(box.angle, 0.0f);
    ASSERT_NEAR(box.size.area(), rect.size.area(), rect.size.area() * 1e-4 + 1e-2);
  }
}

TEST(MinAreaRectOpenCv3, TwoPointBoxesPassThrough) {
  const std::vector<cv::Point2f> segment = {{1, 1}, {5, 5}, {5, 5}, {1, 1}};
  const cv::RotatedRect expected = cv::minAreaRect(segment);
  const cv::RotatedRect box = MinAreaRectOpenCv3(segment);
  EXPECT_EQ(box.angle, expected.angle);
  EXPECT_EQ(box.size, expected.size);
  EXPECT_EQ(box.size.height, 0.0f);
}

TEST(GetSizeAndTransform, RoundsSidesUp) {
  cv::Size size;
  cv::Mat transform;
  GetSizeAndTransform({{20, 20}, {10.2f, 3.0f}, 0}, size, transform, kLinePatchCap);
  EXPECT_EQ(size, cv::Size(11, 3));
}

TEST(GetSizeAndTransform, CapsTheLongerSideAndLogsTheReduction) {
  ocr::log::ScopedCapture capture;
  cv::Size size;
  cv::Mat transform;
  const cv::RotatedRect rect({400, 300}, {500, 100}, 0);
  GetSizeAndTransform(rect, size, transform, kLinePatchCap);
  EXPECT_EQ(size, cv::Size(240, 48));
  EXPECT_TRUE(capture.Contains("Inpainting_Process: reducing size of large rectangle w: 500 h: 100",
                               ocr::log::kDebug));

  // The whole rectangle is still mapped: a uniform downscale of its content.
  const std::vector<cv::Point2f> corners = Corners(rect);
  const cv::Point2d bottom_left = Apply(transform, 0, 48);
  const cv::Point2d top_right = Apply(transform, 240, 0);
  EXPECT_NEAR(bottom_left.x, corners[0].x, 1e-3);
  EXPECT_NEAR(bottom_left.y, corners[0].y, 1e-3);
  EXPECT_NEAR(top_right.x, corners[2].x, 1e-3);
  EXPECT_NEAR(top_right.y, corners[2].y, 1e-3);

  GetSizeAndTransform({{400, 300}, {100, 1000}, 30}, size, transform, kBlockPatchCap);
  EXPECT_EQ(size, cv::Size(36, 360));
  // Sides at the cap are kept, and nothing is logged for them.
  capture.Clear();
  GetSizeAndTransform({{400, 300}, {240, 17}, 0}, size, transform, kLinePatchCap);
  EXPECT_EQ(size, cv::Size(240, 17));
  EXPECT_TRUE(capture.Records().empty());
}

TEST(GetSizeAndTransform, MapsPatchCornersOntoRectangleCorners) {
  const cv::RotatedRect rect({123.5f, 77.25f}, {61.0f, 19.0f}, -23.0f);
  cv::Size size;
  cv::Mat transform;
  GetSizeAndTransform(rect, size, transform, kLinePatchCap);
  ASSERT_EQ(size, cv::Size(61, 19));
  ASSERT_EQ(transform.type(), CV_64F);
  const std::vector<cv::Point2f> corners = Corners(rect);
  const cv::Point2d patch_corners[4] = {{0, 19}, {0, 0}, {61, 0}, {61, 19}};
  for (int k = 0; k < 4; ++k) {
    const cv::Point2d mapped = Apply(transform, patch_corners[k].x, patch_corners[k].y);
    EXPECT_NEAR(mapped.x, corners[k].x, 1e-3) << "corner " << k;
    EXPECT_NEAR(mapped.y, corners[k].y, 1e-3) << "corner " << k;
  }
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
}

TEST(GetWarpedImage, RunsTheWidthAlongThePatchXAxis) {
  // A rectangle at 90 degrees: its width runs down the image.
  const cv::Mat image = RandomImage(100, 100, CV_8UC1, 5);
  cv::Mat patch;
  GetWarpedImage(image, {{50, 50}, {40, 10}, 90}, patch);
  ASSERT_EQ(patch.size(), cv::Size(40, 10));
  double worst = 0;
  for (int y = 0; y < 10; ++y) {
    for (int x = 0; x < 40; ++x) {
      // Patch (x, y) sits at image column 55 - y, row 30 + x.
      worst = std::max(worst,
                       std::abs(double(patch.at<uchar>(y, x)) - image.at<uchar>(30 + x, 55 - y)));
    }
  }
  EXPECT_LE(worst, 1.0);
}

TEST(GetWarpedImage, ReplicatesTheBorderOutsideTheImage) {
  cv::Mat image(20, 20, CV_8UC3, cv::Scalar(10, 20, 30));
  cv::Mat patch;
  GetWarpedImage(image, {{0, 0}, {30, 30}, 17}, patch);
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

TEST(GetWarpedImage, SurvivesNonFiniteAndHugeRectangles) {
  const cv::Mat image = RandomImage(50, 50, CV_8UC3, 13);
  const float inf = std::numeric_limits<float>::infinity();
  const float nan = std::numeric_limits<float>::quiet_NaN();
  const cv::RotatedRect rects[] = {{{nan, 25}, {10, 10}, 0},
                                   {{25, 25}, {10, 10}, nan},
                                   {{25, 25}, {inf, 10}, 0},
                                   {{1e30f, -1e30f}, {1e9f, 1e9f}, 45},
                                   {{25, 25}, {3e9f, 2}, 0}};
  for (const cv::RotatedRect& rect : rects) {
    cv::Mat patch;
    GetWarpedImage(image, rect, patch);
    EXPECT_LE(patch.rows, kLinePatchCap);
    EXPECT_LE(patch.cols, kLinePatchCap);
  }
}

TEST(GetWarpedImageVector, CutsEveryImageAlongTheSameRectangle) {
  const cv::Mat colour = RandomImage(80, 90, CV_8UC3, 17);
  const cv::Mat mask = RandomImage(80, 90, CV_8UC1, 19);
  const cv::RotatedRect rect({45, 40}, {50, 16}, 33);
  std::vector<cv::Mat> patches;
  GetWarpedImageVector({colour, mask}, rect, patches);
  ASSERT_EQ(patches.size(), 2u);
  cv::Mat colour_alone;
  cv::Mat mask_alone;
  GetWarpedImage(colour, rect, colour_alone);
  GetWarpedImage(mask, rect, mask_alone);
  EXPECT_EQ(cv::norm(patches[0], colour_alone, cv::NORM_INF), 0.0);
  EXPECT_EQ(cv::norm(patches[1], mask_alone, cv::NORM_INF), 0.0);

  std::vector<cv::Mat> nothing(5);
  GetWarpedImageVector({colour, mask, colour}, {{45, 40}, {0, 16}, 0}, nothing);
  ASSERT_EQ(nothing.size(), 3u);
  for (const cv::Mat& patch : nothing)
    EXPECT_TRUE(patch.empty());
}

struct FoldCase {
  float angle;
  cv::Size2f size;
  float folded_angle;
};

TEST(WarpPositions, FoldsAnglesIntoMinus45To45) {
  const cv::Mat identity = (cv::Mat_<double>(2, 3) << 1, 0, 0, 0, 1, 0);
  const FoldCase cases[] = {
      {0, {40, 10}, 0},    {30, {40, 10}, 30},  {-30, {40, 10}, -30}, {-60, {10, 40}, 30},
      {60, {10, 40}, -30}, {90, {10, 40}, 0},   {-90, {10, 40}, 0},   {-45, {40, 10}, -45},
      {180, {40, 10}, 0},  {120, {10, 40}, 30}, {10, {40, 10}, 10},   {-10, {40, 10}, -10},
  };
  for (const FoldCase& c : cases) {
    std::vector<cv::RotatedRect> out;
    WarpPositions(identity, {cv::RotatedRect({50, 20}, {40, 10}, c.angle)}, out);
    ASSERT_EQ(out.size(), 1u);
    EXPECT_NEAR(out[0].angle, c.folded_angle, 1e-3) << "angle " << c.angle;
    EXPECT_NEAR(out[0].size.width, c.size.width, 1e-3) << "angle " << c.angle;
    EXPECT_NEAR(out[0].size.height, c.size.height, 1e-3) << "angle " << c.angle;
    EXPECT_NEAR(out[0].center.x, 50, 1e-3);
    EXPECT_NEAR(out[0].center.y, 20, 1e-3);
  }
}

TEST(WarpPositions, ExpressesRectanglesInThePatchFrame) {
  const cv::RotatedRect block({300, 200}, {200, 60}, 25);
  cv::Size size;
  cv::Mat transform;
  GetSizeAndTransform(block, size, transform, kBlockPatchCap);
  // A line in the upper half of the block, along its length.
  const double t = 25 * CV_PI / 180;
  const cv::Point2f line_centre(static_cast<float>(300 + 15 * std::sin(t)),
                                static_cast<float>(200 - 15 * std::cos(t)));
  std::vector<cv::RotatedRect> out;
  WarpPositions(transform, {block, cv::RotatedRect(line_centre, {150, 20}, 25)}, out);
  ASSERT_EQ(out.size(), 2u);
  EXPECT_NEAR(out[0].center.x, 100, 1e-2);
  EXPECT_NEAR(out[0].center.y, 30, 1e-2);
  EXPECT_NEAR(out[0].size.width, 200, 1e-2);
  EXPECT_NEAR(out[0].size.height, 60, 1e-2);
  EXPECT_NEAR(out[0].angle, 0, 1e-3);
  EXPECT_NEAR(out[1].center.x, 100, 1e-2);
  EXPECT_NEAR(out[1].center.y, 15, 1e-2);
  EXPECT_NEAR(out[1].size.width, 150, 1e-2);
  EXPECT_NEAR(out[1].size.height, 20, 1e-2);
  EXPECT_NEAR(out[1].angle, 0, 1e-3);
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
  // Every corner of every line lies inside the enclosing rectangle.
  const std::vector<cv::Point2f> outline = Corners(box);
  for (const cv::RotatedRect& line : lines) {
    for (const cv::Point2f& corner : Corners(line))
      EXPECT_GE(cv::pointPolygonTest(outline, corner, true), -1e-3);
  }
  // And it is not much larger than the lines need.
  EXPECT_LT(box.size.area(), 1.25f * (180 + 2) * (3 * 26 + 2));
}

}  // namespace
}  // namespace ocr_inpainting
