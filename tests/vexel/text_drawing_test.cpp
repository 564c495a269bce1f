#include <algorithm>
#include <cmath>

#include "headless_scene.h"

namespace vexel_test {
namespace {

using Vexel::Font;
using Vexel::Text;

// Pixels lit by drawing over the black background, in rows first..last (all
// rows unless given); and how many pixels have full and partial red.
struct Ink {
  int count = 0;
  int left = 1 << 20, top = 1 << 20, right = -1, bottom = -1;  // inclusive
  Rgba brightest{0, 0, 0, 0};
  int full_red = 0;
  int partial_red = 0;
};

Ink FindInk(const Frame& frame, int first = 0, int last = -1) {
  Ink ink;
  int best = -1;
  for (int y = first; y <= (last < 0 ? frame.height - 1 : last); ++y) {
    for (int x = 0; x < frame.width; ++x) {
      const Rgba p = frame.At(x, y);
      ink.full_red += p[0] >= 250 ? 1 : 0;
      ink.partial_red += p[0] > 5 && p[0] < 250 ? 1 : 0;
      const int sum = p[0] + p[1] + p[2];
      if (sum <= 12)
        continue;
      ++ink.count;
      ink.left = std::min(ink.left, x);
      ink.right = std::max(ink.right, x);
      ink.top = std::min(ink.top, y);
      ink.bottom = std::max(ink.bottom, y);
      if (sum > best) {
        best = sum;
        ink.brightest = p;
      }
    }
  }
  return ink;
}

class TextDrawing : public HeadlessScene {
 protected:
  TextDrawing() : HeadlessScene(200, 120) {}

  // A text node `pixels_per_em` pixels to the em, its origin at scene (x, y).
  std::unique_ptr<Text> MakeText(const Font& font, const std::string& content, float pixels_per_em,
                                 float x, float y) {
    auto text = std::make_unique<Text>();
    text->setFont(font);
    text->setText(content);
    text->setColor(Vexel::Color(1.0f, 0.5f, 0.0f, 1.0f));
    text->initialize();
    text->setPosition(x, y, kDepth);
    text->setScale(pixels_per_em, pixels_per_em, 1);
    text->setParent(scene_->getRootNode());
    return text;
  }

  // Every lit pixel lies within `box` (in the text's units), give or take a
  // pixel of antialiasing.
  void ExpectInkWithin(const Ink& ink, const Text& text, const Vexel::Rect& box) const {
    const Vexel::Vector3 at = text.getPosition();
    const float s = text.getScale().x;
    EXPECT_GE(ink.left, std::floor(at.x + box.left * s + width_ / 2.0f) - 1);
    EXPECT_LE(ink.right, std::ceil(at.x + box.right * s + width_ / 2.0f) + 1);
    EXPECT_GE(ink.top, std::floor(height_ / 2.0f - (at.y + box.top * s)) - 1);
    EXPECT_LE(ink.bottom, std::ceil(height_ / 2.0f - (at.y + box.bottom * s)) + 1);
  }
};

TEST_F(TextDrawing, LatinTextDrawsInsideItsBoundingBoxInItsColourWithItsFontGone) {
  // The text keeps the font's face: the Font object may go first.
  auto font = std::make_unique<Font>("DejaVuSans.ttf", Font::FILE_TYPE_SYSTEM, true);
  auto text = MakeText(*font, "HIH", 40, -60, 20);
  font.reset();
  const Vexel::Rect box = text->getBoundingBox();
  EXPECT_EQ(text->getLineCount(), 1u);
  ASSERT_FALSE(box.isEmpty());

  const Ink ink = FindInk(Draw());
  ASSERT_GT(ink.count, 300);
  ExpectInkWithin(ink, *text, box);
  // Stems 40 pixels to the em are several pixels wide: fully covered pixels
  // show the colour itself.
  EXPECT_TRUE(Near(ink.brightest, {255, 128, 0, 255}, 4))
      << ::testing::PrintToString(ink.brightest);
  text->setText("Changed after");
  EXPECT_GT(FindInk(Draw()).count, 100);
}

TEST_F(TextDrawing, CjkTextFromAPlatformCollectionDrawsAndItsReferenceCharacterSizesTheLine) {
  Font font("NotoSansCJK-Regular.ttc", Font::FILE_TYPE_SYSTEM, true);
  auto text = MakeText(font, "中文字幕", 30, -60, 20);
  const float default_height = text->getBoundingBox().height();
  EXPECT_GT(default_height, 1.4f);  // the collection's tall ascender and descender

  font.setReferenceCharacter(0xFF41);
  const Vexel::Rect box = text->getBoundingBox();
  EXPECT_NEAR(box.height(), 1.0f, 1e-4f);  // one em: the fullwidth character's box
  EXPECT_NEAR(box.width(), 4.0f, 0.02f);   // four fullwidth advances

  const Ink ink = FindInk(Draw());
  EXPECT_GT(ink.count, 400);
  ExpectInkWithin(ink, *text, box);
}

TEST_F(TextDrawing, TheLineInkBoxDependsOnTheKindOfTextNotOnItsLetters) {
  Font font("NotoSans-Regular.ttf", Font::FILE_TYPE_SYSTEM, true);
  auto text = MakeText(font, "Salida", 40, -90, 20);
  const Vexel::Rect salida = text->getLineInkBox();
  text->setText("Mantener");
  EXPECT_EQ(text->getLineInkBox().top, salida.top);
  EXPECT_EQ(text->getLineInkBox().bottom, salida.bottom);

  // "Keep": its descender lies on the box's bottom edge.
  text->setText("Keep");
  EXPECT_NEAR(text->getInkBounds().bottom, text->getLineInkBox().bottom, 0.01f);

  // Capitals and digits: from the capitals' top to the baseline.
  text->setText("EXIT 42");
  const Vexel::Rect exit = text->getInkBounds();
  const float one_line = text->getLineInkBox().height();
  EXPECT_NEAR(text->getLineInkBox().bottom, exit.bottom, 0.01f);
  EXPECT_NEAR(text->getLineInkBox().top, exit.top, 0.01f);

  // Two lines: from the first line's top to the last line's bottom.
  text->setText("EXIT\nEXIT");
  EXPECT_NEAR(text->getLineInkBox().top, exit.top, 0.01f);
  EXPECT_NEAR(text->getLineInkBox().height(), one_line + text->getBoundingBox().height() / 2,
              1e-4f);

  // A CJK line: the ideographs' ink.
  Font cjk("NotoSansCJK-Regular.ttc", Font::FILE_TYPE_SYSTEM, true);
  cjk.setReferenceCharacter(0xFF41);
  text->setFont(cjk);
  text->setText("国");
  EXPECT_EQ(text->getLineInkBox().top, text->getInkBounds().top);
  EXPECT_EQ(text->getLineInkBox().bottom, text->getInkBounds().bottom);
  text->setText("");
  EXPECT_TRUE(text->getLineInkBox().isEmpty());
  EXPECT_TRUE(text->getInkBounds().isEmpty());
}

TEST_F(TextDrawing, ArabicTextDrawsRightToLeftStartingAtTheRight) {
  Font font("NotoSansArabic-Regular.ttf", Font::FILE_TYPE_SYSTEM, true);
  // Right-aligned at x = 60: a right-to-left paragraph puts its first word
  // at the right end, exactly where the word drawn alone lies.
  auto text = MakeText(font, "بيت", 30, 60, 10);
  text->setHorizontalAlignment(Text::ALIGN_RIGHT);
  const Frame word = Draw();
  const Ink alone = FindInk(word);
  ASSERT_GT(alone.count, 50);

  text->setText("بيت كبير جدا");
  const Frame sentence = Draw();
  const Ink whole = FindInk(sentence);
  EXPECT_LT(whole.left, alone.left - 30);  // the other words go to the left
  int differing = 0;
  for (int y = 0; y < word.height; ++y) {
    for (int x = alone.left; x <= alone.right; ++x)
      differing += Near(word.At(x, y), sentence.At(x, y), 8) ? 0 : 1;
  }
  EXPECT_EQ(differing, 0);
}

TEST_F(TextDrawing, GlyphEdgesStaySharpWhenTheNodeMagnifiesTheText) {
  // 600 pixels to the em: the "I" stem is about 60 pixels wide, far larger
  // than the glyph's raster. Across one row through it: a run of full
  // coverage with at most a pixel or two of partial coverage on each side.
  Font font("DejaVuSans.ttf", Font::FILE_TYPE_SYSTEM, true);
  auto text = MakeText(font, "I", 600, -100, 60 + 120);
  const Ink row = FindInk(Draw(), height_ / 2, height_ / 2);
  EXPECT_GT(row.full_red, 40);
  EXPECT_LE(row.partial_red, 4);
}

}  // namespace
}  // namespace vexel_test
