#include "recogniser.h"

#include <algorithm>
#include <numeric>
#include <stdexcept>

#include "blob.h"
#include "textreader/text_reader.h"

namespace textreader {
namespace {

// Lines of similar width share a batch, so that little of it is padding.
constexpr std::size_t kBatch = 6;

}  // namespace

Recogniser::Recogniser(const std::string& path, Alphabet alphabet, int threads, int min_width)
    : model_(path, 4, threads), alphabet_(std::move(alphabet)), min_width_(min_width) {
  // One blank line of the smallest width tells the class count.
  Tensor probe;
  probe.shape = {1, 3, kRecogniserHeight, min_width_};
  probe.values.assign(3 * static_cast<std::size_t>(kRecogniserHeight) * min_width_, 0.0F);
  const Tensor output = model_.Run(probe);
  if (output.shape.size() != 3 || output.shape[2] != static_cast<std::int64_t>(alphabet_.size()))
    throw ModelError("recogniser's classes do not match its alphabet of " +
                     std::to_string(alphabet_.size()) + ": " + path);
}

std::vector<Reading> Recogniser::Read(const std::vector<cv::Mat>& crops) const {
  std::vector<std::size_t> order(crops.size());
  std::iota(order.begin(), order.end(), 0);
  std::sort(order.begin(), order.end(),
            [&](std::size_t a, std::size_t b) { return crops[a].cols < crops[b].cols; });
  std::vector<Reading> readings(crops.size());
  for (std::size_t first = 0; first < order.size(); first += kBatch) {
    const std::size_t last = std::min(order.size(), first + kBatch);
    std::vector<const cv::Mat*> batch;
    for (std::size_t i = first; i < last; ++i)
      batch.push_back(&crops[order[i]]);
    std::vector<Reading> batch_readings = ReadBatch(batch);
    for (std::size_t i = first; i < last; ++i)
      readings[order[i]] = std::move(batch_readings[i - first]);
  }
  return readings;
}

std::vector<Reading> Recogniser::ReadBatch(const std::vector<const cv::Mat*>& batch) const {
  int width = min_width_;
  for (const cv::Mat* crop : batch)
    width = std::max(width, crop->cols);
  const std::size_t plane = static_cast<std::size_t>(kRecogniserHeight) * width;
  Tensor input;
  input.shape = {static_cast<std::int64_t>(batch.size()), 3, kRecogniserHeight, width};
  input.values.assign(batch.size() * 3 * plane, 0.0F);  // zero padding on the right
  for (std::size_t i = 0; i < batch.size(); ++i) {
    CV_Assert(batch[i]->rows == kRecogniserHeight);
    WriteBlob(*batch[i], LineNormalisation(), kRecogniserHeight, width,
              &input.values[i * 3 * plane]);
  }
  const Tensor output = model_.Run(input);
  const std::int64_t classes = static_cast<std::int64_t>(alphabet_.size());
  if (output.shape.size() != 3 || output.shape[0] != static_cast<std::int64_t>(batch.size()) ||
      output.shape[2] != classes)
    throw std::runtime_error("text reader: unexpected recogniser output from " + model_.path());
  const int steps = static_cast<int>(output.shape[1]);
  std::vector<Reading> readings(batch.size());
  for (std::size_t i = 0; i < batch.size(); ++i) {
    readings[i].decoded =
        DecodeCtc(&output.values[i * static_cast<std::size_t>(steps * classes)], steps, alphabet_);
    readings[i].content_share = static_cast<float>(batch[i]->cols) / static_cast<float>(width);
    readings[i].steps = steps;
  }
  return readings;
}

}  // namespace textreader
