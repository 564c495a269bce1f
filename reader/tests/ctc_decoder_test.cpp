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
  // A space read twice with a blank between is one space.
  EXPECT_EQ(Decode(Steps({3, 3, 0, 1, 3, 0, 3, 2, 3})).text, "a b");
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

// Blank wins the step, with `space` on the space class.
std::vector<float> BlankStep(float space) {
  std::vector<float> step(kAlphabet.size(), 0.0F);
  step[0] = 1.0F - space;
  step[3] = space;
  return step;
}

TEST(DecodeCtc, AGapWhereASpaceIsLikelyIsAWordBoundary) {
  const auto read = [](float space) {
    std::vector<float> p = Steps({1, 1});
    const std::vector<float> gap = BlankStep(space);
    p.insert(p.end(), gap.begin(), gap.end());
    p.insert(p.end(), gap.begin(), gap.end());
    const std::vector<float> b = Steps({2});
    p.insert(p.end(), b.begin(), b.end());
    return Decode(p);
  };
  const Decoded spaced = read(0.3F);
  EXPECT_EQ(spaced.text, "a b");
  // The boundary is a judgement on the gap, not a character read: the line's
  // confidence is that of its letters.
  EXPECT_NEAR(spaced.confidence, 0.9F, 1e-6);
  ASSERT_EQ(spaced.characters.size(), 3U);
  EXPECT_EQ(spaced.characters[1].first_step, 2);
  // The letters of a word have next to no space between them.
  EXPECT_EQ(read(0.05F).text, "ab");
  // Nor is a gap before the first character or after the last a space.
  std::vector<float> ends = BlankStep(0.4F);
  const std::vector<float> a = Steps({1});
  ends.insert(ends.end(), a.begin(), a.end());
  const std::vector<float> tail = BlankStep(0.4F);
  ends.insert(ends.end(), tail.begin(), tail.end());
  EXPECT_EQ(Decode(ends).text, "a");
}

TEST(DecodeCtc, ClassesOfOneCharacterCountAsOne) {
  // Two space classes, as the English recogniser has: together they beat
  // the blank, though each alone does not.
  const Alphabet two_spaces{"", "a", " ", " "};
  const std::vector<float> p{0.1F, 0.9F, 0.0F,  0.0F,  0.4F, 0.0F,
                             0.3F, 0.3F, 0.05F, 0.95F, 0.0F, 0.0F};
  EXPECT_EQ(DecodeCtc(p.data(), 3, two_spaces).text, "a a");
  // Whichever of them wins, it is the one space after a likely gap.
  const std::vector<float> q{0.1F,  0.9F, 0.0F, 0.0F,  0.6F, 0.0F, 0.0F, 0.4F,
                             0.05F, 0.0F, 0.0F, 0.95F, 0.1F, 0.9F, 0.0F, 0.0F};
  EXPECT_EQ(DecodeCtc(q.data(), 4, two_spaces).text, "a a");
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
