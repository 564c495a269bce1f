#pragma once

#include <cstdint>

#include <opencv2/core/types.hpp>

namespace ocr_inpainting {

// The text colour as the host reads it: 0xFF000000 | c2 << 16 | c1 << 8 | c0,
// where c0..c2 are channels 0..2 of `color` (R, G, B) rounded to the nearest
// integer, ties to even, and clamped to 0..255 (NaN counts as 0). Read as an
// Android ARGB int this is an ABGR packing; the host unpacks it accordingly.
int32_t PackFontColor(const cv::Scalar& color);

}  // namespace ocr_inpainting
