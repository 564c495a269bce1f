#pragma once

#include <cstdint>

// The records the renderer bridge builds from the host's arrays and hands to
// the scene handler, one set per translated text.
namespace ocr_ar {

// Where a quad or a text lies in the orthographic camera's space: origin at
// the centre of the camera window, x to the right, y upwards, one unit per
// screen pixel. The scales are the rectangle's sides along its own axes; the
// angle is counter-clockwise in degrees (the negated image angle, as image y
// runs downwards).
struct PositionScaleAngle {
  float x = 0.0f;
  float y = 0.0f;
  float scale_x = 1.0f;
  float scale_y = 1.0f;
  float angle = 0.0f;
};

// A text colour as the host packs it into a Java int: the channels in byte
// order from the least significant byte upwards, the fourth byte alpha
// (0xFF000000 | B << 16 | G << 8 | R is opaque R, G, B). The bridge works on
// these bytes (colour correction is byte arithmetic); the scene handler turns
// them into the kit's float Vexel::Color only where it hands a text its
// colour.
struct Color {
  std::uint8_t channel[4] = {0, 0, 0, 0xFF};

  static Color FromPacked(std::int32_t packed) {
    const auto bits = static_cast<std::uint32_t>(packed);
    Color color;
    for (int k = 0; k < 4; ++k)
      color.channel[k] = static_cast<std::uint8_t>((bits >> (8 * k)) & 0xFFu);
    return color;
  }
  std::int32_t Packed() const {
    std::uint32_t bits = 0;
    for (int k = 0; k < 4; ++k)
      bits |= static_cast<std::uint32_t>(channel[k]) << (8 * k);
    return static_cast<std::int32_t>(bits);
  }
};

// Opaque black, the colour of a text whose record is missing or unreadable.
inline constexpr std::int32_t kDefaultTextColor = static_cast<std::int32_t>(0xFF000000u);

// Where the background quad lies in normalised window units (-1..1 across
// the window, y up), in the order left, top, right, bottom. The scene
// handler keeps the quad's corners in this record; the bridge maps through
// them.
struct BackgroundCorners {
  float left = 1.0f;
  float top = 1.0f;
  float right = 1.0f;
  float bottom = 1.0f;

  bool FillsWindow() const {
    return left == -1.0f && top == 1.0f && right == 1.0f && bottom == -1.0f;
  }
};

// The inpainted patch under one text: an RGBA image owned by the host, its
// identifier (the patch is uploaded again only when it changes) and the
// per-channel colour correction that matches it to the live frame.
struct PatchRecord {
  std::int32_t id = -1;
  int width = 0;
  int height = 0;
  const void* data = nullptr;
  const double* color_scale = nullptr;  // 3 values or null
  const double* color_shift = nullptr;  // 3 values (0..255 units) or null
};

}  // namespace ocr_ar
