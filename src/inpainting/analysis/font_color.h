#pragma once

#include <opencv2/core/mat.hpp>

// The text colour of an upright patch: a weighted mean of its text pixels
// inside the text box without the enlargement margins, each weighted by how
// much the fill changed it, forced to readable contrast against the mean of
// the non-text pixels. Re-entrant.
namespace ocr_inpainting {

// patch and inpainted: CV_8UC3 R, G, B of equal size (inpainted = the patch
// after the fill). inpaint_mask and font_mask: CV_8UC1 0/255 of the patch
// size, as GetMask writes them. Sets `color` (R, G, B in 0..255; black when
// nothing can be measured). 0 on success, -1 when no colour could be measured.
int GetFontColor(const cv::Mat& patch, const cv::Mat& inpaint_mask, const cv::Mat& inpainted,
                 const cv::Mat& font_mask, cv::Scalar& color);

// Weighted mean of `image` under `weights`, forced to contrast against
// `background`. An empty image gives black and a non-zero result; 0 otherwise.
int DetectTextColor(const cv::Mat& image, const cv::Mat& weights, const cv::Scalar& background,
                    cv::Scalar* color);

// Per-channel sum(src * weights) / sum(weights) of a 3-channel image under a
// one-channel weight map of its size. (0, 0, 0, 0) on a zero weight sum, bad
// channel counts or mismatched sizes (each logged).
cv::Scalar GetWeightedMean(const cv::Mat& src, const cv::Mat& weights);

}  // namespace ocr_inpainting
