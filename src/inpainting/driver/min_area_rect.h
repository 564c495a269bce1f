#pragma once

#include <vector>

#include <opencv2/core/types.hpp>

namespace ocr_inpainting {

// cv::minAreaRect as OpenCV 3 reports it. The pipeline was tuned on OpenCV 3,
// which gives a box with more than two hull points an angle in [-90, 0);
// OpenCV 4.5.1 and later describe the same box with an angle in (0, 90] and,
// below 90, width and height swapped. Boxes of one or two hull points (zero
// height) come out the same in both and pass through unchanged.
cv::RotatedRect MinAreaRectOpenCv3(const std::vector<cv::Point2f>& points);

}  // namespace ocr_inpainting
