// A line's pixels warped upright, as the classifier and recogniser read them.
#ifndef TEXTREADER_UPRIGHT_CROP_H_
#define TEXTREADER_UPRIGHT_CROP_H_

#include <opencv2/core.hpp>

#include "box_geometry.h"

namespace textreader {

// Crops wider than this are squeezed to it: a recogniser reads no more.
constexpr int kMaxCropWidth = 4096;

// The quadrilateral `corners` (reading terms) of `image` warped to a
// rectangle `height` pixels high, its width from the line's aspect.
cv::Mat CropUpright(const cv::Mat& image, const Corners& corners, int height);

}  // namespace textreader

#endif  // TEXTREADER_UPRIGHT_CROP_H_
