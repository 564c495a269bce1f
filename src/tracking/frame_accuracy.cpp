#include "tracking/frame_accuracy.h"

#include <opencv2/imgproc.hpp>

namespace zeph {
namespace {

cv::Mat RedGreenHistogram(const cv::Mat& rgba) {
  cv::Mat rgb;
  cv::cvtColor(rgba, rgb, cv::COLOR_RGBA2RGB);
  // Three channels and bin counts are listed, but with dimensionality 2 only
  // the first two of each take part: a 256 x 256 histogram over R and G.
  const int channels[] = {0, 1, 2};
  const int bins[] = {256, 256, 256};
  const float range[] = {0.0f, 256.0f};
  const float* ranges[] = {range, range, range};
  cv::Mat hist;
  cv::calcHist(&rgb, 1, channels, cv::Mat(), hist, 2, bins, ranges, true, false);
  cv::normalize(hist, hist, 0.0, static_cast<double>(hist.rows), cv::NORM_MINMAX, -1, cv::Mat());
  return hist;
}

}  // namespace

double CalculateFrameAccuracy(const cv::Mat& first_rgba, const cv::Mat& second_rgba) {
  const cv::Mat first = RedGreenHistogram(first_rgba);
  const cv::Mat second = RedGreenHistogram(second_rgba);
  return cv::compareHist(first, second, cv::HISTCMP_CORREL);
}

}  // namespace zeph
