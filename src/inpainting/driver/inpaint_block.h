#pragma once

#include <vector>

#include <opencv2/core/mat.hpp>
#include <opencv2/core/types.hpp>

namespace ocr_inpainting {

// Erases a group of neighbouring text lines in one enclosing patch: cuts the
// block (longest side capped at 360) from `image` (CV_8UC3, R, G, B), builds
// each line's text mask inside the block's edge mask, fills the whole block
// once, then cuts every line's RGBA overlay out of the block overlay and
// measures its text colour. overlays[i] and colors[i] belong to rects[i]: both
// must already hold one slot per rectangle (the block strategy sizes them),
// as the lines write into them in parallel. Returns 0, or -1 when there is
// no rectangle or the block patch is smaller than 4x4 (the slots then stay
// as they are).
int InpaintImgBlockVersion(const cv::Mat& image, const std::vector<cv::RotatedRect>& rects,
                           std::vector<cv::Mat>& overlays, std::vector<cv::Scalar>& colors);

}  // namespace ocr_inpainting
