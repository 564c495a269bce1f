#pragma once

#include <opencv2/core/types.hpp>

#include "inpainting/analysis/binarization.h"

namespace ocr_inpainting {

// The columns of a patch (`cols` wide) that hold the text whose colour is
// measured, given the vertical partition found by the mask analysis: the
// side the analysis itself treats as the text's (a split in the right half
// keeps the left piece [0, p), one in the left half the right piece
// [p, cols); a partition outside the patch keeps all columns).
inline cv::Range FontColorColumns(int partition, int cols) {
  return LongestWordColumns(partition, cols);
}

}  // namespace ocr_inpainting
