#pragma once

#include <vector>

#include <opencv2/core.hpp>

#include "tracking/ocr_tracker.h"
#include "tracking/ocr_tracker_rot_rect.h"

namespace tracking_testing {

// Opens the trackers' state to the tests.
class PointTrackerProbe : public zeph::OcrTracker {
 public:
  using OcrTracker::corner_points_;
  using OcrTracker::coverage_left_;
  using OcrTracker::initial_height_;
  using OcrTracker::initial_width_;
  using OcrTracker::min_tracked_points_;
  using OcrTracker::prev_gray_;
  using OcrTracker::tracking_failed_;
  using OcrTracker::tracking_points_;
};

class RotRectTrackerProbe : public zeph::OcrTrackerRotRect {
 public:
  using OcrTracker::corner_points_;
  using OcrTracker::min_tracked_points_;
  using OcrTracker::tracking_failed_;
  using OcrTracker::tracking_points_;
  using OcrTrackerRotRect::ref_rects_;
  using OcrTrackerRotRect::ref_sizes_;
};

// RGB frame of `squares` white 12 px squares on black, ten to a row, 30 px
// apart from (20, 20): each square gives exactly four good features.
cv::Mat SquaresFrame(int squares);

// RGB frame of smoothed random noise: strong texture everywhere.
cv::Mat TexturedFrame(cv::Size size, uint64_t seed);

// `frame` with its content moved by (dx, dy), the uncovered border reflected.
cv::Mat Shifted(const cv::Mat& frame, double dx, double dy);

// The corners of an upright quadrilateral, in the order of cv::RotatedRect::points.
std::vector<cv::Point2f> Quad(float left, float top, float right, float bottom);

cv::RotatedRect ZeroRect();
bool IsZero(const cv::RotatedRect& rect);

}  // namespace tracking_testing
