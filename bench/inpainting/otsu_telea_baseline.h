#pragma once

#include <vector>

#include <opencv2/core.hpp>

namespace ocr_bench {

// The erase a user would write without the engine: for every rectangle, the
// pixels inside it split by Otsu's threshold (the smaller class taken as the
// text, grown by one pixel), filled with Telea at full resolution, written
// back into the frame inside the rectangle; the text colour is the mean of
// the text pixels. Rectangles are processed one after the other.
struct BaselineResult {
  cv::Mat frame;  // the frame with every rectangle erased
  std::vector<cv::Scalar> colors;
};

BaselineResult OtsuTeleaBaseline(const cv::Mat& frame, const std::vector<cv::RotatedRect>& rects);

}  // namespace ocr_bench
