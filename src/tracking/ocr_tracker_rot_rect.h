#pragma once

#include <vector>

#include <opencv2/core.hpp>

#include "tracking/ocr_tracker.h"

namespace zeph {

// Tracks the host's OCR text regions as rotated rectangles: region i is the
// quadrilateral of corners 4i..4i+3 of the point tracker, in the order of
// cv::RotatedRect::points (bottom-left, top-left, top-right, bottom-right for
// angle 0). After each update one rotated rectangle is estimated again from
// each moved quadrilateral, keeping the region's aspect ratio; a frame in
// which the regions turn or scale implausibly comes back as zero rectangles.
class OcrTrackerRotRect : public OcrTracker {
 public:
  void StartTracker(const cv::Mat& frame, const std::vector<cv::RotatedRect>& rects);
  // `rects` is replaced by one rectangle per region; all fields are 0 for a
  // lost region and for every region of a failed or rejected frame.
  void UpdateTracker(const cv::Mat& frame, std::vector<cv::RotatedRect>* rects);

  // True when the change from `reference` to `current` is too large: one
  // angle that moved by more than 35 degrees (plain difference, no wrap at
  // +-180), or more than half of the regions scaled by more than 2.4 in height
  // or width.
  static bool CheckTrackingAnglesScales(const std::vector<cv::RotatedRect>& current,
                                        const std::vector<cv::RotatedRect>& reference);

 protected:
  // Appends the rectangles to the reference lists and their corners to `corners`.
  void AppendReferences(const std::vector<cv::RotatedRect>& rects,
                        std::vector<cv::Point2f>& corners);

  std::vector<cv::Size2f> ref_sizes_;
  std::vector<cv::RotatedRect> ref_rects_;
};

}  // namespace zeph
