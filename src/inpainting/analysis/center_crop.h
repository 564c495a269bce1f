#pragma once

#include <opencv2/core/types.hpp>

namespace ocr_inpainting {

// The centre 80 % of a size of n rows or columns, [trunc(0.1 n), trunc(0.9 n)),
// or all of [0, n) when that range would be empty. The arbiter judges masks on
// this crop so that the patch's enlargement margins do not count.
inline cv::Range CenterCropRange(int n) {
  const int begin = static_cast<int>(n * 0.1);
  const int end = static_cast<int>(n * 0.9);
  if (begin < end)
    return cv::Range(begin, end);
  return cv::Range(0, n);
}

}  // namespace ocr_inpainting
