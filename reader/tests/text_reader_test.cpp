// The whole reader with the installed models: rendered lines at every
// turn, and real photographs.
#include <cmath>
#include <limits>
#include <map>
#include <memory>

#include <gtest/gtest.h>
#include <opencv2/imgproc.hpp>

#include "test_images.h"
#include "textreader/text_reader.h"

namespace textreader {
namespace {

using textreader_test::Photo;
using textreader_test::RenderedText;

// One reader per option set for the whole binary: loading takes a while.
const TextReader& Reader(Script script = Script::kLatin, bool character_boxes = false) {
  static std::map<std::pair<Script, bool>, std::unique_ptr<TextReader>> readers;
  auto& reader = readers[{script, character_boxes}];
  if (!reader) {
    ReaderOptions options;
    options.model_dir = TEXTREADER_MODEL_DIR;
    options.script = script;
    options.character_boxes = character_boxes;
    reader = std::make_unique<TextReader>(options);
  }
  return *reader;
}

float AngleDifference(float a, float b) {
  const float d = std::fmod(std::abs(a - b), 360.0F);
  return std::min(d, 360.0F - d);
}

std::string AllText(const std::vector<TextLine>& lines) {
  std::string text;
  for (const TextLine& line : lines)
    text += line.text + "\n";
  return text;
}

class TurnedLine : public testing::TestWithParam<float> {};

TEST_P(TurnedLine, ReadsTheTextWithItsAngleAndCentre) {
  const float angle = GetParam();
  const cv::Point2f centre(320, 320);
  const cv::Mat image = RenderedText("OPEN DAILY TO NINE", {640, 640}, centre, 1.6, angle);
  const std::vector<TextLine> lines = Reader().Read(image);
  ASSERT_EQ(lines.size(), 1U) << AllText(lines);
  const TextLine& line = lines[0];
  EXPECT_EQ(line.text, "OPEN DAILY TO NINE");
  EXPECT_LT(AngleDifference(line.rect.angle, angle), 3.0F) << line.rect.angle;
  EXPECT_LT(cv::norm(line.rect.center - centre), 8.0);
  EXPECT_GT(line.rect.size.width, 4 * line.rect.size.height);
  EXPECT_GT(line.confidence, 0.8F);
  EXPECT_LE(line.confidence, 1.0F);
  // The first corner is where the reader starts: before the centre along
  // the reading direction, above it across.
  const float radians = angle * static_cast<float>(CV_PI / 180.0);
  const cv::Point2f along(std::cos(radians), std::sin(radians));
  const cv::Point2f down(-along.y, along.x);
  EXPECT_LT((line.corners[0] - line.rect.center).dot(along), 0);
  EXPECT_LT((line.corners[0] - line.rect.center).dot(down), 0);
}

// Upright, tilted both ways, upside down (both signs of 180 are the same
// turn), and running down and up the page.
INSTANTIATE_TEST_SUITE_P(Angles, TurnedLine,
                         testing::Values(0.0F, 12.0F, -25.0F, 180.0F, 170.0F, 90.0F, -90.0F));

TEST(TextReader, ReadsLinesOfAPageInReadingOrder) {
  cv::Mat page(400, 640, CV_8UC3, cv::Scalar(250, 250, 250));
  const char* rows[] = {"FIRST LINE HERE", "SECOND ONE", "THIRD AND LAST"};
  for (int i = 0; i < 3; ++i)
    cv::putText(page, rows[i], cv::Point(40, 90 + 110 * i), cv::FONT_HERSHEY_DUPLEX, 1.4,
                cv::Scalar(10, 10, 10), 2, cv::LINE_AA);
  const std::vector<TextLine> lines = Reader().Read(page);
  ASSERT_EQ(lines.size(), 3U) << AllText(lines);
  // The font's wide word spaces sometimes read as a stray mark: the words
  // are what counts here.
  EXPECT_EQ(lines[0].text, "FIRST LINE HERE");
  EXPECT_EQ(lines[1].text.substr(0, 7), "SECOND ");
  EXPECT_EQ(lines[1].text.substr(lines[1].text.size() - 4), " ONE");
  EXPECT_EQ(lines[2].text, "THIRD AND LAST");
}

TEST(TextReader, ReadsRgbAndRgbaAlikeAndNothingOnABlankOrNoisyImage) {
  const cv::Mat image = RenderedText("EXIT 12", {320, 160}, {160, 80}, 1.5, 0);
  cv::Mat rgba;
  cv::cvtColor(image, rgba, cv::COLOR_RGB2RGBA);
  EXPECT_EQ(AllText(Reader().Read(rgba)), "EXIT 12\n");
  EXPECT_TRUE(Reader().Read(cv::Mat(300, 400, CV_8UC3, cv::Scalar(90, 140, 200))).empty());
  cv::Mat noise(300, 400, CV_8UC3);
  cv::randn(noise, cv::Scalar::all(128), cv::Scalar::all(10));
  EXPECT_TRUE(Reader().Read(noise).empty());
}

TEST(TextReader, CharacterBoxesLieInOrderAlongTheLine) {
  const cv::Mat image = RenderedText("ABC XYZ", {400, 200}, {200, 100}, 1.8, 0);
  const std::vector<TextLine> lines = Reader(Script::kLatin, true).Read(image);
  ASSERT_EQ(lines.size(), 1U);
  const std::vector<CharacterBox>& boxes = lines[0].characters;
  ASSERT_EQ(boxes.size(), 6U);  // the space has none
  std::string letters;
  for (std::size_t i = 0; i < boxes.size(); ++i) {
    letters += boxes[i].text;
    EXPECT_LT(boxes[i].corners[0].x, boxes[i].corners[1].x);
    EXPECT_GE(boxes[i].corners[0].x, lines[0].corners[0].x - 1);
    EXPECT_LE(boxes[i].corners[1].x, lines[0].corners[1].x + 1);
    if (i > 0) {
      EXPECT_GE(boxes[i].corners[0].x, boxes[i - 1].corners[1].x - 1);
    }
  }
  EXPECT_EQ(letters, "ABCXYZ");
  // The gap of the space lies between C and X.
  EXPECT_GT(boxes[3].corners[0].x - boxes[2].corners[1].x, 5);
  EXPECT_TRUE(Reader().Read(image)[0].characters.empty());
}

TEST(TextReader, ReadsRealPhotographs) {
  // A book cover photographed at a slant, and incidental street text.
  const std::string cover = AllText(Reader().Read(Photo("book_cover.jpg")));
  EXPECT_NE(cover.find("John Steinbeck"), std::string::npos) << cover;
  EXPECT_NE(cover.find("The Grapes of Wrath"), std::string::npos) << cover;
  const std::vector<TextLine> street = Reader().Read(Photo("street_exit.jpg"));
  ASSERT_FALSE(street.empty());
  EXPECT_NE(AllText(street).find("EXIT"), std::string::npos) << AllText(street);
}

TEST(TextReader, ReadsAPhotographTurnedUpsideDown) {
  cv::Mat turned;
  cv::rotate(Photo("book_cover.jpg"), turned, cv::ROTATE_180);
  const std::vector<TextLine> lines = Reader().Read(turned);
  const std::string text = AllText(lines);
  EXPECT_NE(text.find("The Grapes of Wrath"), std::string::npos) << text;
  for (const TextLine& line : lines) {
    if (line.text == "The Grapes of Wrath") {
      EXPECT_GT(std::abs(line.rect.angle), 170.0F);
    }
  }
}

TEST(TextReader, ChineseRecogniserReadsLatinTooWithoutItsSpaces) {
  // OpenCV draws no Chinese glyphs: Latin through the Chinese model, which
  // reads it with its own dictionary (and without spaces between words).
  const cv::Mat image = RenderedText("HOTEL 88", {400, 200}, {200, 100}, 1.6, 0);
  const std::vector<TextLine> lines = Reader(Script::kChinese).Read(image);
  ASSERT_EQ(lines.size(), 1U);
  std::string squeezed;
  for (const char c : lines[0].text)
    if (c != ' ')
      squeezed += c;
  EXPECT_EQ(squeezed, "HOTEL88");
}

TEST(TextReader, WithoutRecognitionGivesTheLinesWithoutText) {
  ReaderOptions options;
  options.model_dir = TEXTREADER_MODEL_DIR;
  options.recognise = false;
  const TextReader reader(options);
  const std::vector<TextLine> lines =
      reader.Read(RenderedText("LOOK HERE", {400, 200}, {200, 100}, 1.6, 180));
  ASSERT_EQ(lines.size(), 1U);
  EXPECT_EQ(lines[0].text, "");
  EXPECT_EQ(lines[0].confidence, 0.0F);
  EXPECT_GT(std::abs(lines[0].rect.angle), 175.0F);  // classified all the same
}

// The reader flushes denormal floats to zero while its networks run, which
// makes them several times faster; the thread that calls it (a JVM's, say)
// must get its own float handling back, from making a reader and from reading.
TEST(TextReader, LeavesTheCallingThreadsFloatHandlingAsItWas) {
  const auto denormal_survives = [] {
    volatile float tiny = std::numeric_limits<float>::min();
    tiny = tiny / 4.0F;
    return tiny > 0.0F;
  };
  ASSERT_TRUE(denormal_survives());
  ReaderOptions options;
  options.model_dir = TEXTREADER_MODEL_DIR;
  const TextReader reader(options);
  EXPECT_TRUE(denormal_survives()) << "after making a reader";
  EXPECT_EQ(reader.Read(RenderedText("LOOK HERE", {400, 200}, {200, 100}, 1.6, 0)).size(), 1U);
  EXPECT_TRUE(denormal_survives()) << "after reading";
}

}  // namespace
}  // namespace textreader
