#pragma once

#include <vector>

#include <opencv2/core/mat.hpp>
#include <opencv2/core/types.hpp>

// Cutting rotated rectangles out of an image as upright patches.
//
// Conventions: image coordinates have x to the right and y down, pixel
// centres at integer coordinates. A rectangle's corners are those of
// cv::RotatedRect::points (the same order in OpenCV 3 and 4): for angle 0,
// corner 0 is bottom-left, 1 top-left, 2 top-right, 3 bottom-right. The patch
// of a rectangle maps its point (0, h) to corner 0, (0, 0) to corner 1 and
// (w, 0) to corner 2, so the rectangle's width runs along the patch's x axis
// whatever its angle. Transforms are 2x3 CV_64F matrices from patch to image
// coordinates, which is why every warp passes WARP_INVERSE_MAP.
namespace ocr_inpainting {

// Longest patch side of a single line and of a block of lines.
inline constexpr int kLinePatchCap = 240;
inline constexpr int kBlockPatchCap = 360;

// Patch size (sides rounded up) and patch-to-image transform of `rect`. A
// longer side above `cap` becomes exactly `cap` and the other keeps the ratio,
// rounded down; the same image region is then mapped onto the smaller patch.
void GetSizeAndTransform(const cv::RotatedRect& rect, cv::Size& size, cv::Mat& transform, int cap);

// Upright patch of `rect` (cubic interpolation, replicated border), capped at
// kLinePatchCap. A rectangle without positive sides leaves `patch` untouched.
void GetWarpedImage(const cv::Mat& image, const cv::RotatedRect& rect, cv::Mat& patch);

// The same cut applied to every image, so that a patch and its masks stay
// pixel-aligned. `patches` gets one entry per image (empty for a rectangle
// without positive sides).
void GetWarpedImageVector(const std::vector<cv::Mat>& images, const cv::RotatedRect& rect,
                          std::vector<cv::Mat>& patches);

// Expresses rectangles given in image coordinates in the frame whose mapping
// to the image is `transform` (2x3). Each result is the smallest box around
// the mapped corners, described with an angle in [-45, 45] so that its width
// stays the side that was the width for near-axis-aligned text.
void WarpPositions(const cv::Mat& transform, const std::vector<cv::RotatedRect>& rects,
                   std::vector<cv::RotatedRect>& out);

// One rectangle, at the mean angle of `rects`, around all of them. `rects`
// must not be empty.
cv::RotatedRect ComputeBoundingRect(const std::vector<cv::RotatedRect>& rects);

}  // namespace ocr_inpainting
