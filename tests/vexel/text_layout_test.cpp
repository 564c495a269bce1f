#include <gtest/gtest.h>

#include <algorithm>

#include "distance_field.h"
#include "font_face.h"
#include "text_layout.h"
#include "unicode_text.h"

namespace Vexel::internal {
namespace {

std::shared_ptr<FontFace> Face(const char* file) {
  return FontFace::Load(file, Font::FILE_TYPE_SYSTEM, nullptr);
}

// The x of the first placed glyph for this character.
float XOf(const TextLayout& layout, const FontFace& face, char32_t c) {
  hb_codepoint_t glyph = 0;
  hb_font_get_nominal_glyph(face.hb_font(), c, &glyph);
  for (const PlacedGlyph& placed : layout.glyphs) {
    if (placed.glyph == glyph)
      return placed.x;
  }
  ADD_FAILURE() << "no glyph for U+" << std::hex << static_cast<std::uint32_t>(c);
  return 0.0f;
}

class TextLayoutTest : public ::testing::Test {
 protected:
  // Laid out left-aligned with no container width: no wrapping.
  TextLayout LayOut(const std::u32string& text, float extra = 0.0f,
                    const FontFace* face = nullptr) {
    LayoutParams params;
    params.extra_spacing = extra;
    const FontFace& used = face != nullptr ? *face : *latin_;
    params.line = used.DefaultLineMetrics();
    return LayOutText(text, used, params);
  }

  std::shared_ptr<FontFace> latin_ = Face("DejaVuSans.ttf");
};

TEST(UnicodeText, InvalidUtf8BecomesReplacementCharacters) {
  EXPECT_EQ(DecodeUtf8("a\xC3\xA9z"), U"a\u00E9z");
  EXPECT_EQ(DecodeUtf8("\xF0\x9F\x98\x80"), U"\U0001F600");
  EXPECT_EQ(DecodeUtf8("a\xFFz"), U"a\uFFFDz");        // never a lead byte
  EXPECT_EQ(DecodeUtf8("\xC0\xAF"), U"\uFFFD\uFFFD");  // overlong
  EXPECT_EQ(DecodeUtf8("\xED\xA0\x80"), U"\uFFFD");    // a surrogate
  EXPECT_EQ(DecodeUtf8("ab\xE4\xB8"), U"ab\uFFFD");    // cut short
  EXPECT_EQ(EncodeUtf8(U"a\u00E9\u4E2D\U0001F600"), "a\xC3\xA9\xE4\xB8\xAD\xF0\x9F\x98\x80");
}

TEST(UnicodeText, NormalizingComposesFoldsSpaceAndDropsControls) {
  EXPECT_EQ(NormalizeForDisplay(U"  e\u0301\t\tx\r\ny\u3000z  "), U"\u00E9 x y z");
  EXPECT_EQ(NormalizeForDisplay(U"a\u0007b\u001Fc\u0085"), U"abc");
  // Marks with no precomposed form stay as they are; joiners stay.
  EXPECT_EQ(NormalizeForDisplay(U"q\u0308\u200Dy"), U"q\u0308\u200Dy");
  EXPECT_EQ(NormalizeForDisplay(U" \n\t "), U"");
}

TEST_F(TextLayoutTest, LinesThatCouldCollapseOrOverflowGetTrueBounds) {
  const TextLayout empty = LayOut(U"");
  EXPECT_EQ(empty.line_count, 0u);
  EXPECT_TRUE(empty.glyphs.empty());
  EXPECT_EQ(empty.bounds, Rect());
  // A reference character the font lacks leaves the default line.
  const LineMetrics line = latin_->DefaultLineMetrics();
  EXPECT_FLOAT_EQ(latin_->ReferenceLineMetrics(0x4E2D).height(), line.height());
  // A stack of combining marks rises far above the ascender.
  const TextLayout marks = LayOut(U"a\u0301\u0301\u0301\u0301\u0301");
  EXPECT_GT(marks.bounds.top, 0.0f);
  EXPECT_FLOAT_EQ(marks.bounds.bottom, -line.height());
}

TEST_F(TextLayoutTest, ExtraSpaceGoesBetweenCharactersAndTrailingSpacesTakeNoRoom) {
  const float plain = LayOut(U"abc").bounds.width();
  EXPECT_NEAR(LayOut(U"abc", 0.25f).bounds.width(), plain + 0.5f, 1e-4f);
  EXPECT_NEAR(LayOut(U"abc   ").bounds.width(), plain, 1e-4f);
  // A combining mark is part of its base's character: no space before it.
  const float composed = LayOut(U"\u00E9a", 0.25f).bounds.width();
  EXPECT_NEAR(LayOut(U"e\u0301a", 0.25f).bounds.width(), composed, 0.02f);
}

TEST_F(TextLayoutTest, MixedDirectionRunsAreOrderedForDisplay) {
  // Hebrew inside a left-to-right paragraph: the Latin word first, then the
  // Hebrew word read from its right end.
  const TextLayout mixed = LayOut(U"abc \u05D0\u05D1\u05D2");
  EXPECT_LT(XOf(mixed, *latin_, U'c'), XOf(mixed, *latin_, U'\u05D2'));
  EXPECT_GT(XOf(mixed, *latin_, U'\u05D0'), XOf(mixed, *latin_, U'\u05D2'));
  // A right-to-left paragraph with a Latin word: the Latin word reads left
  // to right, to the left of the Hebrew word that precedes it.
  const TextLayout rtl = LayOut(U"\u05D0\u05D1 abc");
  EXPECT_LT(XOf(rtl, *latin_, U'a'), XOf(rtl, *latin_, U'b'));
  EXPECT_LT(XOf(rtl, *latin_, U'c'), XOf(rtl, *latin_, U'\u05D1'));
}

TEST_F(TextLayoutTest, ArabicLettersJoin) {
  auto arabic = Face("NotoSansArabic-Regular.ttf");
  // Beh alone and beh joined to a following letter are different glyphs.
  const TextLayout alone = LayOut(U"\u0628", 0.0f, arabic.get());
  const TextLayout joined = LayOut(U"\u0628\u0628", 0.0f, arabic.get());
  ASSERT_EQ(joined.glyphs.size(), 2u);
  EXPECT_NE(joined.glyphs[0].glyph, alone.glyphs[0].glyph);
  EXPECT_NE(joined.glyphs[1].glyph, alone.glyphs[0].glyph);
}

// A wrapped paragraph must lay out in time linear in its length. Alternating
// scripts in a container a quarter em wide make one run and one line per
// character; a layout that visits the whole paragraph for every line (as it
// once did) needs hours for this text, past any test timeout, while a linear
// one takes seconds. The length is what makes this test able to fail.
TEST_F(TextLayoutTest, AParagraphWrappedAtEveryCharacterLaysOutInLinearTime) {
  const std::shared_ptr<FontFace> cjk = Face("NotoSansCJK-Regular.ttc");
  constexpr std::size_t kPairs = 500000;
  std::u32string text;
  text.reserve(2 * kPairs);
  for (std::size_t i = 0; i < kPairs; ++i)
    text += U"a\u5B57";
  LayoutParams params;
  params.container = Rect(0.0f, 0.0f, 0.25f, -1.0f);
  params.line = cjk->ReferenceLineMetrics(0xFF41);
  const TextLayout layout = LayOutText(text, *cjk, params);
  ASSERT_EQ(layout.glyphs.size(), 2 * kPairs);
  // One character per line, each line below the one before.
  EXPECT_GT(layout.glyphs[0].y, layout.glyphs[1].y);
  EXPECT_GT(layout.glyphs[2 * kPairs - 2].y, layout.glyphs[2 * kPairs - 1].y);
}

TEST(DistanceFieldTest, EncodesSignedPixelDistancesAroundTheOutline) {
  // A 10 x 10 filled square whose left column is half covered.
  std::vector<std::uint8_t> coverage(100, 255);
  for (int y = 0; y < 10; ++y)
    coverage[static_cast<std::size_t>(y) * 10] = 128;
  const DistanceField field = ComputeDistanceField(coverage.data(), 10, 10, 10, 8);
  ASSERT_EQ(field.width, 26);
  ASSERT_EQ(field.height, 26);
  auto at = [&](int x, int y) { return static_cast<int>(field.texels[y * 26 + x]); };
  const int row = 13;
  EXPECT_NEAR(at(8, row), 128, 1);           // the half-covered column holds the outline
  EXPECT_NEAR(at(4, row), 128 - 64, 1);      // four pixels out
  EXPECT_NEAR(at(12, row), 128 + 64, 1);     // four pixels in
  EXPECT_EQ(at(0, row), 0);                  // the spread's far end, clamped
  EXPECT_NEAR(at(13, 13), 128 + 5 * 16, 1);  // five pixels from the right edge
  // Every row through the square rises monotonically towards the middle.
  for (int x = 1; x <= 13; ++x)
    EXPECT_GE(at(x, row), at(x - 1, row));
}

}  // namespace
}  // namespace Vexel::internal
