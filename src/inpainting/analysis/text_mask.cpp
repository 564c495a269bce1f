#include "inpainting/analysis/text_mask.h"

#include "common/log.h"
#include "inpainting/analysis/binarization.h"
#include "inpainting/driver/part_mask.h"
#include "inpainting/structuring_elements.h"

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

namespace ocr_inpainting {
namespace {

constexpr int kMinMaskSize = 4;
constexpr int kMinDilationSize = 5;
// Columns at each side that are never dilated and are cleared of contours.
constexpr int kSideBandColumns = 2;
// Rows at the top and bottom kept out of the dilation of a short patch
// (fewer than kSmallPatchSide rows), so that it keeps border pixels on every
// side.
constexpr int kShortPatchRowMargin = 2;
// Text found on less than this share of the patch is too sparse to trust.
constexpr double kSparseTextShare = 0.05;
// The fill needs at least this many kept pixels to draw from.
constexpr int kMinKeptPixels = 4;

bool TooSmall(const cv::Mat& image, int min_size) {
  return image.cols < min_size || image.rows < min_size;
}

// Edge contours touching the left or right side belong to neighbouring
// content cut by the patch, not to the text: they are not erased.
void ClearSideBands(cv::Mat& contour_mask) {
  if (contour_mask.cols < kMinDilationSize) {
    OCR_LOGI("Inpainting_Process: Keep the same contour mask ");
    return;
  }
  contour_mask.colRange(0, kSideBandColumns).setTo(0);
  contour_mask.colRange(contour_mask.cols - kSideBandColumns, contour_mask.cols).setTo(0);
}

}  // namespace

void PartialImgDilation(cv::Mat& mask) {
  if (TooSmall(mask, kMinDilationSize)) {
    OCR_LOGW("Inpainting_Process: No dilation needed for 4*4 image. ");
    return;
  }
  const int margin = mask.rows < kSmallPatchSide ? kShortPatchRowMargin : 0;
  cv::Mat region = mask(cv::Range(margin, mask.rows - margin),
                        cv::Range(kSideBandColumns, mask.cols - kSideBandColumns));
  cv::dilate(region, region, Ellipse4x4Kernel(), cv::Point(-1, -1), 1, cv::BORDER_CONSTANT,
             cv::morphologyDefaultBorderValue());
}

int GetInpaintingMask(const cv::Mat& patch, const cv::Mat& part_mask, cv::Mat& mask,
                      cv::Mat& font_mask, int& vertical_partition) {
  if (TooSmall(patch, kMinMaskSize)) {
    OCR_LOGE("Inpainting_Process: input image of GetInpaintingMask() is too small");
    return -1;
  }
  cv::Mat grey;
  cv::cvtColor(patch, grey, cv::COLOR_RGB2GRAY);
  cv::Mat contour_mask = cv::Mat::zeros(patch.size(), CV_8UC1);
  GetContourMask(grey, part_mask, contour_mask);
  GetFontMask(patch, font_mask, part_mask, contour_mask, font_mask, vertical_partition);
  ClearSideBands(contour_mask);

  cv::add(part_mask, font_mask, mask);
  PartialImgDilation(mask);
  // The sparse test counts the union of the outlines and the dilated sum:
  // the text is distrusted only when both are sparse, and the outlines then
  // replace the mask. The font mask keeps the binarised strokes for the
  // colour. On generated patches the dilated sum alone as operand gave the
  // same masks, and also copying the outlines into the font mask gave
  // slightly worse colours (7 of 48 sparse patches changed, mean distance up).
  // The accuracy program in bench/inpainting_analysis reruns the comparison.
  cv::Mat combined;
  cv::add(contour_mask, mask, combined);
  if (cv::countNonZero(combined) < patch.rows * kSparseTextShare * patch.cols) {
    contour_mask.copyTo(mask);
    PartialImgDilation(mask);
  }

  cv::Mat kept = 255 - mask;
  if (cv::countNonZero(kept) < kMinKeptPixels) {
    cv::rectangle(mask, cv::Point(0, 0), cv::Point(patch.cols - 1, patch.rows - 1), cv::Scalar(0),
                  1, cv::LINE_8);
    OCR_LOGI(" Inpainting: after dilate is all white...");
  }
  return 0;
}

int GetMask(const cv::Mat& patch, cv::Mat& mask, cv::Mat& font_mask, int& vertical_partition) {
  mask = cv::Mat::zeros(patch.size(), CV_8UC1);
  font_mask = cv::Mat::zeros(patch.size(), CV_8UC1);
  cv::Mat part_mask;
  // A patch below the minimum is refused by GetInpaintingMask anyway; skipping
  // the part mask also keeps an empty patch from reaching cvtColor.
  if (!TooSmall(patch, kMinMaskSize))
    GetPartMask(patch, part_mask);
  return GetInpaintingMask(patch, part_mask, mask, font_mask, vertical_partition);
}

}  // namespace ocr_inpainting
