#pragma once

#include <vector>

#include <opencv2/core.hpp>

namespace zeph {

// Follows text quadrilaterals (four corners each, consecutive in
// corner_points_) from frame to frame. At start it picks good corners inside
// the quadrilaterals; each update tracks them with pyramidal Lucas-Kanade in a
// region around them, fits a RANSAC homography, moves the quadrilateral
// corners through it and measures how much of the initial feature spread is
// still covered. A frame with too few flow successes latches the tracker into
// a failed state until the next StartTracker.
//
// Frames are 8-bit RGB; points are pixels, x right, y down. The class is
// deliberately plain (no virtual functions, no virtual destructor): the
// rotated-rectangle tracker derives from it and the bridge destroys that one
// through this base (see ReleaseTracker).
class OcrTracker {
 public:
  void StartTracker(const cv::Mat& frame, const std::vector<cv::Point2f>& corners);
  // On success `corners` receives the moved corners, same count and order as
  // the tracked ones; on failure it is left as it is or only resized.
  void UpdateTracker(const cv::Mat& frame, std::vector<cv::Point2f>* corners);
  double GetCoverageLeft() const { return coverage_left_; }

  // Good features inside the filled quadrilaterals (complete groups of four).
  static std::vector<cv::Point2f> GetTrackingPoints(const std::vector<cv::Point2f>& corners,
                                                    const cv::Mat& gray);
  // (min x, min y, max x - min x, max y - min y), minima starting at 10000 and
  // maxima at 0: an empty list gives (10000, 10000, -10000, -10000).
  static cv::Rect2f ComputeBoundingRect(const std::vector<cv::Point2f>& points);
  // Number of 2-channel float points in `points`, negative if it is not such a vector.
  static int checkInputParameters(cv::InputArray points);
  // Pyramidal LK restricted to the points' extent plus a margin of 50 px.
  // The points are in full-frame coordinates before and after the call.
  static void CalcOpticalFlowInRoi(const cv::Mat& prev_gray, const cv::Mat& next_gray,
                                   std::vector<cv::Point2f>& prev_points,
                                   std::vector<cv::Point2f>& next_points,
                                   std::vector<unsigned char>& status, std::vector<float>& errors);
  // `rect` grown by `margin` on every side and clipped to `size`; the empty
  // rectangle when nothing is left.
  static cv::Rect GetSafeRoi(const cv::Rect& rect, const cv::Size& size, int margin);

  // Stable compaction of the three vectors to the indices whose flag equals
  // `keep`; returns the number kept, or all bits set (changing nothing) when
  // the three lengths differ.
  template <typename T>
  static unsigned FilterPointsInVectors(std::vector<T>& flags, std::vector<cv::Point2f>& a,
                                        std::vector<cv::Point2f>& b, T keep);

 protected:
  // The object's address as the start and end log lines of both trackers
  // print it.
  static unsigned long Address(const void* object) {
    return reinterpret_cast<unsigned long>(object);
  }

  cv::Mat prev_gray_;
  std::vector<cv::Point2f> tracking_points_;
  std::vector<cv::Point2f> corner_points_;
  int min_tracked_points_ = 0;
  float initial_width_ = 0.0f;
  float initial_height_ = 0.0f;
  double coverage_left_ = 0.0;
  bool tracking_failed_ = false;
};

template <typename T>
unsigned OcrTracker::FilterPointsInVectors(std::vector<T>& flags, std::vector<cv::Point2f>& a,
                                           std::vector<cv::Point2f>& b, T keep) {
  if (flags.size() != a.size() || flags.size() != b.size())
    return static_cast<unsigned>(-1);
  size_t kept = 0;
  for (size_t i = 0; i < flags.size(); ++i) {
    if (flags[i] != keep)
      continue;
    flags[kept] = keep;
    a[kept] = a[i];
    b[kept] = b[i];
    ++kept;
  }
  flags.resize(kept);
  a.resize(kept);
  b.resize(kept);
  return static_cast<unsigned>(kept);
}

}  // namespace zeph
