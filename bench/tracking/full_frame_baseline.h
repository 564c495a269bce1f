#pragma once

#include <vector>

#include <opencv2/core.hpp>

namespace tracking_bench {

// What a user would otherwise write: pyramidal LK over the whole frame on all
// points (same window, levels and criteria as the tracker, no search
// region), the same RANSAC homography, and the corners moved through it.
// Keeps the inliers and the moved corners for the next frame.
class FullFrameBaseline {
 public:
  FullFrameBaseline(const cv::Mat& rgb, const std::vector<cv::Point2f>& points,
                    const std::vector<cv::Point2f>& corners);
  // Returns false when the homography could not be found.
  bool Update(const cv::Mat& rgb);
  // One rotated rectangle per four corners (centre and angle only matter here).
  std::vector<cv::RotatedRect> Rects() const;

 private:
  cv::Mat prev_gray_;
  std::vector<cv::Point2f> points_;
  std::vector<cv::Point2f> corners_;
};

}  // namespace tracking_bench
