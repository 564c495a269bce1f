#pragma once

#include <algorithm>
#include <cstdint>

#include <opencv2/core/types.hpp>

// Integer-rectangle arithmetic in 64 bits: rectangles derived from host data
// can lie anywhere, and cv::Rect's own operators add in int.
namespace ocr_inpainting {

// Whether both sides are positive: the one test of "has something in it" for
// sizes and for integer and double boxes alike.
template <typename T>
bool HasPositiveSides(const cv::Size_<T>& size) {
  return size.width > 0 && size.height > 0;
}
template <typename T>
bool HasPositiveSides(const cv::Rect_<T>& box) {
  return HasPositiveSides(box.size());
}

inline int64_t RectArea(const cv::Rect& rect) {
  return static_cast<int64_t>(rect.width) * rect.height;
}

// `box` intersected with the image rectangle (0, 0, size); (0, 0, 0, 0) when
// they do not overlap.
inline cv::Rect ClipToImage(const cv::Rect& box, const cv::Size& size) {
  if (!HasPositiveSides(box))
    return cv::Rect();
  const int64_t x1 = std::max<int64_t>(box.x, 0);
  const int64_t y1 = std::max<int64_t>(box.y, 0);
  const int64_t x2 = std::min<int64_t>(static_cast<int64_t>(box.x) + box.width, size.width);
  const int64_t y2 = std::min<int64_t>(static_cast<int64_t>(box.y) + box.height, size.height);
  if (x2 <= x1 || y2 <= y1)
    return cv::Rect();
  return cv::Rect(static_cast<int>(x1), static_cast<int>(y1), static_cast<int>(x2 - x1),
                  static_cast<int>(y2 - y1));
}

}  // namespace ocr_inpainting
