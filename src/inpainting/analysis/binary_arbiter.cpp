#include "common/log.h"
#include "inpainting/analysis/binarization.h"
#include "inpainting/analysis/center_crop.h"
#include "inpainting/structuring_elements.h"

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

namespace ocr_inpainting {
namespace {

int CountDifferences(const cv::Mat& a, const cv::Mat& b) {
  cv::Mat diff;
  cv::absdiff(a, b, diff);
  return cv::countNonZero(diff);
}

}  // namespace

bool ValidBinaryResultCheck(cv::Mat mask, int total) {
  const int count = cv::countNonZero(mask);
  return total * 0.1 < count && count < total * 0.9;
}

void GetBinaryImgNormalized(const cv::Mat& ref, const cv::Mat& candidate, cv::Mat& mask) {
  const cv::Range rows = CenterCropRange(ref.rows);
  const cv::Range cols = CenterCropRange(ref.cols);
  const int total = rows.size() * cols.size();
  const bool font_mask_check = ValidBinaryResultCheck(mask(rows, cols), total);
  const bool bw_candidate_check = ValidBinaryResultCheck(candidate(rows, cols), total);
  OCR_LOGI("INPAINT_TAG: font_mask_check: %d, bw_candidate_check: %d .", font_mask_check ? 1 : 0,
           bw_candidate_check ? 1 : 0);

  const bool same_matrix =
      candidate.data == mask.data && candidate.size() == mask.size() && candidate.step == mask.step;
  if (!font_mask_check && bw_candidate_check) {
    if (!same_matrix)
      candidate.copyTo(mask);
    return;
  }
  if (!bw_candidate_check) {
    OCR_LOGI("Inpainting_Process: use default font_mask");
    return;
  }
  // Both plausible: the one closer to the eroded outline of the text wins;
  // a tie keeps the current mask, and so does a small patch, whose outline
  // is too coarse to decide.
  if (same_matrix || ref.rows < kSmallPatchSide || ref.cols < kSmallPatchSide)
    return;
  // Eroded as a copy: when ref is a region of a larger mask (one part of a
  // split patch), the pixels around the region must not take part.
  cv::Mat eroded_ref = ref.clone();
  cv::erode(eroded_ref, eroded_ref, Ellipse2x2Kernel(), cv::Point(-1, -1), 1, cv::BORDER_CONSTANT,
            cv::morphologyDefaultBorderValue());
  const int candidate_count = CountDifferences(candidate, eroded_ref);
  const int mask_count = CountDifferences(mask, eroded_ref);
  if (mask_count > candidate_count)
    candidate.copyTo(mask);
}

}  // namespace ocr_inpainting
