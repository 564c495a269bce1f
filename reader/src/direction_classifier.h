// The 0/180 degree classifier: which upright crops are upside down.
#ifndef TEXTREADER_DIRECTION_CLASSIFIER_H_
#define TEXTREADER_DIRECTION_CLASSIFIER_H_

#include <string>
#include <vector>

#include <opencv2/core.hpp>

#include "onnx_model.h"

namespace textreader {

class DirectionClassifier {
 public:
  DirectionClassifier(const std::string& path, int threads) : model_(path, 4, threads) {}

  // For each crop (8-bit R G B (A), any size): whether the network is sure
  // (over 0.9) that it is upside down.
  std::vector<bool> UpsideDown(const std::vector<cv::Mat>& crops) const;

 private:
  OnnxModel model_;
};

}  // namespace textreader

#endif  // TEXTREADER_DIRECTION_CLASSIFIER_H_
