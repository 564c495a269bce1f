#include "inpainting/driver/region_geometry.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <utility>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "inpainting/driver/min_area_rect.h"
#include "inpainting/driver/numeric_casts.h"
#include "inpainting/driver/rect_clipping.h"

namespace ocr_inpainting {
namespace {

constexpr double kDegreesToRadians = 0.017453292519943295;

void WarpToPatch(const cv::Mat& image, const cv::Mat& transform, const cv::Size& size,
                 cv::Mat& patch) {
  cv::warpAffine(image, patch, transform, size, cv::INTER_CUBIC | cv::WARP_INVERSE_MAP,
                 cv::BORDER_REPLICATE);
}

// The box around a rectangle given by its corners, with the angle folded
// into [-45, 45] (and the sides swapped when folding).
cv::RotatedRect FoldedBox(const std::vector<cv::Point2f>& corners) {
  cv::RotatedRect box = MinAreaRectOpenCv3(corners);
  if (box.angle < -45.0f) {
    box.angle += 90.0f;
    std::swap(box.size.width, box.size.height);
  }
  return box;
}

}  // namespace

void GetSizeAndTransform(const cv::RotatedRect& rect, cv::Size& size, cv::Mat& transform, int cap) {
  int w = SaturatingTruncToInt(std::ceil(rect.size.width));
  int h = SaturatingTruncToInt(std::ceil(rect.size.height));
  size = cv::Size(w, h);
  const int longest = std::max(w, h);
  if (longest > cap) {
    OCR_LOGD("Inpainting_Process: reducing size of large rectangle w: %d h: %d", w, h);
    // 64-bit products: a side can be anything the host sent.
    w = static_cast<int>(static_cast<int64_t>(w) * cap / longest);
    h = static_cast<int>(static_cast<int64_t>(h) * cap / longest);
    size = cv::Size(w, h);
  }
  cv::Point2f corners[4];
  rect.points(corners);
  const cv::Point2f patch_points[3] = {cv::Point2f(0.0f, static_cast<float>(h)),
                                       cv::Point2f(0.0f, 0.0f),
                                       cv::Point2f(static_cast<float>(w), 0.0f)};
  const cv::Point2f image_points[3] = {corners[0], corners[1], corners[2]};
  transform = cv::getAffineTransform(patch_points, image_points);
}

void GetWarpedImage(const cv::Mat& image, const cv::RotatedRect& rect, cv::Mat& patch) {
  cv::Size size;
  cv::Mat transform;
  GetSizeAndTransform(rect, size, transform, kLinePatchCap);
  if (HasPositiveSides(size)) {
    WarpToPatch(image, transform, size, patch);
    OCR_LOGI("Inpainting_Process:  rotated.rows = %d , rotated.cols = %d", patch.rows, patch.cols);
  } else {
    const int64_t area = static_cast<int64_t>(size.width) * size.height;
    OCR_LOGW("Inpainting_Process:  dst_size.area() = %d",
             static_cast<int>(std::clamp<int64_t>(area, INT32_MIN, INT32_MAX)));
  }
}

void GetWarpedImageVector(const std::vector<cv::Mat>& images, const cv::RotatedRect& rect,
                          std::vector<cv::Mat>& patches) {
  patches.resize(images.size());
  cv::Size size;
  cv::Mat transform;
  GetSizeAndTransform(rect, size, transform, kLinePatchCap);
  if (!HasPositiveSides(size))
    return;
  for (size_t i = 0; i < images.size(); ++i)
    WarpToPatch(images[i], transform, size, patches[i]);
}

void WarpPositions(const cv::Mat& transform, const std::vector<cv::RotatedRect>& rects,
                   std::vector<cv::RotatedRect>& out) {
  out.resize(rects.size());
  if (rects.empty())
    return;
  std::vector<cv::Point2f> corners;
  corners.reserve(rects.size() * 4);
  for (const cv::RotatedRect& rect : rects) {
    cv::Point2f points[4];
    rect.points(points);
    corners.insert(corners.end(), points, points + 4);
  }
  cv::Mat homogeneous = cv::Mat::eye(3, 3, transform.type());
  transform.copyTo(homogeneous.rowRange(0, 2));
  std::vector<cv::Point2f> mapped;
  cv::perspectiveTransform(corners, mapped, homogeneous.inv());
  for (size_t k = 0; k < rects.size(); ++k)
    out[k] = FoldedBox({mapped.begin() + 4 * k, mapped.begin() + 4 * k + 4});
}

cv::RotatedRect ComputeBoundingRect(const std::vector<cv::RotatedRect>& rects) {
  double angle_sum = 0.0;
  for (const cv::RotatedRect& rect : rects)
    angle_sum += rect.angle;
  const double mean_angle = angle_sum / static_cast<double>(rects.size());

  // In a frame turned by the mean angle the lines are near axis-aligned.
  const cv::Mat rotation = cv::getRotationMatrix2D(cv::Point2f(0.0f, 0.0f), -mean_angle, 1.0);
  std::vector<cv::RotatedRect> turned;
  WarpPositions(rotation, rects, turned);

  // cv::Rect union rules (an empty side yields the other), in double so that
  // far-off rectangles cannot overflow.
  cv::Rect2d bounds;
  for (const cv::RotatedRect& rect : turned) {
    const cv::Rect box = rect.boundingRect();
    bounds |= cv::Rect2d(box.x, box.y, box.width, box.height);
  }

  const double cx = bounds.x + bounds.width * 0.5;
  const double cy = bounds.y + bounds.height * 0.5;
  const double t = mean_angle * kDegreesToRadians;
  const cv::Point2f centre(static_cast<float>(std::cos(t) * cx - std::sin(t) * cy),
                           static_cast<float>(std::sin(t) * cx + std::cos(t) * cy));
  return cv::RotatedRect(
      centre, cv::Size2f(static_cast<float>(bounds.width), static_cast<float>(bounds.height)),
      static_cast<float>(mean_angle));
}

}  // namespace ocr_inpainting
