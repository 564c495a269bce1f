#include "inpainting/driver/color_packing.h"

#include <cmath>

namespace ocr_inpainting {
namespace {

uint32_t ChannelByte(double value) {
  // nearbyint follows the current rounding mode, round-half-to-even by default.
  const double rounded = std::nearbyint(value);
  if (!(rounded > 0.0))
    return 0;
  if (rounded > 255.0)
    return 255;
  return static_cast<uint32_t>(rounded);
}

}  // namespace

int32_t PackFontColor(const cv::Scalar& color) {
  const uint32_t packed = 0xFF000000u | ChannelByte(color[2]) << 16 | ChannelByte(color[1]) << 8 |
                          ChannelByte(color[0]);
  return static_cast<int32_t>(packed);
}

}  // namespace ocr_inpainting
