#include "detector.h"

#include <algorithm>
#include <cmath>
#include <stdexcept>

#include <opencv2/imgproc.hpp>

#include "blob.h"

namespace textreader {

cv::Size DetectorInputSize(cv::Size image, int long_side) {
  const double scale = static_cast<double>(long_side) / std::max(image.width, image.height);
  const auto round32 = [](double side) {
    return std::max(32, static_cast<int>(std::lround(side / 32.0)) * 32);
  };
  return {round32(image.width * scale), round32(image.height * scale)};
}

cv::Mat Detector::ProbabilityMap(const cv::Mat& rgb, int long_side) const {
  const cv::Size size = DetectorInputSize(rgb.size(), long_side);
  cv::Mat scaled;
  // Area averaging when shrinking keeps thin strokes of a large image.
  const bool shrinking = size.area() < rgb.size().area();
  cv::resize(rgb, scaled, size, 0, 0, shrinking ? cv::INTER_AREA : cv::INTER_LINEAR);

  Tensor input;
  input.shape = {1, 3, size.height, size.width};
  input.values.resize(3 * static_cast<std::size_t>(size.area()));
  WriteBlob(scaled, DetectorNormalisation(), size.height, size.width, input.values.data());
  Tensor output = model_.Run(input);
  if (output.shape.size() != 4 || output.shape[2] != size.height || output.shape[3] != size.width)
    throw std::runtime_error("text reader: unexpected detector output shape from " + model_.path());
  return cv::Mat(size, CV_32F, output.values.data()).clone();
}

}  // namespace textreader
