#include "inpainting/driver/line_block_separation.h"

#include <gtest/gtest.h>

#include <limits>
#include <string>
#include <vector>

#include <opencv2/core.hpp>

#include "common/log.h"

namespace ocr_inpainting {
namespace {

using Indices = std::vector<unsigned int>;

struct Separation {
  // Stale content, which must not survive.
  std::vector<std::vector<double>> block_values = {{1, 2, 3}};
  std::vector<double> line_values = {4};
  std::vector<Indices> block_indices = {{9}};
  Indices line_indices = {8};
};

Separation Separate(const cv::Size& image_size, const std::vector<double>& values) {
  Separation s;
  SmartSepLineAndBlock(cv::Mat(image_size, CV_8UC3, cv::Scalar::all(0)), values, s.block_values,
                       s.line_values, s.block_indices, s.line_indices);
  return s;
}

// Upright rectangles covering the given boxes.
std::vector<double> UprightRects(const std::vector<cv::Rect2d>& boxes) {
  std::vector<double> values;
  for (const cv::Rect2d& box : boxes) {
    values.insert(values.end(),
                  {box.x + box.width * 0.5, box.y + box.height * 0.5, box.width, box.height, 0.0});
  }
  return values;
}

std::vector<cv::Rect2d> Column(int count, int width, int height) {
  std::vector<cv::Rect2d> boxes;
  for (int k = 0; k < count; ++k)
    boxes.emplace_back(0, height * k, width, height);
  return boxes;
}

TEST(SmartSepLineAndBlock, StackedLinesFormBlocksOfAtMostFortyPercentPlusOne) {
  // Five touching 100x20 lines in a 1000x1000 image: at most 2 members may be
  // present when a third is considered, so 0, 1, 2 then 3, 4.
  const std::vector<double> values = UprightRects(Column(5, 100, 20));
  ocr::log::ScopedCapture capture;
  const Separation s = Separate({1000, 1000}, values);
  EXPECT_EQ(s.block_indices, (std::vector<Indices>{{0, 1, 2}, {3, 4}}));
  EXPECT_EQ(s.block_values,
            (std::vector<std::vector<double>>{{values.begin(), values.begin() + 15},
                                              {values.begin() + 15, values.end()}}));
  EXPECT_TRUE(s.line_indices.empty());
  EXPECT_TRUE(s.line_values.empty());

  const std::vector<std::string> expected_logs = {
      "kavoSmart start smart sep total 5", "kavoSmart start block sep",
      "kavoSmart sep block num 0",         "kavoSmart sep block Num 0, Ind 0",
      "kavoSmart sep block Num 0, Ind 1",  "kavoSmart sep block Num 0, Ind 2",
      "kavoSmart sep block num 1",         "kavoSmart sep block Num 1, Ind 0",
      "kavoSmart sep block Num 1, Ind 1",  "kavoSmart end smart sep"};
  EXPECT_EQ(capture.Texts(), expected_logs);
}

TEST(SmartSepLineAndBlock, FarApartLinesBecomeOneMemberBlocks) {
  const std::vector<double> values =
      UprightRects({{50, 50, 200, 30}, {600, 700, 200, 30}, {50, 400, 120, 20}});
  ocr::log::ScopedCapture capture;
  const Separation s = Separate({1000, 1000}, values);
  EXPECT_EQ(s.block_indices, (std::vector<Indices>{{0}, {1}, {2}}));
  ASSERT_EQ(s.block_values.size(), 3u);
  for (size_t k = 0; k < 3; ++k)
    EXPECT_EQ(s.block_values[k], std::vector<double>(&values[5 * k], &values[5 * k + 5])) << k;
  EXPECT_TRUE(s.line_indices.empty());
  EXPECT_TRUE(
      capture.Contains("INPAINT_BLOCK_TAG: block stopped at i = 0, j = 1", ocr::log::kInfo));
  EXPECT_TRUE(
      capture.Contains("INPAINT_BLOCK_TAG: block stopped at i = 1, j = 2", ocr::log::kInfo));
}

std::vector<Indices> Blocks(const cv::Size& image_size, const std::vector<cv::Rect2d>& boxes) {
  return Separate(image_size, UprightRects(boxes)).block_indices;
}

TEST(SmartSepLineAndBlock, AppliesTheJoiningRules) {
  const cv::Size page(1000, 1000);
  // Multi-line blocks come first.
  EXPECT_EQ(
      Blocks(page, {{700, 800, 150, 25}, {0, 100, 200, 20}, {0, 120, 200, 20}, {600, 50, 100, 20}}),
      (std::vector<Indices>{{1, 2}, {0}, {3}}));
  // The first refusal ends the block: line 3 would fit with 0 and 1, but
  // line 2 is far away.
  EXPECT_EQ(Blocks(page, {{0, 100, 200, 20},
                          {0, 120, 200, 20},
                          {700, 700, 100, 20},
                          {0, 140, 200, 20},
                          {800, 900, 50, 20}}),
            (std::vector<Indices>{{0, 1}, {2}, {3}, {4}}));
  // 100x20 boxes: a gap of 1 row grows the union by 5 % and joins, one of 2
  // rows by 10 % and does not.
  EXPECT_EQ(Blocks(page, {{0, 0, 100, 20}, {0, 21, 100, 20}, {800, 800, 10, 10}}),
            (std::vector<Indices>{{0, 1}, {2}}));
  EXPECT_EQ(Blocks(page, {{0, 0, 100, 20}, {0, 22, 100, 20}, {800, 800, 10, 10}}),
            (std::vector<Indices>{{0}, {1}, {2}}));
  // 40 % of two rectangles truncates to no member at all.
  EXPECT_EQ(Blocks(page, Column(2, 100, 20)), (std::vector<Indices>{{0}, {1}}));
  // Two 100x10 lines already cover 20 % of a 100x100 image.
  EXPECT_EQ(Blocks({100, 100}, Column(10, 100, 10)),
            (std::vector<Indices>{{0, 1}, {2, 3}, {4, 5}, {6, 7}, {8, 9}}));
  // A box without area (line 1's height truncates to 0) never seeds a block
  // and stops any scan that reaches it.
  EXPECT_EQ(
      Blocks(page, {{0, 100, 200, 20}, {0, 120, 200, 0.4}, {0, 140, 200, 20}, {0, 160, 200, 20}}),
      (std::vector<Indices>{{2, 3}, {0}, {1}}));
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

TEST(SmartSepLineAndBlock, PlacesEveryRectangleEvenWhenNotFinite) {
  const double nan = std::numeric_limits<double>::quiet_NaN();
  const std::vector<double> values = {nan, 10,  10,  10,  0,  10,  10,  1e300, 1e300, 0,
                                      1e9, 1e9, 4e9, 4e9, 45, 100, 100, 20,    20,    nan};
  size_t members = 0;
  for (const Indices& block : Separate({200, 200}, values).block_indices)
    members += block.size();
  EXPECT_EQ(members, 4u);
}

}  // namespace
}  // namespace ocr_inpainting
