#include "blob.h"

#include <cstddef>

namespace textreader {

Normalisation DetectorNormalisation() {
  // B, G, R of the ImageNet means and deviations.
  return {{0.406F, 0.456F, 0.485F}, {0.225F, 0.224F, 0.229F}};
}

Normalisation LineNormalisation() {
  return {{0.5F, 0.5F, 0.5F}, {0.5F, 0.5F, 0.5F}};
}

void WriteBlob(const cv::Mat& rgb, const Normalisation& normalisation, int plane_rows,
               int plane_cols, float* planes) {
  CV_Assert(rgb.depth() == CV_8U && (rgb.channels() == 3 || rgb.channels() == 4));
  CV_Assert(rgb.rows <= plane_rows && rgb.cols <= plane_cols);
  const int channels = rgb.channels();
  const std::size_t plane_size = static_cast<std::size_t>(plane_rows) * plane_cols;
  // Plane p (B, G, R) takes source channel 2 - p; x / 255 then (. - mean) / std
  // folds into one multiply-add.
  std::array<float, 3> scale{};
  std::array<float, 3> offset{};
  for (int p = 0; p < 3; ++p) {
    scale[p] = 1.0F / (255.0F * normalisation.std[p]);
    offset[p] = -normalisation.mean[p] / normalisation.std[p];
  }
  for (int y = 0; y < rgb.rows; ++y) {
    const unsigned char* row = rgb.ptr<unsigned char>(y);
    for (int p = 0; p < 3; ++p) {
      float* out = planes + p * plane_size + static_cast<std::size_t>(y) * plane_cols;
      const unsigned char* in = row + (2 - p);
      for (int x = 0; x < rgb.cols; ++x)
        out[x] = static_cast<float>(in[x * channels]) * scale[p] + offset[p];
    }
  }
}

}  // namespace textreader
