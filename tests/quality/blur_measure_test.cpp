#include "quality/blur_measure.h"

#include <gtest/gtest.h>

#include <cmath>

#include <opencv2/imgproc.hpp>

namespace {

using image_quality::CalculateBlur;

TEST(BlurMeasure, UniformAndSinglePixelImagesScoreZero) {
  EXPECT_EQ(CalculateBlur(cv::Mat(40, 30, CV_8UC4, cv::Scalar(90, 120, 30, 255))), 0.0);
  EXPECT_EQ(CalculateBlur(cv::Mat(1, 1, CV_8UC4, cv::Scalar(255, 0, 0, 255))), 0.0);
}

TEST(BlurMeasure, IsTheStandardDeviationOfTheLaplacian) {
  // One white pixel in the middle of a black 5 x 5 image: the 3 x 3 Laplacian
  // is -1020 there and 255 at its four neighbours, zero elsewhere (mean 0).
  cv::Mat image(5, 5, CV_8UC4, cv::Scalar(0, 0, 0, 255));
  image.at<cv::Vec4b>(2, 2) = cv::Vec4b(255, 255, 255, 255);
  EXPECT_NEAR(CalculateBlur(image), std::sqrt((1020.0 * 1020.0 + 4 * 255.0 * 255.0) / 25.0), 1e-9);
}

TEST(BlurMeasure, BlurredImageScoresLower) {
  cv::RNG rng(42);
  cv::Mat sharp(120, 160, CV_8UC4);
  rng.fill(sharp, cv::RNG::UNIFORM, 0, 256);
  cv::Mat blurred;
  cv::GaussianBlur(sharp, blurred, cv::Size(0, 0), 2.0);
  const double sharp_score = CalculateBlur(sharp);
  EXPECT_GT(sharp_score, 0.0);
  EXPECT_LT(CalculateBlur(blurred), sharp_score * 0.5);
}

TEST(BlurMeasure, GreyOrEmptyImagesAreRejectedByOpenCv) {
  EXPECT_THROW(CalculateBlur(cv::Mat(8, 8, CV_8UC1, cv::Scalar::all(1))), cv::Exception);
  EXPECT_THROW(CalculateBlur(cv::Mat()), cv::Exception);
}

}  // namespace
