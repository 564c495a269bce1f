#include <gtest/gtest.h>

#include <opencv2/core.hpp>

#include "inpainting/analysis/binarization.h"
#include "inpainting/analysis/text_mask.h"

namespace {

using namespace ocr_inpainting;

// White boxes [x0, x1) x [y0, y1) on a black mask.
cv::Mat Boxes(cv::Size size, std::initializer_list<cv::Rect> boxes) {
  cv::Mat mask = cv::Mat::zeros(size, CV_8UC1);
  for (const cv::Rect& box : boxes)
    mask(box).setTo(255);
  return mask;
}

struct VerticalCase {
  const char* name;
  cv::Mat mask;
  bool worth_using;
  int column;
};

TEST(GetVerticalPartition, GapSearchAndInkTests) {
  const cv::Size size(100, 20);  // a gap must be wider than 10 columns
  const VerticalCase cases[] = {
      {"two words: split at the second", Boxes(size, {{5, 5, 25, 10}, {60, 5, 35, 10}}), true, 61},
      {"right piece under 10 % ink", Boxes(size, {{5, 5, 40, 10}, {80, 5, 3, 10}}), false, 100},
      {"left piece under 10 % ink", Boxes(size, {{2, 5, 3, 10}, {20, 5, 75, 10}}), false, 0},
      // The right piece holds 7 % ink, but a split at cols / 2 is not tested.
      {"split at half", Boxes({100, 40}, {{2, 10, 3, 20}, {49, 18, 46, 3}}), true, 50},
  };
  for (const VerticalCase& c : cases) {
    int column = -7;
    EXPECT_EQ(GetVerticalPartition(c.mask, &column), c.worth_using) << c.name;
    EXPECT_EQ(column, c.column) << c.name;
  }
  int column = -7;
  EXPECT_FALSE(GetVerticalPartition(Boxes(size, {{5, 5, 90, 10}}), &column));
  EXPECT_EQ(column, -7) << "one word: column unchanged";
}

TEST(GetVerticalPartition, TransitionCountWrapsModulo256) {
  // 128 stripes, 3 rows high: 256 transitions per column after the erosion,
  // which wrap to 0, so the word looks like a gap and the whole patch is one
  // quiet run starting at column 1 (an unwrapped count would split at 301).
  cv::Mat mask = cv::Mat::zeros(520, 1000, CV_8UC1);
  for (int k = 0; k < 128; ++k)
    mask(cv::Rect(300, 4 + 4 * k, 400, 3)).setTo(255);
  // Ink without transitions: one-pixel lines vanish in the erosion.
  for (int x = 20; x <= 80; x += 2)
    mask.col(x).setTo(255);
  int column = -7;
  EXPECT_FALSE(GetVerticalPartition(mask, &column));
  EXPECT_EQ(column, 0);
}

TEST(GetHorizontalPartition, SolidBandBetweenLines) {
  const cv::Size size(100, 60);  // a band must be more than 12 rows high
  int row = -7;
  EXPECT_TRUE(GetHorizontalPartition(
      Boxes(size, {{0, 5, 40, 15}, {0, 25, 100, 15}, {0, 45, 40, 10}}), &row));
  EXPECT_EQ(row, 40);
  row = -7;
  EXPECT_FALSE(GetHorizontalPartition(
      Boxes(size, {{0, 5, 40, 15}, {0, 25, 100, 15}, {0, 45, 10, 10}}), &row));
  EXPECT_EQ(row, 60) << "bottom piece under 10 % ink";
  row = -7;
  EXPECT_FALSE(GetHorizontalPartition(Boxes(size, {{0, 5, 79, 50}}), &row));
  EXPECT_EQ(row, -7) << "rows under 80 % white: no band";
}

TEST(GetLongestWordRange, PicksTheLargerSide) {
  const cv::Mat img(10, 40, CV_8UC1);
  const std::pair<int, cv::Range> cases[] = {
      {30, {0, 30}}, {20, {0, 20}}, {5, {5, 40}}, {-1, {0, 40}}, {40, {0, 40}}, {41, {0, 40}},
  };
  for (const auto& [partition, expected] : cases) {
    cv::Range rows, cols;
    GetLongestWordRange(img, partition, rows, cols);
    EXPECT_EQ(rows, cv::Range(0, 10));
    EXPECT_EQ(cols, expected) << partition;
  }
}

}  // namespace
