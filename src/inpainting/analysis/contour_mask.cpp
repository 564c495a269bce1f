#include "common/log.h"
#include "inpainting/analysis/binarization.h"
#include "inpainting/analysis/text_mask.h"
#include "inpainting/structuring_elements.h"

#include <climits>
#include <vector>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

// findContours and drawContours as in OpenCV 3.4: since 3.2 the source is
// left untouched and traced with a one-pixel zero border added internally,
// and a filled contour drawn with its hierarchy leaves its holes open. 4.6
// does the same, so the part mask can be traced here and still be used
// unchanged afterwards.
namespace ocr_inpainting {
int FindMask(const cv::Mat& src, cv::Mat* dst) {
  std::vector<std::vector<cv::Point>> contours;
  std::vector<cv::Vec4i> hierarchy;
  cv::findContours(src, contours, hierarchy, cv::RETR_CCOMP, cv::CHAIN_APPROX_SIMPLE,
                   cv::Point(0, 0));
  if (contours.empty()) {
    OCR_LOGW("Inpainting: No contours found");
    return 0;
  }
  // Top level only; each outer contour is drawn with its holes through the
  // hierarchy, so the holes stay open.
  for (int i = 0; i >= 0; i = hierarchy[i][0]) {
    cv::drawContours(*dst, contours, i, cv::Scalar(255, 255, 255), cv::FILLED, cv::LINE_8,
                     hierarchy, INT_MAX);
  }
  return 0;
}

int GetContourMask(const cv::Mat& grey, const cv::Mat& part_mask, cv::Mat& contour_mask) {
  cv::Mat edges;
  RGBSobel(grey, &edges);
  cv::Mat filled = cv::Mat::zeros(grey.size(), CV_8UC1);
  // A dilation would merge the strokes of a small patch.
  if (grey.cols >= kSmallPatchSide && grey.rows >= kSmallPatchSide) {
    cv::dilate(edges, edges, Ellipse2x2Kernel(), cv::Point(-1, -1), 1, cv::BORDER_CONSTANT,
               cv::morphologyDefaultBorderValue());
  }
  FindMask(edges, &filled);

  if (contour_mask.size() != grey.size() || contour_mask.type() != CV_8UC1)
    contour_mask = cv::Mat::zeros(grey.size(), CV_8UC1);
  if (FindMask(part_mask, &contour_mask) != 0) {
    OCR_LOGE(" Inpainting_Process: Error in FindMask for Inpainting");
    return -1;
  }
  cv::bitwise_or(filled, contour_mask, contour_mask);
  return 0;
}

}  // namespace ocr_inpainting
