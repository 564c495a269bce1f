#pragma once

#include <opencv2/core/mat.hpp>

// Structuring elements shared by the mask analysis and the fill. They are
// built once when the library is loaded and only read afterwards, so the
// pipeline's worker threads use them without locking.
namespace ocr_inpainting {

// 4x4 MORPH_ELLIPSE: mask dilation and the block edge mask.
const cv::Mat& Ellipse4x4Kernel();
// 2x2 MORPH_ELLIPSE: contour dilation and the arbiter's erosion.
const cv::Mat& Ellipse2x2Kernel();
// 3x3 MORPH_CROSS: erosion before the word-gap search.
const cv::Mat& Cross3x3Kernel();

}  // namespace ocr_inpainting
