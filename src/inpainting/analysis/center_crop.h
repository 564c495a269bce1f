#pragma once

#include <opencv2/core/types.hpp>

namespace ocr_inpainting {

// The centre 80 % of a size of n rows or columns, [trunc(0.1 n), trunc(0.9 n)),
// or all of [0, n) when that range would be empty. The arbiter judges masks on
// this crop so that the patch's enlargement margins do not count.
cv::Range CenterCropRange(int n);

}  // namespace ocr_inpainting
