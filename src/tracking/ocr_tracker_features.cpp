// Feature selection and point-set helpers of the point tracker.
#include <algorithm>

#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "tracking/ocr_tracker.h"

namespace zeph {
namespace {

constexpr int kMaxTrackingPoints = 1000;
constexpr double kFeatureQuality = 0.001;
constexpr double kFeatureMinDistance = 3.0;
constexpr int kFeatureBlockSize = 3;
constexpr double kHarrisK = 0.04;

}  // namespace

std::vector<cv::Point2f> OcrTracker::GetTrackingPoints(const std::vector<cv::Point2f>& corners,
                                                       const cv::Mat& gray) {
  // Mask of the quadrilaterals; a trailing group of fewer than four corners is ignored.
  cv::Mat mask = cv::Mat::zeros(gray.size(), CV_8U);
  for (size_t first = 0; first + 4 <= corners.size(); first += 4) {
    cv::Point quad[4];
    for (int k = 0; k < 4; ++k)
      quad[k] = cv::Point(cvRound(corners[first + k].x), cvRound(corners[first + k].y));
    cv::fillConvexPoly(mask, quad, 4, cv::Scalar(1), cv::LINE_8, 0);
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
