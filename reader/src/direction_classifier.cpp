#include "direction_classifier.h"

#include <algorithm>
#include <cmath>
#include <stdexcept>

#include <opencv2/imgproc.hpp>

#include "blob.h"

namespace textreader {
namespace {

constexpr int kHeight = 48;
constexpr int kWidth = 192;
constexpr int kBatch = 6;
constexpr float kSure = 0.9F;

}  // namespace

std::vector<bool> DirectionClassifier::UpsideDown(const std::vector<cv::Mat>& crops) const {
  std::vector<bool> upside_down(crops.size(), false);
  const std::size_t plane = static_cast<std::size_t>(kHeight) * kWidth;
  for (std::size_t first = 0; first < crops.size(); first += kBatch) {
    const std::size_t count = std::min<std::size_t>(kBatch, crops.size() - first);
    Tensor input;
    input.shape = {static_cast<std::int64_t>(count), 3, kHeight, kWidth};
    input.values.assign(count * 3 * plane, 0.0F);  // zero padding on the right
    for (std::size_t i = 0; i < count; ++i) {
      const cv::Mat& crop = crops[first + i];
      const double aspect = static_cast<double>(crop.cols) / std::max(crop.rows, 1);
      const int width = std::clamp(static_cast<int>(std::ceil(kHeight * aspect)), 1, kWidth);
      cv::Mat scaled;
      cv::resize(crop, scaled, cv::Size(width, kHeight));
      WriteBlob(scaled, LineNormalisation(), kHeight, kWidth, &input.values[i * 3 * plane]);
    }
    const Tensor output = model_.Run(input);
    if (output.values.size() != count * 2)
      throw std::runtime_error("text reader: unexpected classifier output from " + model_.path());
    for (std::size_t i = 0; i < count; ++i)
      upside_down[first + i] = output.values[i * 2 + 1] > kSure;
  }
  return upside_down;
}

}  // namespace textreader
