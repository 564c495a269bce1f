// Greedy CTC decoding and the character boxes placed from its steps.
#include <gtest/gtest.h>

#include "character_boxes.h"
#include "ctc_decoder.h"

namespace textreader {
namespace {

const Alphabet kAlphabet{"", "a", "b", " ", "中"};

// One step per entry: the class that wins it, with probability `p`.
std::vector<float> Steps(const std::vector<int>& best, float p = 0.9F) {
  std::vector<float> probabilities;
  for (const int b : best) {
    for (int c = 0; c < static_cast<int>(kAlphabet.size()); ++c)
      probabilities.push_back(c == b ? p : (1.0F - p) / (kAlphabet.size() - 1));
  }
  return probabilities;
}

Decoded Decode(const std::vector<float>& probabilities) {
  return DecodeCtc(probabilities.data(), static_cast<int>(probabilities.size() / kAlphabet.size()),
                   kAlphabet);
}

TEST(DecodeCtc, MergesRepeatsDropsBlanksAndKeepsRepeatsSplitByABlank) {
  const Decoded d = Decode(Steps({0, 1, 1, 0, 1, 2, 2, 2, 0, 0, 4}));
  EXPECT_EQ(d.text, "aab中");
  ASSERT_EQ(d.characters.size(), 4U);
  EXPECT_EQ(d.characters[0].first_step, 1);
  EXPECT_EQ(d.characters[0].last_step, 2);
  EXPECT_EQ(d.characters[2].text, "b");
  EXPECT_EQ(d.characters[2].first_step, 5);
  EXPECT_EQ(d.characters[2].last_step, 7);
  EXPECT_EQ(d.characters[3].text, "中");
}

TEST(DecodeCtc, KeepsInnerSpacesAndTrimsTheEnds) {
  EXPECT_EQ(Decode(Steps({3, 3, 0, 1, 3, 0, 3, 2, 3})).text, "a  b");
  const Decoded only_spaces = Decode(Steps({3, 0, 3}));
  EXPECT_EQ(only_spaces.text, "");
  EXPECT_EQ(only_spaces.confidence, 0.0F);
}

TEST(DecodeCtc, ConfidenceIsTheMeanOfTheEmittedCharacters) {
  std::vector<float> p = Steps({1, 0, 2});
  // The second character is less sure; blanks do not count.
  p[2 * kAlphabet.size() + 2] = 0.5F;
  p[1 * kAlphabet.size() + 0] = 0.3F;
  EXPECT_NEAR(Decode(p).confidence, (0.9F + 0.5F) / 2, 1e-6);
  EXPECT_EQ(Decode({}).text, "");
}

TEST(CharacterBoxes, SplitTheLineBetweenCharacterCentresAndSkipSpaces) {
  Reading reading;
  // 20 steps over the input, of which the crop fills the first half.
  reading.steps = 20;
  reading.content_share = 0.5F;
  reading.decoded.characters = {{"a", 1, 2}, {" ", 4, 4}, {"b", 7, 8}};
  const Corners line{cv::Point2f(0, 0), {100, 0}, {100, 10}, {0, 10}};
  const std::vector<CharacterBox> boxes = CharacterBoxes(reading, line);
  ASSERT_EQ(boxes.size(), 2U);
  EXPECT_EQ(boxes[0].text, "a");
  // Centres at steps 2, 4.5 and 8 of the 10 the crop spans: a from 0.75
  // to 3.25 steps, b from 6.25 to 9.75.
  EXPECT_NEAR(boxes[0].corners[0].x, 7.5F, 1e-4);
  EXPECT_NEAR(boxes[0].corners[1].x, 32.5F, 1e-4);
  EXPECT_NEAR(boxes[1].corners[0].x, 62.5F, 1e-4);
  EXPECT_NEAR(boxes[1].corners[1].x, 97.5F, 1e-4);
  EXPECT_NEAR(boxes[1].corners[2].y, 10.0F, 1e-4);
  EXPECT_TRUE(CharacterBoxes(Reading{}, line).empty());
}

}  // namespace
}  // namespace textreader
