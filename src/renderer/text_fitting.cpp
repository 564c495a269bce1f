#include "renderer/text_fitting.h"

#include <algorithm>
#include <cmath>

namespace ocr_ar::text_fit {

unsigned int CountCharacterGaps(const std::string& utf8) {
  unsigned int code_points = 0;
  for (const char byte : utf8) {
    // Every byte but a continuation byte (10xxxxxx) starts a code point.
    if ((static_cast<unsigned char>(byte) & 0xC0u) != 0x80u)
      ++code_points;
  }
  return code_points > 0 ? code_points - 1 : 0;
}

Vexel::Rect FittedBox(const Vexel::Rect& bounds, const Vexel::Rect& line_ink,
                      const Vexel::Rect& ink) {
  // Only the heights of the ink boxes count: a line ink box of spaces alone
  // has no width but a height.
  const bool has_line_ink = line_ink.top > line_ink.bottom;
  const bool has_ink = !ink.isEmpty();
  if (bounds.isEmpty() || (!has_line_ink && !has_ink))
    return bounds;
  float top = has_line_ink ? line_ink.top : ink.top;
  float bottom = has_line_ink ? line_ink.bottom : ink.bottom;
  if (has_ink) {
    top = std::max(top, ink.top);
    bottom = std::min(bottom, ink.bottom);
  }
  return {bounds.left, top, bounds.right, bottom};
}

float ChooseExtraSpacing(float natural_width, float height, unsigned int gaps,
                         const Vexel::Vector2& box) {
  if (gaps == 0 || !(natural_width > 0.0f) || !(height > 0.0f) || !(box.x > 0.0f) ||
      !(box.y > 0.0f)) {
    return 0.0f;
  }
  const float usable_width = box.x * kWidthFill;
  const float height_scale = box.y * kHeightFill / height;
  const float target_width = kSpreadCoverage * usable_width / height_scale;  // text units
  if (natural_width >= target_width)
    return 0.0f;
  return std::min((target_width - natural_width) / static_cast<float>(gaps), kMaxExtraSpacing);
}

float FitScale(const Vexel::Rect& bounds, const Vexel::Vector2& box) {
  if (bounds.isEmpty() || !(box.x > 0.0f) || !(box.y > 0.0f))
    return 0.0f;
  return std::min(box.x * kWidthFill / bounds.width(), box.y * kHeightFill / bounds.height());
}

Vexel::Vector2 CentreOffset(const Vexel::Rect& bounds, float scale, float angle_degrees) {
  const float cx = (bounds.left + bounds.right) / 2.0f * scale;
  const float cy = (bounds.top + bounds.bottom) / 2.0f * scale;
  const float radians = Vexel::Degrees(angle_degrees).valueRadians();
  const float c = std::cos(radians);
  const float s = std::sin(radians);
  return {cx * c - cy * s, cx * s + cy * c};
}

}  // namespace ocr_ar::text_fit
