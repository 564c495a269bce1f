#pragma once

#include <opencv2/core/types.hpp>

namespace ocr_inpainting {

// The columns of a patch (`cols` wide) that hold the text whose colour is
// measured, given the vertical partition found by the mask analysis: a split
// in the right half keeps the left piece [0, p), one in the left half the
// right piece [p, cols); a partition outside the patch keeps all columns.
inline cv::Range FontColorColumns(int partition, int cols) {
  const int half = cols / 2;
  if (half <= partition && partition < cols)
    return cv::Range(0, partition);
  if (0 <= partition && partition < half)
    return cv::Range(partition, cols);
  return cv::Range(0, cols);
}

}  // namespace ocr_inpainting
