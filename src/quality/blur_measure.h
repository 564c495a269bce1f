#pragma once

#include <opencv2/core.hpp>

namespace image_quality {

// Sharpness of an RGBA 8-bit image: the standard deviation (not the
// variance) of the Laplacian of its grey version. Small for blurred images,
// 0.0 for uniform ones. Errors from OpenCV (a wrong image type) propagate.
double CalculateBlur(const cv::Mat& rgba);

}  // namespace image_quality
