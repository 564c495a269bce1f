#pragma once

#include <cmath>
#include <limits>

// Conversions for values that come straight from the host's rectangle arrays
// and may be NaN, infinite or far outside the int range. A plain cast is
// undefined behaviour there; these saturate the way ARM's conversion
// instructions do on the phones (NaN becomes 0).
namespace ocr_inpainting {

// Truncation toward zero, saturated to the int range.
inline int SaturatingTruncToInt(double value) {
  if (std::isnan(value))
    return 0;
  if (value >= static_cast<double>(std::numeric_limits<int>::max()))
    return std::numeric_limits<int>::max();
  if (value <= static_cast<double>(std::numeric_limits<int>::min()))
    return std::numeric_limits<int>::min();
  return static_cast<int>(value);
}

// Narrowing of a double to float; values beyond the float range become
// infinite (what IEEE rounding gives) instead of undefined behaviour.
inline float NarrowToFloat(double value) {
  constexpr double kMax = std::numeric_limits<float>::max();
  if (value > kMax)
    return std::numeric_limits<float>::infinity();
  if (value < -kMax)
    return -std::numeric_limits<float>::infinity();
  return static_cast<float>(value);
}

}  // namespace ocr_inpainting
