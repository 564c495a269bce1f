#include "renderer/color_correction.h"

#include <cmath>

namespace ocr_ar {
namespace {

std::uint8_t ClampToByte(double value) {
  if (std::isnan(value) || value <= 0.0)
    return 0;
  if (value >= 255.0)
    return 255;
  return static_cast<std::uint8_t>(value);
}

}  // namespace

Color CorrectColor(const Color& color, const double* scale, const double* shift) {
  if (scale == nullptr || shift == nullptr)
    return color;
  Color corrected = color;
  for (int k = 0; k < 3; ++k)
    corrected.channel[k] = ClampToByte(scale[k] * color.channel[k] + shift[k]);
  return corrected;
}

}  // namespace ocr_ar
