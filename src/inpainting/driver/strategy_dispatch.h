#pragma once

#include <vector>

#include <opencv2/core/mat.hpp>
#include <opencv2/core/types.hpp>

// The strategies that turn one inpainting request into one RGBA overlay and
// one text colour (R, G, B) per rectangle, in the request's order. All take
// the camera image (CV_8UC3, R, G, B) and the flat rectangle values (five per
// rectangle) and run their per-block or per-line work in parallel on TBB.
namespace ocr_inpainting {

// Entry of the inpainting request. Refuses a request that no strategy could
// serve (empty image, a value count that is zero or not a multiple of five,
// an image that is not CV_8UC3) with -1 and the strategies' message,
// leaving the outputs untouched; otherwise runs the smart version and
// returns 0.
int InpaintingRotImg(const cv::Mat& image, const std::vector<double>& values,
                     std::vector<cv::Mat>& overlays, std::vector<cv::Scalar>& colors);

// Groups the rectangles into blocks (SmartSepLineAndBlock), erases blocks and
// lines in parallel and puts the results back in request order. A block or
// line that fails leaves its overlays empty and its colours black. Returns 0.
int InpaintingRotImgSmartVersion(const cv::Mat& image, const std::vector<double>& values,
                                 std::vector<cv::Mat>& overlays, std::vector<cv::Scalar>& colors);

// Erases all rectangles as one block. -1 on a refused request; 0 with the
// outputs untouched for an image below 4x4; otherwise the block fill's status.
int InpaintingRotImgBlockVersion(const cv::Mat& image, const std::vector<double>& values,
                                 std::vector<cv::Mat>& overlays, std::vector<cv::Scalar>& colors);

// Erases every rectangle on its own, in parallel. -1 on a refused request or
// when a line fails; 0 with the outputs untouched for an image below 4x4;
// 0 otherwise. A cut patch below 4x4 gets a fully transparent overlay.
int InpaintingRotImgLineVersion(const cv::Mat& image, const std::vector<double>& values,
                                std::vector<cv::Mat>& overlays, std::vector<cv::Scalar>& colors);

}  // namespace ocr_inpainting
