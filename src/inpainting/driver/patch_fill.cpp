#include "inpainting/driver/patch_fill.h"

#include <vector>

#include <opencv2/imgproc.hpp>
#include <opencv2/photo.hpp>

#include "common/log.h"

namespace ocr_inpainting {
namespace {

constexpr double kFillRadius = 3.0;
// Distance from the text up to which the overlay stays fully opaque.
constexpr double kOpaqueDistance = 3.0;
constexpr double kMinRampEnd = 4.0;
constexpr double kMaxRampEnd = 20.0;

}  // namespace

void InpaintingThreshold(const cv::Mat& patch, const cv::Mat& mask, cv::Mat& filled) {
  if (patch.rows < kHalfResolutionFillRows) {
    cv::inpaint(patch, mask, filled, kFillRadius, cv::INPAINT_TELEA);
    return;
  }
  cv::Mat small_patch;
  cv::Mat small_mask;
  cv::Mat small_filled;
  cv::resize(patch, small_patch, cv::Size(), 0.5, 0.5, cv::INTER_LINEAR);
  cv::resize(mask, small_mask, small_patch.size(), 0.0, 0.0, cv::INTER_LINEAR);
  cv::inpaint(small_patch, small_mask, small_filled, kFillRadius, cv::INPAINT_TELEA);
  cv::resize(small_filled, filled, cv::Size(patch.cols, patch.rows), 0.0, 0.0, cv::INTER_LINEAR);
}

void AddAlphaChannel(const cv::Mat& filled, const cv::Mat& mask, cv::Mat* overlay) {
  std::vector<cv::Mat> channels;
  cv::split(filled, channels);

  // Distance of every pixel to the nearest text pixel (0 on the text).
  const cv::Mat inverse = 255 - mask;
  cv::Mat distance;
  cv::distanceTransform(inverse, distance, cv::DIST_L2, cv::DIST_MASK_PRECISE, CV_32F);

  double ramp_end = 0.0;
  cv::minMaxLoc(distance, nullptr, &ramp_end);
  OCR_LOGD("AddAlphaChannel: max_distance = %f", ramp_end);
  if (ramp_end > kMaxRampEnd)
    ramp_end = kMaxRampEnd;
  else if (ramp_end < kMinRampEnd)
    ramp_end = kMinRampEnd;
  OCR_LOGD("AddAlphaChannel: adjusted max_distance = %f", ramp_end);

  const cv::Mat ramp = (distance - kOpaqueDistance) / (ramp_end - kOpaqueDistance);
  cv::Mat alpha;
  ramp.convertTo(alpha, filled.depth(), -255.0, 255.0);

  channels.push_back(alpha);
  cv::merge(channels, *overlay);
}

}  // namespace ocr_inpainting
