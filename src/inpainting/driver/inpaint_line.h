#pragma once

#include <opencv2/core/mat.hpp>
#include <opencv2/core/types.hpp>

namespace ocr_inpainting {

// Erases the text of one upright line patch (CV_8UC3, R, G, B, at least 4x4):
// finds its text mask, fills it, writes the RGBA overlay of the patch's size
// to *overlay and the text colour (R, G, B) measured on the text's side of
// the vertical partition to `color`. Returns 0.
int InpaintImg(const cv::Mat& patch, cv::Mat* overlay, cv::Scalar& color);

}  // namespace ocr_inpainting
