#pragma once

#include "renderer/render_records.h"

namespace ocr_ar {

// The text colour matched to the live frame the way its patch is: channels
// 0, 1 and 2 become scale[k] * channel + shift[k], clamped to 0..255 (NaN
// counts as 0) and truncated; the fourth byte (alpha) is kept. Without both
// a scale and a shift the colour is returned unchanged.
Color CorrectColor(const Color& color, const double* scale, const double* shift);

}  // namespace ocr_ar
