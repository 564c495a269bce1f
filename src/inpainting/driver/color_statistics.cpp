#include "inpainting/driver/color_statistics.h"

#include <tbb/blocked_range.h>
#include <tbb/parallel_for.h>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/convex_fill.h"
#include "common/log.h"
#include "inpainting/driver/numeric_casts.h"
#include "inpainting/driver/rect_clipping.h"
#include "inpainting/inpainting_constants.h"

namespace ocr_inpainting {
namespace {

// Rectangles arrive in the coordinates of an image twice the size.
constexpr double kRectScale = 0.5;

cv::RotatedRect HalfScaleRect(const double* v) {
  return cv::RotatedRect(
      cv::Point2f(NarrowToFloat(v[0] * kRectScale), NarrowToFloat(v[1] * kRectScale)),
      cv::Size2f(NarrowToFloat(v[2] * kRectScale), NarrowToFloat(v[3] * kRectScale)),
      NarrowToFloat(v[4]));
}

// Mean and deviation (channels x 1, CV_64F) of the image pixels inside `rect`.
void MeasureRect(const cv::Mat& image, const cv::RotatedRect& rect, cv::Mat& mean,
                 cv::Mat& deviation) {
  const cv::Rect bound = ClipToImage(rect.boundingRect(), image.size());
  if (bound.empty()) {
    // OpenCV 3's meanStdDev answered an empty input with zeros; 4.x asserts.
    mean = cv::Mat::zeros(image.channels(), 1, CV_64F);
    deviation = cv::Mat::zeros(image.channels(), 1, CV_64F);
    return;
  }
  cv::Mat mask = cv::Mat::zeros(bound.size(), CV_8UC1);
  cv::Point2f corners[4];
  rect.points(corners);
  cv::Point polygon[4];
  for (int k = 0; k < 4; ++k) {
    polygon[k] = cv::Point(SaturatingTruncToInt(corners[k].x - static_cast<float>(bound.x)),
                           SaturatingTruncToInt(corners[k].y - static_cast<float>(bound.y)));
  }
  ocr::FillConvexPolygon(mask, polygon, 4, cv::Scalar(255));
  cv::meanStdDev(image(bound), mean, deviation, mask);
}

}  // namespace

int CalculateRectMeansStdDevs(const cv::Mat& image, const double* rect_values, size_t rect_length,
                              double* means, size_t means_length, double* std_devs,
                              size_t std_devs_length) {
  const size_t count = rect_length / kValsPerRect;
  const auto channels = static_cast<size_t>(image.channels());
  if (means_length != channels * count) {
    OCR_LOGE("Color_Adjustment: Number of rects and means don't match");
    return -1;
  }
  if (std_devs_length != means_length) {
    OCR_LOGE("Color_Adjustment: Number of rects and std_devs don't match");
    return -1;
  }
  if (rect_length < static_cast<size_t>(kValsPerRect))
    return 0;

  tbb::parallel_for(
      tbb::blocked_range<int>(0, static_cast<int>(count)),
      [&](const tbb::blocked_range<int>& range) {
        for (int i = range.begin(); i != range.end(); ++i) {
          cv::Mat mean;
          cv::Mat deviation;
          MeasureRect(image, HalfScaleRect(rect_values + static_cast<size_t>(i) * kValsPerRect),
                      mean, deviation);
          for (size_t c = 0; c < channels; ++c) {
            means[i * channels + c] = mean.at<double>(static_cast<int>(c));
            std_devs[i * channels + c] = deviation.at<double>(static_cast<int>(c));
          }
        }
      },
      tbb::auto_partitioner());
  return 0;
}

}  // namespace ocr_inpainting
