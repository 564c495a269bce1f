#include "tracker_test_support.h"

#include <opencv2/imgproc.hpp>

namespace tracking_testing {

cv::Mat SquaresFrame(int squares) {
  cv::Mat frame(400, 640, CV_8UC3, cv::Scalar::all(0));
  for (int i = 0; i < squares; ++i)
    cv::rectangle(frame, cv::Rect(20 + (i % 10) * 30, 20 + (i / 10) * 30, 12, 12),
                  cv::Scalar::all(255), cv::FILLED);
  return frame;
}

cv::Mat TexturedFrame(cv::Size size, uint64_t seed) {
  cv::RNG rng(seed);
  cv::Mat frame(size, CV_8UC3);
  rng.fill(frame, cv::RNG::UNIFORM, 0, 256);
  cv::GaussianBlur(frame, frame, cv::Size(0, 0), 1.5);
  cv::normalize(frame, frame, 0, 255, cv::NORM_MINMAX);
  return frame;
}

cv::Mat Shifted(const cv::Mat& frame, double dx, double dy) {
  const cv::Mat shift = (cv::Mat_<double>(2, 3) << 1, 0, dx, 0, 1, dy);
  cv::Mat moved;
  cv::warpAffine(frame, moved, shift, frame.size(), cv::INTER_LINEAR, cv::BORDER_REFLECT_101);
  return moved;
}

std::vector<cv::Point2f> Quad(float left, float top, float right, float bottom) {
  return {cv::Point2f(left, bottom), cv::Point2f(left, top), cv::Point2f(right, top),
          cv::Point2f(right, bottom)};
}

cv::RotatedRect ZeroRect() {
  return cv::RotatedRect(cv::Point2f(0.0f, 0.0f), cv::Size2f(0.0f, 0.0f), 0.0f);
}

bool IsZero(const cv::RotatedRect& rect) {
  return rect.center.x == 0.0f && rect.center.y == 0.0f && rect.size.width == 0.0f &&
         rect.size.height == 0.0f && rect.angle == 0.0f;
}

}  // namespace tracking_testing
