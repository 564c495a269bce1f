#pragma once

#include <opencv2/core/mat.hpp>

// The inpainting mask of an upright text patch (8-bit R, G, B): 255 on the
// pixels to erase and fill, 0 on those to keep, CV_8UC1 of the patch's size.
// Built from the filled outlines of the patch's edges, the font mask and the
// caller's part (edge) mask, then dilated so that the fill also covers
// anti-aliased stroke edges. All functions are re-entrant.
namespace ocr_inpainting {

// Makes `mask` and `font_mask` zero matrices of the patch size, computes the
// part mask with GetPartMask and runs GetInpaintingMask. Returns its status.
int GetMask(const cv::Mat& patch, cv::Mat& mask, cv::Mat& font_mask, int& vertical_partition);

// Writes the inpainting mask, the font mask and the vertical split column
// (the side holding the text, see GetLongestWordRange). The column is left as
// it was when the patch has no word gap, so callers start it outside
// [0, cols) (e.g. -1) to mean "no split". A patch below 4x4 is logged and
// left with its outputs as they were (returns -1); 0 otherwise.
// Whenever the mask would cover all but 3 pixels, a black one-pixel frame is
// drawn so that the fill keeps a border to draw from.
int GetInpaintingMask(const cv::Mat& patch, const cv::Mat& part_mask, cv::Mat& mask,
                      cv::Mat& font_mask, int& vertical_partition);

// Filled outer contours of the grey image's rising Sobel edges OR-ed with
// those of `part_mask`, written into `contour_mask` (allocated as zeros when
// it is not a CV_8UC1 matrix of the grey size). 0 on success, -1 on failure.
int GetContourMask(const cv::Mat& grey, const cv::Mat& part_mask, cv::Mat& contour_mask);

// Draws the filled outer contours of the binary image `src` (holes stay open)
// into *dst, which must be CV_8UC1 of the same size. No contour: a warning,
// *dst unchanged. Returns 0.
int FindMask(const cv::Mat& src, cv::Mat* dst);

// Looks for a solid band between two text lines (rows at least 80 % white, a
// band of more than 20 % of the height). Writes the split row when a band is
// found; returns whether the split is worth using (each piece >= 10 % ink).
bool GetHorizontalPartition(const cv::Mat& mask, int* row);

// Looks for a gap between words (columns with few transitions in the eroded
// mask, a gap wider than half the height). Writes the split column when a
// gap is found; returns whether the split is worth using (the smaller piece
// >= 10 % ink; otherwise the column is set to 0 or cols).
bool GetVerticalPartition(const cv::Mat& mask, int* column);

// Dilates the mask in place with the 4x4 ellipse, except for a two-pixel
// band at the left and right (and, below 21 rows, top and bottom) edges.
// Masks below 5x5 are left as they are, with a warning.
void PartialImgDilation(cv::Mat& mask);

}  // namespace ocr_inpainting
