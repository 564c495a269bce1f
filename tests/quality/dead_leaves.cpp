#include "dead_leaves.h"

#include <algorithm>
#include <cmath>

#include <opencv2/imgproc.hpp>

namespace resolution_testing {

cv::Mat DeadLeaves(cv::Size size, uint64_t seed) {
  cv::RNG rng(seed);
  cv::Mat image(size, CV_8UC4, cv::Scalar(128, 128, 128, 255));
  const double inv_min2 = 1.0 / (2.0 * 2.0);
  const double max_radius = std::min(size.width, size.height) / 8.0;
  const double inv_max2 = 1.0 / (max_radius * max_radius);
  for (int i = 0; i < size.area() / 30; ++i) {
    const double radius = 1.0 / std::sqrt(inv_min2 - rng.uniform(0.0, 1.0) * (inv_min2 - inv_max2));
    const cv::Point centre(rng.uniform(0, size.width), rng.uniform(0, size.height));
    const cv::Scalar colour(rng.uniform(0, 256), rng.uniform(0, 256), rng.uniform(0, 256), 255);
    cv::circle(image, centre, static_cast<int>(std::lround(radius)), colour, cv::FILLED,
               cv::LINE_8);
  }
  return image;
}

cv::Mat Enlarged(const cv::Mat& frame, double factor) {
  cv::Mat small, large;
  cv::resize(frame, small, cv::Size(), 1.0 / factor, 1.0 / factor, cv::INTER_AREA);
  cv::resize(small, large, frame.size(), 0, 0, cv::INTER_CUBIC);
  return large;
}

}  // namespace resolution_testing
