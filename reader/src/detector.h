// The DB text detector: a probability of text for every pixel of the image
// scaled to a chosen long side.
#ifndef TEXTREADER_DETECTOR_H_
#define TEXTREADER_DETECTOR_H_

#include <string>

#include <opencv2/core.hpp>

#include "onnx_model.h"

namespace textreader {

// The network's input size for an image: its long side scaled to
// `long_side`, aspect kept, each side rounded to a multiple of 32 (the
// network's stride), at least 32.
cv::Size DetectorInputSize(cv::Size image, int long_side);

class Detector {
 public:
  Detector(const std::string& path, int threads) : model_(path, 4, threads) {}

  // CV_32F probabilities in 0..1 at DetectorInputSize(rgb.size(), long_side).
  cv::Mat ProbabilityMap(const cv::Mat& rgb, int long_side) const;

 private:
  OnnxModel model_;
};

}  // namespace textreader

#endif  // TEXTREADER_DETECTOR_H_
