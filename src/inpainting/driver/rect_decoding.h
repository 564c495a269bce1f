#pragma once

#include <vector>

#include <opencv2/core/types.hpp>

// The host sends rotated rectangles as flat arrays of doubles, five per
// rectangle: centre x, centre y (pixels, x right, y down), width, height and
// angle in degrees in cv::RotatedRect's convention.
namespace ocr_inpainting {

// One cv::RotatedRect per complete group of five values (surplus values are
// ignored; fewer than five give none). Every field is narrowed to float on
// its own.
std::vector<cv::RotatedRect> TransformVector2RotatedRect(const std::vector<double>& values);

}  // namespace ocr_inpainting
