// Optical flow of the point tracker, restricted to a region around the points.
#include <algorithm>

#include <opencv2/video/tracking.hpp>

#include "common/log.h"
#include "tracking/ocr_tracker.h"

namespace zeph {
namespace {

// Search margin around the points' extent: the largest motion between two
// frames that the flow is expected to follow.
constexpr int kFlowMargin = 50;
const cv::Size kFlowWindow(7, 7);
constexpr int kFlowMaxLevel = 3;
constexpr double kFlowMinEigenThreshold = 1e-4;

void Shift(std::vector<cv::Point2f>& points, const cv::Point2f& offset) {
  for (cv::Point2f& p : points)
    p += offset;
}

}  // namespace

cv::Rect OcrTracker::GetSafeRoi(const cv::Rect& rect, const cv::Size& size, int margin) {
  const int top = std::max(0, rect.y - margin);
  const int bottom = std::min(size.height, rect.y - margin + 2 * margin + rect.height);
  const int left = std::max(0, rect.x - margin);
  const int right = std::min(size.width, rect.x - margin + 2 * margin + rect.width);
  if (right - left < 1 || bottom - top < 1)
    return cv::Rect(0, 0, 0, 0);
  return cv::Rect(left, top, right - left, bottom - top);
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

}  // namespace zeph
