#include "renderer/text_fitting.h"

#include <gtest/gtest.h>

namespace ocr_ar::text_fit {
namespace {

TEST(TextFit, CountsGapsBetweenCodePoints) {
  EXPECT_EQ(CountCharacterGaps(""), 0u);
  EXPECT_EQ(CountCharacterGaps("a"), 0u);
  EXPECT_EQ(CountCharacterGaps("Exit"), 3u);
  EXPECT_EQ(CountCharacterGaps("出口"), 1u);
  EXPECT_EQ(CountCharacterGaps("a ü"), 2u);
}

TEST(TextFit, ScaleIsLimitedByTheTighterSide) {
  // Line box 4 x 1.2 em.
  const Vexel::Rect bounds(-2.0f, 0.0f, 2.0f, -1.2f);
  // Wide box: height decides.
  EXPECT_FLOAT_EQ(FitScale(bounds, {1000.0f, 40.0f}), 40.0f * kHeightFill / 1.2f);
  // Narrow box: width decides.
  EXPECT_FLOAT_EQ(FitScale(bounds, {100.0f, 40.0f}), 100.0f * kWidthFill / 4.0f);
}

TEST(TextFit, NothingIsDrawnForEmptyTextsOrBoxes) {
  EXPECT_EQ(FitScale(Vexel::Rect(), {100.0f, 40.0f}), 0.0f);
  EXPECT_EQ(FitScale(Vexel::Rect(-1, 0, 1, -1), {0.0f, 40.0f}), 0.0f);
  EXPECT_EQ(FitScale(Vexel::Rect(-1, 0, 1, -1), {100.0f, -5.0f}), 0.0f);
}

TEST(TextFit, ShortTextsAreSpreadToThreeQuartersOfTheBox) {
  // 2 em wide, 1.2 em tall, 3 gaps; box 300 x 60: height scale 45 per em,
  // so the text would cover 90 of 282 usable units (32%).
  const float spacing = ChooseExtraSpacing(2.0f, 1.2f, 3, {300.0f, 60.0f});
  EXPECT_FLOAT_EQ(spacing, kMaxExtraSpacing);  // capped
  // A box only a little wider than the text: spread to exactly 75%.
  const float usable = 160.0f * kWidthFill;
  const float height_scale = 60.0f * kHeightFill / 1.2f;
  const float wanted = (kSpreadCoverage * usable / height_scale - 2.0f) / 3.0f;
  ASSERT_LT(wanted, kMaxExtraSpacing);
  EXPECT_FLOAT_EQ(ChooseExtraSpacing(2.0f, 1.2f, 3, {160.0f, 60.0f}), wanted);
}

TEST(TextFit, TextsCoveringEnoughOfTheBoxKeepTheirSpacing) {
  EXPECT_EQ(ChooseExtraSpacing(6.0f, 1.2f, 11, {300.0f, 60.0f}), 0.0f);
  EXPECT_EQ(ChooseExtraSpacing(2.0f, 1.2f, 0, {300.0f, 60.0f}), 0.0f);  // one character
  EXPECT_EQ(ChooseExtraSpacing(0.0f, 0.0f, 3, {300.0f, 60.0f}), 0.0f);
}

TEST(TextFit, SpreadTextStillFitsItsBox) {
  for (float box_width : {40.0f, 90.0f, 150.0f, 400.0f}) {
    const Vexel::Vector2 box(box_width, 30.0f);
    const float spacing = ChooseExtraSpacing(1.5f, 1.2f, 2, box);
    const float width = 1.5f + 2 * spacing;
    const float scale = FitScale(Vexel::Rect(-width / 2, 0, width / 2, -1.2f), box);
    EXPECT_LE(width * scale, box_width * kWidthFill + 1e-3f) << box_width;
    EXPECT_LE(1.2f * scale, 30.0f * kHeightFill + 1e-3f) << box_width;
  }
}

TEST(TextFit, CentreOffsetFollowsTheRotation) {
  // Bounds centred at (0, -0.6) em; scale 10 turns that into (0, -6).
  const Vexel::Rect bounds(-2.0f, 0.0f, 2.0f, -1.2f);
  const Vexel::Vector2 flat = CentreOffset(bounds, 10.0f, 0.0f);
  EXPECT_NEAR(flat.x, 0.0f, 1e-5f);
  EXPECT_NEAR(flat.y, -6.0f, 1e-5f);
  const Vexel::Vector2 turned = CentreOffset(bounds, 10.0f, 90.0f);
  EXPECT_NEAR(turned.x, 6.0f, 1e-5f);
  EXPECT_NEAR(turned.y, 0.0f, 1e-5f);
}

}  // namespace
}  // namespace ocr_ar::text_fit
