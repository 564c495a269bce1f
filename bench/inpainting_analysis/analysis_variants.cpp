#include "analysis_variants.h"

#include <opencv2/imgproc.hpp>

#include "inpainting/analysis/binarization.h"
#include "inpainting/analysis/font_color.h"
#include "inpainting/analysis/text_mask.h"
#include "inpainting/driver/part_mask.h"

namespace analysis_variants {

using namespace ocr_inpainting;

MaskResult InpaintingMask(const cv::Mat& patch, SparseCount count, bool copy_into_font_mask) {
  MaskResult r;
  r.mask = cv::Mat::zeros(patch.size(), CV_8UC1);
  r.font_mask = cv::Mat::zeros(patch.size(), CV_8UC1);
  cv::Mat part_mask;
  GetPartMask(patch, part_mask);
  cv::Mat grey;
  cv::cvtColor(patch, grey, cv::COLOR_RGB2GRAY);
  cv::Mat contour_mask = cv::Mat::zeros(patch.size(), CV_8UC1);
  GetContourMask(grey, part_mask, contour_mask);
  GetFontMask(patch, r.font_mask, part_mask, contour_mask, r.font_mask, r.vertical_partition);
  if (contour_mask.cols >= 5) {
    contour_mask.colRange(0, 2).setTo(0);
    contour_mask.colRange(contour_mask.cols - 2, contour_mask.cols).setTo(0);
  }
  cv::add(part_mask, r.font_mask, r.mask);
  PartialImgDilation(r.mask);
  cv::Mat counted = r.mask.clone();
  if (count == SparseCount::kContourPlusDilatedSum)
    cv::add(contour_mask, r.mask, counted);
  r.sparse = cv::countNonZero(counted) < patch.rows * 0.05 * patch.cols;
  if (r.sparse) {
    contour_mask.copyTo(r.mask);
    PartialImgDilation(r.mask);
    if (copy_into_font_mask)
      contour_mask.copyTo(r.font_mask);
  }
  if (cv::countNonZero(255 - r.mask) < 4)
    cv::rectangle(r.mask, cv::Point(0, 0), cv::Point(patch.cols - 1, patch.rows - 1), 0);
  return r;
}

ColorResult FontColor(const cv::Mat& patch, const cv::Mat& inpaint_mask, const cv::Mat& inpainted,
                      const cv::Mat& font_mask, TextSelection selection, Fallback fallback) {
  const int y_margin = static_cast<int>(patch.rows * 0.1652173913043478);
  const int x_margin = static_cast<int>(patch.cols * 0.12380952380952384);
  const cv::Rect roi =
      cv::Rect(x_margin, y_margin, patch.cols - 2 * x_margin, patch.rows - 2 * y_margin) &
      cv::Rect(0, 0, patch.cols, patch.rows);
  cv::Mat diff;
  cv::absdiff(patch(roi), inpainted(roi), diff);
  cv::Mat squared;
  cv::multiply(diff, diff, squared, 1.5378700499807765e-05, CV_32F);
  cv::Mat distance;
  cv::transform(squared, distance, cv::Matx13f(1.f, 1.f, 1.f));
  double max_distance = 0;
  cv::minMaxLoc(distance, nullptr, &max_distance);
  cv::Mat weights;
  distance.convertTo(weights, CV_8U, max_distance > 0 ? 255.0 / max_distance : 0.0);

  cv::Mat second;
  switch (selection) {
    case TextSelection::kFontAndOtsuChange:
      cv::threshold(weights, second, 0, 255, cv::THRESH_BINARY | cv::THRESH_OTSU);
      break;
    case TextSelection::kFontAndInpaintMask:
      second = inpaint_mask(roi);
      break;
    case TextSelection::kFontAndAnyChange:
      second = weights > 0;
      break;
  }
  cv::Mat text = font_mask(roi) & second;
  if (cv::countNonZero(text) == 0)
    text = (fallback == Fallback::kInpaintMask ? inpaint_mask(roi) : font_mask(roi)).clone();
  const cv::Scalar background = cv::mean(patch(roi), 255 - text);
  cv::Mat text_weights;
  weights.copyTo(text_weights, text);

  ColorResult r;
  r.measured = GetWeightedMean(patch(roi), text_weights);
  DetectTextColor(patch(roi), text_weights, background, &r.final);
  return r;
}

}  // namespace analysis_variants
