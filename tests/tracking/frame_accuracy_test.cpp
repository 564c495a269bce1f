#include "tracking/frame_accuracy.h"

#include <gtest/gtest.h>

#include <opencv2/core.hpp>

namespace {

using zeph::CalculateFrameAccuracy;

cv::Mat RandomRgba(uint64_t seed) {
  cv::Mat image(48, 64, CV_8UC4);
  cv::RNG(seed).fill(image, cv::RNG::UNIFORM, 0, 256);
  return image;
}

TEST(FrameAccuracy, CorrelatesTheRedGreenHistogramsOnly) {
  const cv::Mat image = RandomRgba(1);
  EXPECT_DOUBLE_EQ(CalculateFrameAccuracy(image, image), 1.0);
  cv::Mat mirror;
  cv::flip(image, mirror, 1);
  EXPECT_DOUBLE_EQ(CalculateFrameAccuracy(image, mirror), 1.0);
  // Blue and alpha do not take part.
  cv::Mat other_blue = image.clone();
  const cv::Mat noise = RandomRgba(3);
  const int blue_and_alpha[] = {2, 2, 3, 3};
  cv::mixChannels(&noise, 1, &other_blue, 1, blue_and_alpha, 2);
  ASSERT_GT(cv::norm(image, other_blue, cv::NORM_INF), 0.0);
  EXPECT_DOUBLE_EQ(CalculateFrameAccuracy(image, other_blue), 1.0);
  // Two uniform colours: two 256 x 256 histograms with one non-zero bin each,
  // in different places.
  const cv::Mat red(20, 30, CV_8UC4, cv::Scalar(200, 10, 40, 255));
  const cv::Mat green(40, 10, CV_8UC4, cv::Scalar(10, 200, 40, 255));
  EXPECT_NEAR(CalculateFrameAccuracy(red, green), -1.0 / 65535.0, 1e-12);
}

}  // namespace
