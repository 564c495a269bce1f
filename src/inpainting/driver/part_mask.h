#pragma once

#include <opencv2/core/mat.hpp>

namespace ocr_inpainting {

// Edge mask of an RGB patch: 255 where the morphological gradient (4x4
// ellipse) of its grey image is above Otsu's threshold, 0 elsewhere.
// CV_8UC1 of the patch's size.
void GetPartMask(const cv::Mat& patch, cv::Mat& mask);

}  // namespace ocr_inpainting
