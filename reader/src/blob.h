// Pixels to network input: the models were trained on B, G, R planes,
// normalised per channel; the callers' images are R, G, B (A).
#ifndef TEXTREADER_BLOB_H_
#define TEXTREADER_BLOB_H_

#include <array>

#include <opencv2/core.hpp>

namespace textreader {

// (x / 255 - mean) / std per channel, in the network's B, G, R order.
struct Normalisation {
  std::array<float, 3> mean;
  std::array<float, 3> std;
};

// The detector's (ImageNet statistics) and the classifier's and recogniser's.
Normalisation DetectorNormalisation();
Normalisation LineNormalisation();

// Writes `rgb` (CV_8UC3 R G B or CV_8UC4 R G B A) as three planes of
// `plane_rows` x `plane_cols` floats at `planes`, B first, into the top-left
// corner: the rest of each plane keeps what it held (the padding).
void WriteBlob(const cv::Mat& rgb, const Normalisation& normalisation, int plane_rows,
               int plane_cols, float* planes);

}  // namespace textreader

#endif  // TEXTREADER_BLOB_H_
