#pragma once

#include <opencv2/core/mat.hpp>

// Erasing the text of an upright patch and turning the result into an RGBA
// overlay that can be laid over the live camera image without a seam.
namespace ocr_inpainting {

// Patches at least this many rows high are filled at half resolution: a
// quarter of the cost, and the blur it brings is hidden by the alpha ramp.
inline constexpr int kHalfResolutionFillRows = 21;

// Fills the pixels where `mask` is non-zero from their surroundings (Telea,
// radius 3). `filled` gets the patch's size and type.
void InpaintingThreshold(const cv::Mat& patch, const cv::Mat& mask, cv::Mat& filled);

// Overlay = the three channels of `filled` plus an alpha that is 255 within
// distance 3 of the mask's text pixels and falls linearly to 0 at distance
// d_max, the patch's largest distance to the text clamped to 4..20 (so the
// ramp is never steeper than 255 per pixel, and a patch with little text
// never turns opaque far from it). Beyond d_max alpha stays 0; an all-zero
// mask gives a fully transparent overlay.
void AddAlphaChannel(const cv::Mat& filled, const cv::Mat& mask, cv::Mat* overlay);

}  // namespace ocr_inpainting
