// The point tracker, in the order of its work: picking features inside the
// quadrilaterals at start, then per frame the optical flow in a region
// around them, the homography and the moved quadrilaterals.
#include "tracking/ocr_tracker.h"

#include <algorithm>
#include <cmath>
#include <iostream>

#include <opencv2/calib3d.hpp>
#include <opencv2/imgproc.hpp>
#include <opencv2/video/tracking.hpp>

#include "common/convex_fill.h"
#include "common/log.h"

namespace zeph {
namespace {

// Features (goodFeaturesToTrack).
constexpr int kMaxTrackingPoints = 1000;
constexpr double kFeatureQuality = 0.001;
constexpr double kFeatureMinDistance = 3.0;
constexpr int kFeatureBlockSize = 3;
constexpr double kHarrisK = 0.04;

// Optical flow. The search margin around the points' extent is the largest
// motion between two frames that the flow is expected to follow.
constexpr int kFlowMargin = 50;
const cv::Size kFlowWindow(7, 7);
constexpr int kFlowMaxLevel = 3;
constexpr double kFlowMinEigenThreshold = 1e-4;

// Homography. Fewest flow successes accepted, as a share of the points
// found at start, and never fewer than the floor.
constexpr double kMinTrackedShare = 0.05;
constexpr int kMinTrackedFloor = 10;
constexpr double kRansacReprojThreshold = 3.0;
constexpr int kRansacMaxIterations = 300;
constexpr double kRansacConfidence = 0.999;

void Shift(std::vector<cv::Point2f>& points, const cv::Point2f& offset) {
  for (cv::Point2f& p : points)
    p += offset;
}

// Collapses to (0, 0) every complete quadrilateral that a wild homography
// threw far away (logged) or that lies wholly outside the picture (silent).
void ZeroQuadsOffPicture(std::vector<cv::Point2f>& corners, int cols, int rows) {
  for (size_t first = 0; first + 4 <= corners.size(); first += 4) {
    cv::Point2f* quad = &corners[first];
    bool extreme = false;
    // Its own extent, not ComputeBoundingRect's: that one starts its minima
    // at 10000 and its maxima at 0 (the coverage rule), which would misjudge
    // a quadrilateral lying beyond 10000 px.
    float min_x = quad[0].x, max_x = quad[0].x, min_y = quad[0].y, max_y = quad[0].y;
    for (int k = 0; k < 4; ++k) {
      const cv::Point2f& p = quad[k];
      // A degenerate homography yields NaN or infinite corners: thrown away too.
      if (!std::isfinite(p.x) || !std::isfinite(p.y) || p.x < -cols || p.x > 2 * cols ||
          p.y < -rows || p.y > 2 * rows)
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

std::vector<cv::Point2f> OcrTracker::GetTrackingPoints(const std::vector<cv::Point2f>& corners,
                                                       const cv::Mat& gray) {
  // Mask of the quadrilaterals; a trailing group of fewer than four corners is ignored.
  cv::Mat mask = cv::Mat::zeros(gray.size(), CV_8U);
  for (size_t first = 0; first + 4 <= corners.size(); first += 4) {
    cv::Point quad[4];
    for (int k = 0; k < 4; ++k)
      quad[k] = cv::Point(cvRound(corners[first + k].x), cvRound(corners[first + k].y));
    ocr::FillConvexPolygon(mask, quad, 4, cv::Scalar(1));
  }
  const int area = cv::countNonZero(mask);
  OCR_LOGD("OcrTracker::GetTrackingPoints Total area %.1f", static_cast<double>(area));

  std::vector<cv::Point2f> points;
  points.reserve(kMaxTrackingPoints + corners.size() / 4);
  if (area == 0) {
    OCR_LOGW("OcrTracker::GetTrackingPoints No areas to track currently");
    return points;
  }

  cv::goodFeaturesToTrack(gray, points, kMaxTrackingPoints, kFeatureQuality, kFeatureMinDistance,
                          mask, kFeatureBlockSize, false, kHarrisK);
  if (checkInputParameters(points) < 1) {
    OCR_LOGD("OcrTracker::checkInputParameters failed, feature size: %d, count size %d",
             static_cast<int>(points.size()), checkInputParameters(points));
  } else {
    cv::cornerSubPix(gray, points, cv::Size(5, 5), cv::Size(-1, -1),
                     cv::TermCriteria(cv::TermCriteria::COUNT + cv::TermCriteria::EPS, 40, 0.01));
  }
  OCR_LOGD("OcrTracker::GetTrackingPoints tracking points: %d/%d", static_cast<int>(points.size()),
           kMaxTrackingPoints);
  return points;
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

void OcrTracker::CalcOpticalFlowInRoi(const cv::Mat& prev_gray, const cv::Mat& next_gray,
                                      std::vector<cv::Point2f>& prev_points,
                                      std::vector<cv::Point2f>& next_points,
                                      std::vector<unsigned char>& status,
                                      std::vector<float>& errors) {
  const cv::Rect2f extent = ComputeBoundingRect(prev_points);
  const cv::Rect rounded(cvRound(extent.x), cvRound(extent.y), cvRound(extent.width),
                         cvRound(extent.height));
  const cv::Rect roi = GetSafeRoi(rounded, prev_gray.size(), kFlowMargin);

  OCR_LOGD("OcrTracker::UpdateTracker Building Optical Flow Pyramids");
  const cv::Point2f offset(static_cast<float>(roi.x), static_cast<float>(roi.y));
  Shift(prev_points, -offset);
  // An empty region (points wholly past the picture) is an OpenCV error that
  // the caller sees. OpenCV 3 raised it on the empty sub-image; 4.6's
  // buildOpticalFlowPyramid never returns on one (copyMakeBorder loops), so
  // the same error is raised here first.
  CV_Assert(!roi.empty());
  std::vector<cv::Mat> prev_pyramid, next_pyramid;
  cv::buildOpticalFlowPyramid(prev_gray(roi), prev_pyramid, kFlowWindow, kFlowMaxLevel, false,
                              cv::BORDER_REFLECT_101, cv::BORDER_CONSTANT, true);
  cv::buildOpticalFlowPyramid(next_gray(roi), next_pyramid, kFlowWindow, kFlowMaxLevel, false,
                              cv::BORDER_REFLECT_101, cv::BORDER_CONSTANT, true);

  OCR_LOGD("OcrTracker::UpdateTracker Calculating Optical Flow");
  cv::calcOpticalFlowPyrLK(
      prev_pyramid, next_pyramid, prev_points, next_points, status, errors, kFlowWindow,
      kFlowMaxLevel, cv::TermCriteria(cv::TermCriteria::COUNT + cv::TermCriteria::EPS, 20, 0.03), 0,
      kFlowMinEigenThreshold);

  Shift(prev_points, offset);
  Shift(next_points, offset);
}

cv::Rect OcrTracker::GetSafeRoi(const cv::Rect& rect, const cv::Size& size, int margin) {
  const int top = std::max(0, rect.y - margin);
  const int bottom = std::min(size.height, rect.y - margin + 2 * margin + rect.height);
  const int left = std::max(0, rect.x - margin);
  const int right = std::min(size.width, rect.x - margin + 2 * margin + rect.width);
  if (right - left < 1 || bottom - top < 1)
    return cv::Rect(0, 0, 0, 0);
  return cv::Rect(left, top, right - left, bottom - top);
}

int OcrTracker::checkInputParameters(cv::InputArray points) {
  return points.getMat().checkVector(2, CV_32F, true);
}

cv::Rect2f OcrTracker::ComputeBoundingRect(const std::vector<cv::Point2f>& points) {
  // The maxima start at 0, not at -infinity: points left of or above the
  // picture still give an extent that reaches to 0.
  float min_x = 10000.0f, min_y = 10000.0f, max_x = 0.0f, max_y = 0.0f;
  for (const cv::Point2f& p : points) {
    min_x = std::min(min_x, p.x);
    min_y = std::min(min_y, p.y);
    max_x = std::max(max_x, p.x);
    max_y = std::max(max_y, p.y);
  }
  return cv::Rect2f(min_x, min_y, max_x - min_x, max_y - min_y);
}

}  // namespace zeph
