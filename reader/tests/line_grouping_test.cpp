// Word boxes into lines, and the order a reader reads the lines in.
#include <gtest/gtest.h>

#include "box_geometry.h"
#include "line_grouping.h"

namespace textreader {
namespace {

TextLine Word(const std::string& text, cv::Point2f centre, cv::Size2f size, float angle = 0,
              float confidence = 0.9F) {
  TextLine word;
  word.corners = ReadingCorners({centre, size, angle});
  if (std::abs(angle) > 90)
    word.corners = TurnedHalfway(ReadingCorners({centre, size, angle - 180}));
  word.rect = RectFromCorners(word.corners);
  word.text = text;
  word.confidence = confidence;
  return word;
}

std::vector<std::string> Texts(const std::vector<TextLine>& lines) {
  std::vector<std::string> texts;
  for (const TextLine& line : lines)
    texts.push_back(line.text);
  return texts;
}

TEST(GroupIntoLines, JoinsWordsOfOneLineIntoOneRectangleInReadingOrder) {
  // Given right to left; gaps of half a height.
  const std::vector<TextLine> lines = GroupIntoLines(
      {Word("there", {170, 50}, {60, 20}, 0, 0.6F), Word("hello", {100, 50}, {60, 20})});
  ASSERT_EQ(lines.size(), 1U);
  EXPECT_EQ(lines[0].text, "hello there");
  EXPECT_NEAR(lines[0].rect.center.x, 135, 1e-3);
  EXPECT_NEAR(lines[0].rect.size.width, 130, 1e-3);
  EXPECT_NEAR(lines[0].rect.size.height, 20, 1e-3);
  EXPECT_NEAR(lines[0].confidence, 0.75F, 1e-5);
  EXPECT_NEAR(lines[0].corners[0].x, 70, 1e-3);
  EXPECT_NEAR(lines[0].corners[0].y, 40, 1e-3);
}

TEST(GroupIntoLines, JoinsATiltedAndAnUpsideDownLineAlongTheirDirection) {
  const cv::Point2f along(std::cos(0.3F), std::sin(0.3F));  // about 17 degrees
  const float degrees = 0.3F * 180.0F / static_cast<float>(CV_PI);
  std::vector<TextLine> lines =
      GroupIntoLines({Word("a", cv::Point2f(100, 100), {40, 16}, degrees),
                      Word("b", cv::Point2f(100, 100) + along * 50, {40, 16}, degrees)});
  ASSERT_EQ(lines.size(), 1U);
  EXPECT_EQ(lines[0].text, "a b");
  EXPECT_NEAR(lines[0].rect.angle, degrees, 0.01);
  // Upside down the reader meets the right-hand word first.
  lines =
      GroupIntoLines({Word("a", {100, 100}, {40, 16}, 180), Word("b", {150, 100}, {40, 16}, 180)});
  ASSERT_EQ(lines.size(), 1U);
  EXPECT_EQ(lines[0].text, "b a");
  EXPECT_NEAR(std::abs(lines[0].rect.angle), 180, 0.01);
}

TEST(GroupIntoLines, KeepsApartWhatDoesNotContinueALine) {
  const TextLine left = Word("left", {100, 50}, {60, 20});
  // Far along, on the next line, of another size, on another slant, upside
  // down, or lying on it.
  for (const TextLine& other :
       {Word("far", {190, 50}, {60, 20}), Word("below", {170, 75}, {60, 20}),
        Word("big", {170, 50}, {60, 40}), Word("slant", {170, 50}, {60, 20}, 15),
        Word("turned", {170, 50}, {60, 20}, 180), Word("on", {110, 50}, {60, 20})}) {
    EXPECT_EQ(GroupIntoLines({left, other}).size(), 2U) << other.text;
  }
  EXPECT_TRUE(GroupIntoLines({}).empty());
}

TEST(GroupIntoLines, DropsABoxWithinTheLineOfTheWordsAroundIt) {
  // A small box in the gap, lower than the words: not part of the line, but
  // inside it once the words are joined.
  const std::vector<TextLine> lines =
      GroupIntoLines({Word("left", {100, 50}, {60, 20}), Word("-", {136, 53}, {8, 8}),
                      Word("right", {170, 50}, {60, 20})});
  EXPECT_EQ(Texts(lines), std::vector<std::string>{"left right"});
}

TEST(SortReadingOrder, TopToBottomThenLeftToRightWithinARow) {
  // A slightly uneven row of two columns above a line.
  std::vector<TextLine> lines{
      Word("bottom", {100, 200}, {100, 20}), Word("right", {300, 48}, {100, 20}),
      Word("left", {100, 54}, {100, 20}), Word("middle", {200, 120}, {100, 20})};
  SortReadingOrder(lines);
  EXPECT_EQ(Texts(lines), (std::vector<std::string>{"left", "right", "middle", "bottom"}));
}

}  // namespace
}  // namespace textreader
