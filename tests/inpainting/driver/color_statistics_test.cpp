#include "inpainting/driver/color_statistics.h"

#include <gtest/gtest.h>

#include <limits>
#include <vector>

#include <opencv2/core.hpp>

// The request's validation and the exact pixels of an upright rectangle are
// tested through the JVM (InpaintingJNITest).
namespace ocr_inpainting {
namespace {

// Turned rectangles inside the two halves of an image whose halves are flat
// in different colours, for any channel count: channel c of rectangle i
// lands at i * channels + c.
TEST(CalculateRectMeansStdDevs, LaysOutTheChannelsOfEveryRectangle) {
  for (const int type : {CV_8UC1, CV_16UC2, CV_32FC3, CV_8UC4}) {
    cv::Mat image(200, 300, type, cv::Scalar(10, 20, 30, 40));
    image.colRange(150, 300).setTo(cv::Scalar(50, 60, 70, 80));
    const int channels = image.channels();
    // At half scale: centres (75, 100) and (225, 100), 80x30.
    const std::vector<double> rects = {150, 200, 160, 60, 33, 450, 200, 160, 60, -70};
    std::vector<double> means(2 * channels, -1);
    std::vector<double> deviations(2 * channels, -1);
    ASSERT_EQ(CalculateRectMeansStdDevs(image, rects.data(), rects.size(), means.data(),
                                        means.size(), deviations.data(), deviations.size()),
              0);
    for (int c = 0; c < channels; ++c) {
      EXPECT_EQ(means[c], 10.0 * (c + 1)) << type;
      EXPECT_EQ(means[channels + c], 50.0 + 10 * c) << type;
    }
    EXPECT_EQ(deviations, std::vector<double>(2 * channels, 0.0)) << type;
  }
}

TEST(CalculateRectMeansStdDevs, GivesZerosOutsideTheImageAndForNonFiniteRectangles) {
  const cv::Mat image(50, 50, CV_8UC3, cv::Scalar(10, 20, 30));
  const double nan = std::numeric_limits<double>::quiet_NaN();
  const double inf = std::numeric_limits<double>::infinity();
  const std::vector<double> rects = {500, 500, 20, 20, 0,   -300,  40,    20,    20,    45,
                                     nan, 40,  20, 20, 0,   40,    40,    inf,   20,    0,
                                     40,  40,  20, 20, nan, 1e300, 1e300, 1e300, 1e300, 0};
  std::vector<double> means(18, -1);
  std::vector<double> deviations(18, -1);
  ASSERT_EQ(CalculateRectMeansStdDevs(image, rects.data(), rects.size(), means.data(), 18,
                                      deviations.data(), 18),
            0);
  for (int k = 0; k < 9; ++k) {
    EXPECT_EQ(means[k], 0.0) << k;
    EXPECT_EQ(deviations[k], 0.0) << k;
  }
  for (const double value : means)
    EXPECT_FALSE(value < 0);
}

}  // namespace
}  // namespace ocr_inpainting
