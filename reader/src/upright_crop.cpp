#include "upright_crop.h"

#include <algorithm>
#include <cmath>
#include <stdexcept>

#include <opencv2/imgproc.hpp>

#include "textreader/text_reader.h"

namespace textreader {

cv::Mat CropUpright(const cv::Mat& image, const Corners& corners, int height) {
  const cv::RotatedRect rect = RectFromCorners(corners);
  const float line_height = std::max(rect.size.height, 1.0F);
  const double width = std::ceil(height * rect.size.width / line_height);
  const int crop_width = static_cast<int>(std::clamp(width, 1.0, double{kMaxCropWidth}));
  const cv::Point2f target[4] = {{0.0F, 0.0F},
                                 {static_cast<float>(crop_width), 0.0F},
                                 {static_cast<float>(crop_width), static_cast<float>(height)},
                                 {0.0F, static_cast<float>(height)}};
  const cv::Mat transform = cv::getPerspectiveTransform(corners.data(), target);
  cv::Mat crop;
  cv::warpPerspective(image, crop, transform, cv::Size(crop_width, height), cv::INTER_CUBIC,
                      cv::BORDER_REPLICATE);
  return crop;
}

cv::Mat UprightCrop(const cv::Mat& image, const TextLine& line, int height) {
  if (image.empty() || height <= 0)
    throw std::invalid_argument("UprightCrop: empty image or height not positive");
  return CropUpright(image, line.corners, height);
}

}  // namespace textreader
