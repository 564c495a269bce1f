#include "inpainting/driver/color_statistics.h"

#include <gtest/gtest.h>

#include <limits>
#include <vector>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"

namespace ocr_inpainting {
namespace {

cv::Mat RandomImage(int rows, int cols, int type, uint64_t seed) {
  cv::RNG rng(seed);
  cv::Mat image(rows, cols, type);
  rng.fill(image, cv::RNG::UNIFORM, 0, 256);
  return image;
}

// Mean and deviation inside a polygon, measured on the whole image.
void PolygonStats(const cv::Mat& image, const std::vector<cv::Point>& polygon, cv::Mat& mean,
                  cv::Mat& deviation) {
  cv::Mat mask = cv::Mat::zeros(image.size(), CV_8UC1);
  cv::fillConvexPoly(mask, polygon, cv::Scalar(255));
  cv::meanStdDev(image, mean, deviation, mask);
}

TEST(CalculateRectMeansStdDevs, MeasuresHalfScaleRectangles) {
  const cv::Mat image = RandomImage(120, 160, CV_8UC3, 31);
  // (100, 100, 40, 20, 0) on the full-size frame is (50, 50, 20, 10) here.
  const std::vector<double> rects = {100, 100, 40, 20, 0};
  std::vector<double> means(3, -1);
  std::vector<double> deviations(3, -1);
  ASSERT_EQ(CalculateRectMeansStdDevs(image, rects.data(), rects.size(), means.data(), 3,
                                      deviations.data(), 3),
            0);
  cv::Mat mean;
  cv::Mat deviation;
  PolygonStats(image, {{40, 45}, {60, 45}, {60, 55}, {40, 55}}, mean, deviation);
  for (int c = 0; c < 3; ++c) {
    EXPECT_NEAR(means[c], mean.at<double>(c), 1e-9) << c;
    EXPECT_NEAR(deviations[c], deviation.at<double>(c), 1e-9) << c;
  }
}

TEST(CalculateRectMeansStdDevs, MeasuresTurnedRectanglesOfAnyChannelCount) {
  for (const int type : {CV_8UC1, CV_8UC4, CV_16UC2, CV_32FC3}) {
    const cv::Mat image = RandomImage(200, 300, type, 37);
    const int channels = image.channels();
    const std::vector<double> rects = {200, 150, 120, 40, 33, 420, 260, 60, 60, -70};
    std::vector<double> means(2 * channels);
    std::vector<double> deviations(2 * channels);
    ASSERT_EQ(CalculateRectMeansStdDevs(image, rects.data(), rects.size(), means.data(),
                                        means.size(), deviations.data(), deviations.size()),
              0);
    for (int i = 0; i < 2; ++i) {
      const cv::RotatedRect rect({float(rects[5 * i] / 2), float(rects[5 * i + 1] / 2)},
                                 {float(rects[5 * i + 2] / 2), float(rects[5 * i + 3] / 2)},
                                 float(rects[5 * i + 4]));
      cv::Point2f corners[4];
      rect.points(corners);
      // Corners are truncated relative to the region's integer origin.
      const cv::Rect bound = rect.boundingRect() & cv::Rect(0, 0, image.cols, image.rows);
      std::vector<cv::Point> polygon(4);
      for (int k = 0; k < 4; ++k) {
        polygon[k] = cv::Point(int(corners[k].x - float(bound.x)) + bound.x,
                               int(corners[k].y - float(bound.y)) + bound.y);
      }
      cv::Mat mean;
      cv::Mat deviation;
      PolygonStats(image, polygon, mean, deviation);
      for (int c = 0; c < channels; ++c) {
        EXPECT_NEAR(means[i * channels + c], mean.at<double>(c), 1e-6) << type << " " << i;
        EXPECT_NEAR(deviations[i * channels + c], deviation.at<double>(c), 1e-6);
      }
    }
  }
}

TEST(CalculateRectMeansStdDevs, RefusesArraysOfTheWrongLength) {
  const cv::Mat image = RandomImage(50, 50, CV_8UC3, 41);
  const std::vector<double> rects = {20, 20, 10, 10, 0, 40, 40, 10, 10, 0};
  std::vector<double> means(7, -1);
  std::vector<double> deviations(7, -1);
  {
    ocr::log::ScopedCapture capture;
    EXPECT_EQ(CalculateRectMeansStdDevs(image, rects.data(), rects.size(), means.data(), 7,
                                        deviations.data(), 7),
              -1);
    EXPECT_TRUE(capture.Contains("Color_Adjustment: Number of rects and means don't match",
                                 ocr::log::kError));
  }
  {
    ocr::log::ScopedCapture capture;
    EXPECT_EQ(CalculateRectMeansStdDevs(image, rects.data(), rects.size(), means.data(), 6,
                                        deviations.data(), 5),
              -1);
    EXPECT_TRUE(capture.Contains("Color_Adjustment: Number of rects and std_devs don't match",
                                 ocr::log::kError));
  }
  EXPECT_EQ(means, std::vector<double>(7, -1));
  EXPECT_EQ(deviations, std::vector<double>(7, -1));
}

TEST(CalculateRectMeansStdDevs, IgnoresSurplusValuesAndShortArrays) {
  const cv::Mat image(50, 50, CV_8UC3, cv::Scalar(10, 20, 30));
  const std::vector<double> rects = {20, 20, 10, 10, 0, 60, 60, 10, 10, 0, 1, 2};
  std::vector<double> means(6, -1);
  std::vector<double> deviations(6, -1);
  ASSERT_EQ(
      CalculateRectMeansStdDevs(image, rects.data(), 12, means.data(), 6, deviations.data(), 6), 0);
  EXPECT_EQ(means, (std::vector<double>{10, 20, 30, 10, 20, 30}));
  EXPECT_EQ(deviations, std::vector<double>(6, 0));

  EXPECT_EQ(CalculateRectMeansStdDevs(image, rects.data(), 4, nullptr, 0, nullptr, 0), 0);
  EXPECT_EQ(CalculateRectMeansStdDevs(image, nullptr, 0, nullptr, 0, nullptr, 0), 0);
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
