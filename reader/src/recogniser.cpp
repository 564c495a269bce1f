#include "recogniser.h"

#include <algorithm>
#include <stdexcept>

#include "blob.h"
#include "textreader/text_reader.h"

namespace textreader {
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

// Each crop is read at its own width. A batch would be padded to its widest
// line, and the network's cost grows with the width: even lines of equal
// width read faster one by one (measured with one and with two threads).
std::vector<Reading> Recogniser::Read(const std::vector<cv::Mat>& crops) const {
  std::vector<Reading> readings;
  readings.reserve(crops.size());
  for (const cv::Mat& crop : crops)
    readings.push_back(ReadOne(crop));
  return readings;
}

Reading Recogniser::ReadOne(const cv::Mat& crop) const {
  CV_Assert(crop.rows == kRecogniserHeight);
  const int width = std::max(min_width_, crop.cols);
  Tensor input;
  input.shape = {1, 3, kRecogniserHeight, width};
  // Zero padding on the right.
  input.values.assign(3 * static_cast<std::size_t>(kRecogniserHeight) * width, 0.0F);
  WriteBlob(crop, LineNormalisation(), kRecogniserHeight, width, input.values.data());
  const Tensor output = model_.Run(input);
  const std::int64_t classes = static_cast<std::int64_t>(alphabet_.size());
  if (output.shape.size() != 3 || output.shape[0] != 1 || output.shape[2] != classes)
    throw std::runtime_error("text reader: unexpected recogniser output from " + model_.path());
  Reading reading;
  reading.steps = static_cast<int>(output.shape[1]);
  reading.decoded = DecodeCtc(output.values.data(), reading.steps, alphabet_);
  reading.content_share = static_cast<float>(crop.cols) / static_cast<float>(width);
  return reading;
}

}  // namespace textreader
