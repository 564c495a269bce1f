#include "inpainting/structuring_elements.h"

#include <opencv2/imgproc.hpp>

namespace ocr_inpainting {
namespace {

const cv::Mat kEllipse4x4 = cv::getStructuringElement(cv::MORPH_ELLIPSE, cv::Size(4, 4));
const cv::Mat kEllipse2x2 = cv::getStructuringElement(cv::MORPH_ELLIPSE, cv::Size(2, 2));
const cv::Mat kCross3x3 = cv::getStructuringElement(cv::MORPH_CROSS, cv::Size(3, 3));

}  // namespace

const cv::Mat& Ellipse4x4Kernel() {
  return kEllipse4x4;
}
const cv::Mat& Ellipse2x2Kernel() {
  return kEllipse2x2;
}
const cv::Mat& Cross3x3Kernel() {
  return kCross3x3;
}

}  // namespace ocr_inpainting
