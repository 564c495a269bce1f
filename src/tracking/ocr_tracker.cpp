// Start and per-frame update of the point tracker.
#include "tracking/ocr_tracker.h"

#include <algorithm>
#include <cmath>
#include <iostream>

#include <opencv2/calib3d.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"

namespace zeph {
namespace {

// Fewest flow successes accepted, as a share of the points found at start.
constexpr double kMinTrackedShare = 0.05;
constexpr int kMinTrackedFloor = 10;
constexpr double kRansacReprojThreshold = 3.0;
constexpr int kRansacMaxIterations = 300;
constexpr double kRansacConfidence = 0.999;

unsigned long Address(const void* object) {
  return reinterpret_cast<unsigned long>(object);
}

// Collapses to (0, 0) every complete quadrilateral that a wild homography
// threw far away (logged) or that lies wholly outside the picture (silent).
void ZeroQuadsOffPicture(std::vector<cv::Point2f>& corners, int cols, int rows) {
  for (size_t first = 0; first + 4 <= corners.size(); first += 4) {
    cv::Point2f* quad = &corners[first];
    bool extreme = false;
    float min_x = quad[0].x, max_x = quad[0].x, min_y = quad[0].y, max_y = quad[0].y;
    for (int k = 0; k < 4; ++k) {
      const cv::Point2f& p = quad[k];
      if (p.x < -cols || p.x > 2 * cols || p.y < -rows || p.y > 2 * rows)
        extreme = true;
      min_x = std::min(min_x, p.x);
      max_x = std::max(max_x, p.x);
      min_y = std::min(min_y, p.y);
      max_y = std::max(max_y, p.y);
    }
    bool outside = false;
    if (extreme) {
      OCR_LOGD("OcrTracker::Corner points are extreme large. ");
    } else {
      const int left = std::max(0, static_cast<int>(std::floor(min_x)));
      const int right = std::min(cols, static_cast<int>(std::ceil(max_x)));
      const int top = std::max(0, static_cast<int>(std::floor(min_y)));
      const int bottom = std::min(rows, static_cast<int>(std::ceil(max_y)));
      outside = right <= left || bottom <= top;
    }
    if (extreme || outside)
      std::fill(quad, quad + 4, cv::Point2f(0.0f, 0.0f));
  }
}

}  // namespace

void OcrTracker::StartTracker(const cv::Mat& frame, const std::vector<cv::Point2f>& corners) {
  if (&corners != &corner_points_)
    corner_points_ = corners;
  cv::Mat gray;
  cv::cvtColor(frame, gray, cv::COLOR_RGB2GRAY);
  prev_gray_ = gray;
  tracking_points_ = GetTrackingPoints(corner_points_, prev_gray_);

  min_tracked_points_ =
      static_cast<int>(static_cast<double>(tracking_points_.size()) * kMinTrackedShare);
  if (min_tracked_points_ <= kMinTrackedFloor)
    min_tracked_points_ = kMinTrackedFloor;

  const cv::Rect2f extent = ComputeBoundingRect(tracking_points_);
  initial_width_ = extent.width;
  initial_height_ = extent.height;
  tracking_failed_ = false;
}

void OcrTracker::UpdateTracker(const cv::Mat& frame, std::vector<cv::Point2f>* corners) {
  if (tracking_failed_) {
    OCR_LOGW("OcrTracker::UpdateTracker Failure: Previous tracking failed already. ");
    return;
  }
  OCR_LOGI("OcrTracker::UpdateTracker start %lu", Address(this));

  cv::Mat gray;
  cv::cvtColor(frame, gray, cv::COLOR_RGB2GRAY);
  std::vector<cv::Point2f> prev = tracking_points_;
  if (prev.empty()) {
    OCR_LOGW("OcrTracker::UpdateTracker Failure: Nothing to track");
    return;
  }

  const size_t n = prev.size();
  std::vector<cv::Point2f> next(n);
  std::vector<unsigned char> status(n, 0);
  std::vector<float> err(n, 0.0f);
  CalcOpticalFlowInRoi(prev_gray_, gray, prev, next, status, err);

  const int tracked = cv::countNonZero(status);
  if (tracked < min_tracked_points_) {
    OCR_LOGW("OcrTracker::UpdateTracker Failure: Too few points tracked: %d/%d", tracked,
             static_cast<int>(status.size()));
    tracking_failed_ = true;
    return;
  }
  OCR_LOGD("OcrTracker::UpdateTracker Points tracked: %d/%d", tracked,
           static_cast<int>(status.size()));
  FilterPointsInVectors<unsigned char>(status, prev, next, 1);

  OCR_LOGD("OcrTracker::UpdateTracker Computing homography");
  const cv::Mat homography = cv::findHomography(prev, next, cv::RANSAC, kRansacReprojThreshold,
                                                status, kRansacMaxIterations, kRansacConfidence);
  // Diagnostic print beside the log, kept on purpose (discarded on the phone).
  std::cout << "homography" << std::endl << homography << std::endl;
  OCR_LOGI("OcrTracker::UpdateTracker %d/%d points valid", cv::countNonZero(status),
           static_cast<int>(status.size()));
  if (homography.empty()) {
    OCR_LOGW("OcrTracker::UpdateTracker Failure: findHomography failed");
    return;
  }
  FilterPointsInVectors<unsigned char>(status, prev, next, 1);

  // Coverage: how much of the initial feature spread the inliers still span.
  const cv::Rect2f extent = ComputeBoundingRect(next);
  const float ratio_w = initial_width_ == 0.0f ? 0.0f : extent.width / initial_width_;
  const float ratio_h = initial_height_ == 0.0f ? 0.0f : extent.height / initial_height_;
  coverage_left_ = static_cast<double>(std::min(ratio_w, ratio_h));
  OCR_LOGD("OcrTracker::Coverage left %f for tracking 0x%p", coverage_left_,
           static_cast<const void*>(this));

  corners->resize(corner_points_.size());
  if (corner_points_.empty()) {
    OCR_LOGW("OcrTracker::UpdateTracker Failure: corner_points_ is empty");
    return;
  }
  cv::perspectiveTransform(corner_points_, *corners, homography);
  ZeroQuadsOffPicture(*corners, frame.cols, frame.rows);

  // Zeroed quadrilaterals are carried on as four points at one spot.
  prev_gray_ = gray;
  tracking_points_ = next;
  corner_points_ = *corners;
  OCR_LOGI("OcrTracker::UpdateTracker end %lu", Address(this));
}

}  // namespace zeph
