#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include <opencv2/core/mat.hpp>

// The inpainting request of the host, once its arrays are validated and
// copied by the bridge.
namespace ocr_inpainting {

// Number of rectangles in a host array of `length` doubles: length x 0.2,
// truncated (surplus values are left for the strategies to refuse).
int RequestRectCount(size_t length);

// Runs the pipeline on `image` and the flat rectangle values and answers the
// request: overlay i is assigned to *outputs[i] (sharing its data) and colour
// i packed into packed_colors[i] (see PackFontColor), for i below
// outputs.size(). Returns 0; the pipeline's non-zero status unchanged; or -1
// when the pipeline returned another number of overlays than outputs. On a
// non-zero result neither the outputs nor packed_colors are touched.
int AnswerInpaintingRequest(const cv::Mat& image, const std::vector<double>& rect_values,
                            const std::vector<cv::Mat*>& outputs,
                            std::vector<int32_t>& packed_colors);

}  // namespace ocr_inpainting
