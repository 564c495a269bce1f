#include "quality/blur_measure.h"

#include <opencv2/imgproc.hpp>

namespace image_quality {

double CalculateBlur(const cv::Mat& rgba) {
  cv::Mat gray(rgba.rows, rgba.cols, CV_8UC1);
  cv::cvtColor(rgba, gray, cv::COLOR_RGBA2GRAY);
  cv::Mat laplacian;
  cv::Laplacian(gray, laplacian, CV_64F, 1, 1.0, 0.0, cv::BORDER_DEFAULT);
  cv::Scalar deviation;
  cv::meanStdDev(laplacian, cv::noArray(), deviation, cv::noArray());
  return deviation[0];
}

}  // namespace image_quality
