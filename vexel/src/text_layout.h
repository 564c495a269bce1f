#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "font_face.h"
#include "vexel/Math.h"
#include "vexel/Text.h"

namespace Vexel::internal {

struct LayoutParams {
  Rect container;
  Text::HorizontalAlignment alignment = Text::ALIGN_LEFT;
  float extra_spacing = 0.0f;  // text units between neighbouring characters
  LineMetrics line;
};

// A glyph with its origin (on the baseline) in text units, y upwards.
struct PlacedGlyph {
  std::uint32_t glyph = 0;
  float x = 0.0f;
  float y = 0.0f;
};

struct TextLayout {
  std::vector<PlacedGlyph> glyphs;  // in drawing order, line after line
  std::size_t line_count = 0;
  Rect bounds;  // line boxes and glyph ink, text units
  Rect ink;     // glyph ink alone; empty when no glyph has ink
  float first_baseline = 0.0f;
  float last_baseline = 0.0f;
};

// Paragraphs split at line breaks; each is ordered by the bidirectional
// algorithm (base direction from its first strong character), shaped per
// run of one script and direction, broken into lines that fit the
// container's width (when it has one: at spaces and around CJK characters,
// never inside a word) and placed by the alignment. Trailing spaces of a
// line take no room.
TextLayout LayOutText(const std::u32string& text, const FontFace& face, const LayoutParams& params);

}  // namespace Vexel::internal
