#include "inpainting/driver/rect_decoding.h"

#include "inpainting/driver/numeric_casts.h"
#include "inpainting/inpainting_constants.h"

namespace ocr_inpainting {

std::vector<cv::RotatedRect> TransformVector2RotatedRect(const std::vector<double>& values) {
  const size_t count = values.size() / kValsPerRect;
  std::vector<cv::RotatedRect> rects;
  rects.reserve(count);
  for (size_t k = 0; k < count; ++k) {
    const double* v = &values[k * kValsPerRect];
    rects.emplace_back(cv::Point2f(NarrowToFloat(v[0]), NarrowToFloat(v[1])),
                       cv::Size2f(NarrowToFloat(v[2]), NarrowToFloat(v[3])), NarrowToFloat(v[4]));
  }
  return rects;
}

}  // namespace ocr_inpainting
