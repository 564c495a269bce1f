// The CTC line recogniser: upright crops in, text out.
#ifndef TEXTREADER_RECOGNISER_H_
#define TEXTREADER_RECOGNISER_H_

#include <string>
#include <vector>

#include <opencv2/core.hpp>

#include "alphabet.h"
#include "ctc_decoder.h"
#include "onnx_model.h"

namespace textreader {

// The height the recogniser reads.
constexpr int kRecogniserHeight = 48;

struct Reading {
  Decoded decoded;
  // The crop's share of the network's input width: the CTC steps cover the
  // whole (padded) input, the characters lie in this first part.
  float content_share = 1.0F;
  int steps = 0;
};

class Recogniser {
 public:
  // Throws ModelError when the model's classes do not match `alphabet`.
  // Lines are padded to at least `min_width`.
  Recogniser(const std::string& path, Alphabet alphabet, int threads, int min_width);

  // Reads crops `kRecogniserHeight` pixels high (8-bit R G B (A)), one by
  // one; one reading per crop, in order.
  std::vector<Reading> Read(const std::vector<cv::Mat>& crops) const;

 private:
  Reading ReadOne(const cv::Mat& crop) const;

  OnnxModel model_;
  Alphabet alphabet_;
  int min_width_;
};

}  // namespace textreader

#endif  // TEXTREADER_RECOGNISER_H_
