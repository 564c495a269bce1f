#pragma once

#include <cstddef>

#include <opencv2/core/mat.hpp>

namespace ocr_inpainting {

// Per-channel mean and standard deviation of `image` inside each rotated
// rectangle of `rect_values` (five doubles per rectangle; surplus values are
// ignored). The host passes a half-resolution image with full-resolution
// rectangles, so centres and sizes are halved before use; angles are kept.
// With ch channels, element i * ch + c of `means` / `std_devs` receives
// channel c of rectangle i; both arrays must hold exactly ch * count values
// (otherwise -1, logged, nothing written). A rectangle outside the image
// gives zeros. Rectangles are measured in parallel. Returns 0 on success.
int CalculateRectMeansStdDevs(const cv::Mat& image, const double* rect_values, size_t rect_length,
                              double* means, size_t means_length, double* std_devs,
                              size_t std_devs_length);

}  // namespace ocr_inpainting
