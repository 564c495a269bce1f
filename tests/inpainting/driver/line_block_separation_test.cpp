#include "inpainting/driver/line_block_separation.h"

#include <gtest/gtest.h>

#include <vector>

#include <opencv2/core.hpp>

#include "common/log.h"
#include "inpainting/driver/cut_into_vector.h"

namespace ocr_inpainting {
namespace {

using Indices = std::vector<unsigned int>;

struct Separation {
  std::vector<std::vector<double>> block_values;
  std::vector<double> line_values;
  std::vector<Indices> block_indices;
  Indices line_indices;
};

Separation Separate(const cv::Size& image_size, const std::vector<double>& values) {
  const cv::Mat image(image_size, CV_8UC3, cv::Scalar::all(0));
  Separation s;
  // Stale content must not survive.
  s.block_values = {{1, 2, 3}};
  s.line_values = {4};
  s.block_indices = {{9}};
  s.line_indices = {8};
  SmartSepLineAndBlock(image, values, s.block_values, s.line_values, s.block_indices,
                       s.line_indices);
  return s;
}

// Upright rectangles of the given width and height with top-left corners at (x, y).
std::vector<double> UprightRects(const std::vector<cv::Rect>& boxes) {
  std::vector<double> values;
  for (const cv::Rect& box : boxes) {
    values.insert(values.end(), {box.x + box.width * 0.5, box.y + box.height * 0.5,
                                 double(box.width), double(box.height), 0.0});
  }
  return values;
}

std::vector<double> ValuesOf(const std::vector<double>& values, const Indices& indices) {
  std::vector<double> out;
  for (const unsigned int i : indices)
    out.insert(out.end(), values.begin() + 5 * i, values.begin() + 5 * i + 5);
  return out;
}

TEST(SmartSepLineAndBlock, StackedLinesFormBlocksOfAtMostFortyPercentPlusOne) {
  // Five touching 100x20 lines in a 1000x1000 image: at most 2 members may be
  // present when a third is considered, so 0, 1, 2 then 3, 4.
  std::vector<cv::Rect> boxes;
  for (int k = 0; k < 5; ++k)
    boxes.emplace_back(100, 100 + 20 * k, 100, 20);
  const std::vector<double> values = UprightRects(boxes);
  ocr::log::ScopedCapture capture;
  const Separation s = Separate({1000, 1000}, values);
  EXPECT_EQ(s.block_indices, (std::vector<Indices>{{0, 1, 2}, {3, 4}}));
  ASSERT_EQ(s.block_values.size(), 2u);
  EXPECT_EQ(s.block_values[0], ValuesOf(values, {0, 1, 2}));
  EXPECT_EQ(s.block_values[1], ValuesOf(values, {3, 4}));
  EXPECT_TRUE(s.line_indices.empty());
  EXPECT_TRUE(s.line_values.empty());

  const std::vector<std::string> expected_logs = {
      "kavoSmart start smart sep total 5", "kavoSmart start block sep",
      "kavoSmart sep block num 0",         "kavoSmart sep block Num 0, Ind 0",
      "kavoSmart sep block Num 0, Ind 1",  "kavoSmart sep block Num 0, Ind 2",
      "kavoSmart sep block num 1",         "kavoSmart sep block Num 1, Ind 0",
      "kavoSmart sep block Num 1, Ind 1",  "kavoSmart end smart sep"};
  std::vector<std::string> debug_logs;
  for (const ocr::log::Record& record : capture.Records()) {
    if (record.priority == ocr::log::kDebug)
      debug_logs.push_back(record.text);
  }
  EXPECT_EQ(debug_logs, expected_logs);
}

TEST(SmartSepLineAndBlock, FarApartLinesBecomeOneMemberBlocks) {
  const std::vector<double> values =
      UprightRects({{50, 50, 200, 30}, {600, 700, 200, 30}, {50, 400, 120, 20}});
  ocr::log::ScopedCapture capture;
  const Separation s = Separate({1000, 1000}, values);
  EXPECT_EQ(s.block_indices, (std::vector<Indices>{{0}, {1}, {2}}));
  EXPECT_EQ(s.block_values,
            (std::vector<std::vector<double>>{ValuesOf(values, {0}), ValuesOf(values, {1}),
                                              ValuesOf(values, {2})}));
  EXPECT_TRUE(s.line_indices.empty());
  EXPECT_TRUE(
      capture.Contains("INPAINT_BLOCK_TAG: block stopped at i = 0, j = 1", ocr::log::kInfo));
  EXPECT_TRUE(
      capture.Contains("INPAINT_BLOCK_TAG: block stopped at i = 1, j = 2", ocr::log::kInfo));
}

TEST(SmartSepLineAndBlock, MultiLineBlocksComeBeforeSingleLines) {
  const std::vector<double> values = UprightRects(
      {{700, 800, 150, 25}, {100, 100, 200, 20}, {100, 120, 200, 20}, {600, 50, 100, 20}});
  const Separation s = Separate({1000, 1000}, values);
  EXPECT_EQ(s.block_indices, (std::vector<Indices>{{1, 2}, {0}, {3}}));
}

TEST(SmartSepLineAndBlock, TheFirstRefusalEndsTheBlock) {
  // Line 2 is far away; line 3 would fit with 0 and 1 but the scan has ended.
  const std::vector<double> values = UprightRects({{100, 100, 200, 20},
                                                   {100, 120, 200, 20},
                                                   {700, 700, 100, 20},
                                                   {100, 140, 200, 20},
                                                   {800, 100, 50, 20},
                                                   {800, 900, 50, 20},
                                                   {10, 900, 50, 20},
                                                   {400, 500, 50, 20}});
  const Separation s = Separate({1000, 1000}, values);
  EXPECT_EQ(s.block_indices, (std::vector<Indices>{{0, 1}, {2}, {3}, {4}, {5}, {6}, {7}}));
}

TEST(SmartSepLineAndBlock, JoinsOnlyWhileTheUnionGrowsByLessThanATenth) {
  // Two 100x20 boxes (and a far third so that a block may have two members):
  // a gap of 1 row adds 100 (5 %), a gap of 2 rows 200 (10 %).
  EXPECT_EQ(
      Separate({1000, 1000}, UprightRects({{0, 0, 100, 20}, {0, 21, 100, 20}, {800, 800, 10, 10}}))
          .block_indices,
      (std::vector<Indices>{{0, 1}, {2}}));
  EXPECT_EQ(
      Separate({1000, 1000}, UprightRects({{0, 0, 100, 20}, {0, 22, 100, 20}, {800, 800, 10, 10}}))
          .block_indices,
      (std::vector<Indices>{{0}, {1}, {2}}));
}

TEST(SmartSepLineAndBlock, TwoRectanglesNeverFormABlock) {
  // 40 % of two rectangles truncates to 0 members, so every scan stops at
  // once, before the growth test (and without its log line).
  ocr::log::ScopedCapture capture;
  const Separation s = Separate({1000, 1000}, UprightRects({{0, 0, 100, 20}, {0, 20, 100, 20}}));
  EXPECT_EQ(s.block_indices, (std::vector<Indices>{{0}, {1}}));
  for (const std::string& text : capture.Texts())
    EXPECT_EQ(text.find("INPAINT_BLOCK_TAG"), std::string::npos) << text;
}

TEST(SmartSepLineAndBlock, StopsGrowingPastFifteenPercentOfTheImage) {
  // 100x10 lines in a 100x100 image: two lines already cover 20 %.
  std::vector<cv::Rect> boxes;
  for (int k = 0; k < 10; ++k)
    boxes.emplace_back(0, 10 * k, 100, 10);
  const Separation s = Separate({100, 100}, UprightRects(boxes));
  EXPECT_EQ(s.block_indices, (std::vector<Indices>{{0, 1}, {2, 3}, {4, 5}, {6, 7}, {8, 9}}));
}

TEST(SmartSepLineAndBlock, BoxesWithoutAreaNeverSeedAndStopAScan) {
  std::vector<double> values = UprightRects(
      {{100, 100, 200, 20}, {100, 120, 200, 20}, {100, 140, 200, 20}, {100, 160, 200, 20}});
  // Line 1 has no height (truncated box height 0).
  values[5 + 3] = 0.4;
  const Separation s = Separate({1000, 1000}, values);
  EXPECT_EQ(s.block_indices, (std::vector<Indices>{{2, 3}, {0}, {1}}));
}

TEST(SmartSepLineAndBlock, ASingleRectangleStaysALine) {
  ocr::log::ScopedCapture capture;
  const std::vector<double> values = {50, 50, 40, 10, 0, 1, 2};
  const Separation s = Separate({100, 100}, values);
  EXPECT_EQ(s.line_indices, Indices{0});
  EXPECT_EQ(s.line_values, values);
  EXPECT_TRUE(s.block_indices.empty());
  EXPECT_TRUE(s.block_values.empty());
  EXPECT_TRUE(capture.Records().empty());

  const Separation none = Separate({100, 100}, {});
  EXPECT_TRUE(none.line_indices.empty());
  EXPECT_TRUE(none.line_values.empty());
  EXPECT_TRUE(none.block_indices.empty());
}

TEST(SmartSepLineAndBlock, SurvivesNonFiniteAndHugeRectangles) {
  const double nan = std::numeric_limits<double>::quiet_NaN();
  const std::vector<double> values = {nan, 10,  10,  10,  0,  10,  10,  1e300, 1e300, 0,
                                      1e9, 1e9, 4e9, 4e9, 45, 100, 100, 20,    20,    nan};
  const Separation s = Separate({200, 200}, values);
  size_t members = 0;
  for (const Indices& block : s.block_indices)
    members += block.size();
  EXPECT_EQ(members, 4u);
}

TEST(CutIntoVector, GathersGroupsInTheOrderGiven) {
  const std::vector<double> source = {0, 1, 2, 3, 4, 5, 6, 7, 8, 9};
  std::vector<double> out = {42};
  CutIntoVector(out, source, {4, 1, 1}, 2);
  EXPECT_EQ(out, (std::vector<double>{8, 9, 2, 3, 2, 3}));

  testing::internal::CaptureStdout();
  CutIntoVector(out, source, {1, 5}, 2);
  EXPECT_EQ(testing::internal::GetCapturedStdout(),
            "error in CutIntoVector exceed max dimension\n");
  EXPECT_EQ(out, (std::vector<double>{2, 3}));
}

}  // namespace
}  // namespace ocr_inpainting
