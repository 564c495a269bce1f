#pragma once

#include <opencv2/core.hpp>

namespace zeph {

// Similarity of two RGBA 8-bit images: the correlation of their normalised
// 2-D red/green histograms (256 x 256 bins). 1.0 for identical colour
// distributions, down to -1.0 for dissimilar ones; blue and alpha do not take
// part. Errors from OpenCV (a wrong image type) propagate.
double CalculateFrameAccuracy(const cv::Mat& first_rgba, const cv::Mat& second_rgba);

}  // namespace zeph
