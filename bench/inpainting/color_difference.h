#pragma once

#include <opencv2/core.hpp>

namespace ocr_bench {

// CIE L*a*b* (D65) of a gamma-encoded sRGB colour, channels R, G, B in 0..255.
cv::Vec3d SrgbToLab(const cv::Scalar& rgb);

// CIEDE2000 colour difference of two Lab colours (kL = kC = kH = 1).
double Ciede2000(const cv::Vec3d& lab1, const cv::Vec3d& lab2);

}  // namespace ocr_bench
