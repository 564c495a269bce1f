#include "tracking/frame_accuracy.h"

#include <gtest/gtest.h>

#include <opencv2/core.hpp>

namespace {

cv::Mat RandomRgba(uint64_t seed, cv::Size size = cv::Size(64, 48)) {
  cv::RNG rng(seed);
  cv::Mat image(size, CV_8UC4);
  rng.fill(image, cv::RNG::UNIFORM, 0, 256);
  return image;
}

TEST(FrameAccuracy, SameImageGivesOne) {
  const cv::Mat image = RandomRgba(1);
  EXPECT_DOUBLE_EQ(zeph::CalculateFrameAccuracy(image, image), 1.0);
}

TEST(FrameAccuracy, BlueAndAlphaDoNotTakePart) {
  const cv::Mat first = RandomRgba(2);
  cv::Mat second = first.clone();
  cv::Mat noise = RandomRgba(3);
  const int blue_and_alpha[] = {2, 2, 3, 3};
  cv::mixChannels(&noise, 1, &second, 1, blue_and_alpha, 2);
  ASSERT_GT(cv::norm(first, second, cv::NORM_INF), 0.0);
  EXPECT_DOUBLE_EQ(zeph::CalculateFrameAccuracy(first, second), 1.0);
}

TEST(FrameAccuracy, MirrorImageGivesOne) {
  const cv::Mat image = RandomRgba(4);
  cv::Mat mirror;
  cv::flip(image, mirror, 1);
  EXPECT_DOUBLE_EQ(zeph::CalculateFrameAccuracy(image, mirror), 1.0);
}

TEST(FrameAccuracy, TwoUniformColoursCorrelateAsSingleBins) {
  const cv::Mat red(20, 30, CV_8UC4, cv::Scalar(200, 10, 40, 255));
  const cv::Mat green(40, 10, CV_8UC4, cv::Scalar(10, 200, 40, 255));
  // Two 256 x 256 histograms with one non-zero bin each, in different places.
  EXPECT_NEAR(zeph::CalculateFrameAccuracy(red, green), -1.0 / 65535.0, 1e-12);
}

TEST(FrameAccuracy, DifferentImagesScoreBelowOne) {
  const double score = zeph::CalculateFrameAccuracy(RandomRgba(5), RandomRgba(6));
  EXPECT_LT(score, 0.5);
  EXPECT_GT(score, -1.0);
}

TEST(FrameAccuracy, EmptyOrFloatImagesAreRejectedByOpenCv) {
  EXPECT_THROW(zeph::CalculateFrameAccuracy(cv::Mat(), RandomRgba(7)), cv::Exception);
  const cv::Mat floats(10, 10, CV_64FC4, cv::Scalar::all(0.5));
  EXPECT_THROW(zeph::CalculateFrameAccuracy(RandomRgba(7), floats), cv::Exception);
}

}  // namespace
