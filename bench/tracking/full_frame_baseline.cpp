#include "full_frame_baseline.h"

#include <cmath>

#include <opencv2/calib3d.hpp>
#include <opencv2/imgproc.hpp>
#include <opencv2/video/tracking.hpp>

namespace tracking_bench {

FullFrameBaseline::FullFrameBaseline(const cv::Mat& rgb, const std::vector<cv::Point2f>& points,
                                     const std::vector<cv::Point2f>& corners)
    : points_(points), corners_(corners) {
  cv::cvtColor(rgb, prev_gray_, cv::COLOR_RGB2GRAY);
}

bool FullFrameBaseline::Update(const cv::Mat& rgb) {
  cv::Mat gray;
  cv::cvtColor(rgb, gray, cv::COLOR_RGB2GRAY);
  std::vector<cv::Point2f> next;
  std::vector<unsigned char> status;
  std::vector<float> err;
  cv::calcOpticalFlowPyrLK(
      prev_gray_, gray, points_, next, status, err, cv::Size(7, 7), 3,
      cv::TermCriteria(cv::TermCriteria::COUNT + cv::TermCriteria::EPS, 20, 0.03), 0, 1e-4);
  std::vector<cv::Point2f> from, to;
  for (size_t i = 0; i < status.size(); ++i) {
    if (status[i]) {
      from.push_back(points_[i]);
      to.push_back(next[i]);
    }
  }
  if (from.size() < 4)
    return false;
  std::vector<unsigned char> inliers;
  const cv::Mat h = cv::findHomography(from, to, cv::RANSAC, 3.0, inliers, 300, 0.999);
  if (h.empty())
    return false;
  points_.clear();
  for (size_t i = 0; i < inliers.size(); ++i) {
    if (inliers[i])
      points_.push_back(to[i]);
  }
  cv::perspectiveTransform(corners_, corners_, h);
  prev_gray_ = gray;
  return true;
}

std::vector<cv::RotatedRect> FullFrameBaseline::Rects() const {
  std::vector<cv::RotatedRect> rects;
  for (size_t first = 0; first + 4 <= corners_.size(); first += 4) {
    const cv::Point2f* p = &corners_[first];
    const cv::Point2f centre = (p[0] + p[1] + p[2] + p[3]) * 0.25f;
    const cv::Point2f d = ((p[2] + p[3]) - (p[0] + p[1])) * 0.5f;
    const float width = std::hypot(d.x, d.y);
    const float angle = std::atan2(d.y, d.x) * 57.29577951308232f;
    rects.emplace_back(centre, cv::Size2f(width, cv::norm(p[1] - p[0])), angle);
  }
  return rects;
}

}  // namespace tracking_bench
