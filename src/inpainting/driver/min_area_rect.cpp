#include "inpainting/driver/min_area_rect.h"

#include <utility>

#include <opencv2/imgproc.hpp>

namespace ocr_inpainting {

cv::RotatedRect MinAreaRectOpenCv3(const std::vector<cv::Point2f>& points) {
  cv::RotatedRect box = cv::minAreaRect(points);
  if (box.size.height == 0.0f || !(box.angle > 0.0f && box.angle <= 90.0f))
    return box;
  if (box.angle == 90.0f) {
    // The upright box: a half turn describes it as well, so only the sign changes.
    box.angle = -90.0f;
  } else {
    // A quarter turn back, with the sides exchanged, is the same box.
    box.angle -= 90.0f;
    std::swap(box.size.width, box.size.height);
  }
  return box;
}

}  // namespace ocr_inpainting
