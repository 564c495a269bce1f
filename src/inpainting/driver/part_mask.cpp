#include "inpainting/driver/part_mask.h"

#include <opencv2/imgproc.hpp>

#include "inpainting/structuring_elements.h"

namespace ocr_inpainting {

void GetPartMask(const cv::Mat& patch, cv::Mat& mask) {
  cv::Mat grey;
  cv::cvtColor(patch, grey, cv::COLOR_RGB2GRAY);
  cv::Mat gradient;
  cv::morphologyEx(grey, gradient, cv::MORPH_GRADIENT, Ellipse4x4Kernel(), cv::Point(-1, -1), 1,
                   cv::BORDER_CONSTANT, cv::morphologyDefaultBorderValue());
  cv::threshold(gradient, mask, 0, 255, cv::THRESH_BINARY | cv::THRESH_OTSU);
}

}  // namespace ocr_inpainting
