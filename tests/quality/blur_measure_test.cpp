#include "quality/blur_measure.h"

#include <gtest/gtest.h>

#include <cmath>

#include <opencv2/imgproc.hpp>

namespace {

using image_quality::CalculateBlur;

TEST(BlurMeasure, IsTheStandardDeviationOfTheLaplacian) {
  EXPECT_EQ(CalculateBlur(cv::Mat(40, 30, CV_8UC4, cv::Scalar(90, 120, 30, 255))), 0.0);
  EXPECT_EQ(CalculateBlur(cv::Mat(1, 1, CV_8UC4, cv::Scalar(255, 0, 0, 255))), 0.0);
  // One white pixel in the middle of a black 5 x 5 image: the 3 x 3 Laplacian
  // is -1020 there and 255 at its four neighbours, zero elsewhere (mean 0).
  cv::Mat dot(5, 5, CV_8UC4, cv::Scalar(0, 0, 0, 255));
  dot.at<cv::Vec4b>(2, 2) = cv::Vec4b(255, 255, 255, 255);
  EXPECT_NEAR(CalculateBlur(dot), std::sqrt((1020.0 * 1020.0 + 4 * 255.0 * 255.0) / 25.0), 1e-9);

  cv::Mat sharp(120, 160, CV_8UC4), blurred;
  cv::RNG(42).fill(sharp, cv::RNG::UNIFORM, 0, 256);
  cv::GaussianBlur(sharp, blurred, cv::Size(0, 0), 2.0);
  EXPECT_GT(CalculateBlur(sharp), 0.0);
  EXPECT_LT(CalculateBlur(blurred), CalculateBlur(sharp) * 0.5);
}

}  // namespace
