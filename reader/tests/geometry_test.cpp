// The geometry of boxes: growing the detector's core, corners in reading
// terms, the angle convention, and the upright crop.
#include <cmath>

#include <gtest/gtest.h>
#include <opencv2/imgproc.hpp>

#include "box_geometry.h"
#include "test_images.h"
#include "textreader/text_reader.h"
#include "upright_crop.h"

namespace textreader {
namespace {

void ExpectNear(cv::Point2f actual, cv::Point2f expected, float tolerance = 0.01F) {
  EXPECT_NEAR(actual.x, expected.x, tolerance);
  EXPECT_NEAR(actual.y, expected.y, tolerance);
}

TEST(Unclip, GrowsEverySideByAreaTimesRatioOverPerimeter) {
  // 100 x 10: area 1000, perimeter 220, 1.5 * 1000 / 220 on each side.
  const cv::RotatedRect grown = Unclip({{50, 20}, {100, 10}, 30}, 1.5F);
  const float d = 1.5F * 1000.0F / 220.0F;
  EXPECT_NEAR(grown.size.width, 100 + 2 * d, 1e-3);
  EXPECT_NEAR(grown.size.height, 10 + 2 * d, 1e-3);
  EXPECT_EQ(grown.center, cv::Point2f(50, 20));
  EXPECT_EQ(grown.angle, 30);
  // A degenerate box stays as it is rather than dividing by zero.
  EXPECT_EQ(Unclip({{5, 5}, {0, 0}, 0}, 1.5F).size, cv::Size2f(0, 0));
}

TEST(ReadingCorners, StartTopLeftAndGoClockwiseWhateverOpenCvCallsTheBox) {
  // The same 40 x 10 horizontal box, described by OpenCV as width 40 at 0
  // degrees and as width 10 at 90 degrees.
  for (const cv::RotatedRect& box :
       {cv::RotatedRect({100, 50}, {40, 10}, 0), cv::RotatedRect({100, 50}, {10, 40}, 90),
        cv::RotatedRect({100, 50}, {10, 40}, -90), cv::RotatedRect({100, 50}, {40, 10}, 180)}) {
    const Corners c = ReadingCorners(box);
    ExpectNear(c[0], {80, 45}, 1e-3F);
    ExpectNear(c[1], {120, 45}, 1e-3F);
    ExpectNear(c[2], {120, 55}, 1e-3F);
    ExpectNear(c[3], {80, 55}, 1e-3F);
    const cv::RotatedRect rect = RectFromCorners(c);
    EXPECT_NEAR(rect.angle, 0, 1e-3);
    EXPECT_NEAR(rect.size.width, 40, 1e-3);
    EXPECT_NEAR(rect.size.height, 10, 1e-3);
  }
}

TEST(ReadingCorners, TiltedLinesKeepTheirAngleAndTallBoxesReadDownwards) {
  EXPECT_NEAR(RectFromCorners(ReadingCorners({{0, 0}, {50, 10}, 20})).angle, 20, 1e-3);
  EXPECT_NEAR(RectFromCorners(ReadingCorners({{0, 0}, {50, 10}, -20})).angle, -20, 1e-3);
  // Described with its width across the text: still read along the long side.
  EXPECT_NEAR(RectFromCorners(ReadingCorners({{0, 0}, {10, 50}, 70})).angle, -20, 1e-3);
  // A column of text reads top to bottom: angle 90, width along the column.
  const cv::RotatedRect column = RectFromCorners(ReadingCorners({{30, 60}, {10, 80}, 0}));
  EXPECT_NEAR(column.angle, 90, 1e-3);
  EXPECT_NEAR(column.size.width, 80, 1e-3);
  EXPECT_NEAR(column.size.height, 10, 1e-3);
  // Not quite tall enough to be a column: a short word, read across.
  EXPECT_NEAR(RectFromCorners(ReadingCorners({{30, 60}, {10, 14}, 0})).angle, 0, 1e-3);
}

TEST(TurnedHalfway, ReadsUpsideDownWithAnAngleNear180AndTheSameRectangle) {
  const Corners upright = ReadingCorners({{100, 50}, {40, 10}, 5});
  const Corners turned = TurnedHalfway(upright);
  const cv::RotatedRect rect = RectFromCorners(turned);
  EXPECT_NEAR(rect.angle, -175, 1e-3);
  ExpectNear(rect.center, {100, 50}, 1e-3F);
  EXPECT_NEAR(rect.size.width, 40, 1e-3);
  // Its reader's top-left is the page's bottom-right.
  ExpectNear(turned[0], upright[2]);
  const cv::RotatedRect down = RectFromCorners(TurnedHalfway(ReadingCorners({{0, 0}, {8, 60}, 0})));
  EXPECT_NEAR(down.angle, -90, 1e-3);  // a column read bottom to top
}

TEST(PointAt, InterpolatesAlongAndAcrossTheLine) {
  const Corners c{cv::Point2f(0, 0), {100, 0}, {100, 20}, {0, 20}};
  ExpectNear(PointAt(c, 0.25F, 0.5F), {25, 10});
  ExpectNear(PointAt(TurnedHalfway(c), 0.25F, 0.0F), {75, 20});
}

// The fraction of dark pixels in each half of a crop, left and right.
std::pair<double, double> InkHalves(const cv::Mat& rgb) {
  cv::Mat grey;
  cv::cvtColor(rgb, grey, cv::COLOR_RGB2GRAY);
  const cv::Mat ink = grey < 128;
  const int half = ink.cols / 2;
  return {cv::countNonZero(ink.colRange(0, half)) / static_cast<double>(half * ink.rows),
          cv::countNonZero(ink.colRange(half, ink.cols)) / static_cast<double>(half * ink.rows)};
}

TEST(UprightCrop, TurnsATiltedLineUprightAtTheAskedHeightWithItsAspect) {
  // Ink on the left, a dot on the right. Turned by 30 degrees, the crop
  // along the line's corners must put it back on the left.
  const cv::Point2f centre(200, 150);
  const cv::Mat page = textreader_test::RenderedText("MMM       .", {400, 300}, centre, 1.5, 30);
  TextLine line;
  const cv::RotatedRect box(centre, {250, 50}, 30);
  line.corners = ReadingCorners(box);
  const cv::Mat crop = UprightCrop(page, line, 48);
  EXPECT_EQ(crop.rows, 48);
  EXPECT_EQ(crop.cols, 240);  // 250 / 50 * 48
  EXPECT_EQ(crop.type(), page.type());
  const auto [left, right] = InkHalves(crop);
  EXPECT_GT(left, 4 * right);
  // The same line read upside down has its ink on the right.
  line.corners = TurnedHalfway(line.corners);
  const auto [left_turned, right_turned] = InkHalves(UprightCrop(page, line, 48));
  EXPECT_GT(right_turned, 4 * left_turned);
  EXPECT_THROW(UprightCrop(cv::Mat(), line, 48), std::invalid_argument);
}

TEST(UprightCrop, SqueezesAnEndlessLineToTheWidestCrop) {
  const cv::Mat page(50, 100, CV_8UC3, cv::Scalar::all(255));
  TextLine line;
  line.corners = {cv::Point2f(0, 0), {99, 0}, {99, 0.01F}, {0, 0.01F}};
  EXPECT_EQ(UprightCrop(page, line, 48).cols, kMaxCropWidth);
}

}  // namespace
}  // namespace textreader
