#pragma once

#include <opencv2/core.hpp>

// The two choices left open in the analysis, rebuilt from the public
// functions so that the accuracy program can compare them with the library's
// own choice on the same patches. The first value of each enum is the one
// the library uses.
namespace analysis_variants {

// Operands of the 5 % sparse-text test in the inpainting mask.
enum class SparseCount {
  kContourPlusDilatedSum,  // library: union of outlines and dilated sum
  kDilatedSumOnly,         // the dilated sum alone
};

struct MaskResult {
  cv::Mat mask;
  cv::Mat font_mask;
  int vertical_partition = -1;
  bool sparse = false;
};

// The inpainting mask with the given sparse rule; `copy_into_font_mask` also
// copies the outlines into the font mask in the sparse case.
MaskResult InpaintingMask(const cv::Mat& patch, SparseCount count, bool copy_into_font_mask);

// Second operand of the AND that selects the text pixels for the colour.
enum class TextSelection {
  kFontAndOtsuChange,   // library: font mask AND Otsu level of the change
  kFontAndInpaintMask,  // font mask AND inpainting mask
  kFontAndAnyChange,    // font mask AND change > 0
};
// Mask used when that AND is empty.
enum class Fallback { kInpaintMask, kFontMask };

struct ColorResult {
  cv::Scalar measured;  // weighted mean before the contrast rule
  cv::Scalar final;     // after the contrast rule
};

ColorResult FontColor(const cv::Mat& patch, const cv::Mat& inpaint_mask, const cv::Mat& inpainted,
                      const cv::Mat& font_mask, TextSelection selection, Fallback fallback);

}  // namespace analysis_variants
