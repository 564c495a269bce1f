#include "inpainting/analysis/color_contrast.h"

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

// Single-colour conversions through OpenCV's float colour code. Float
// RGB->HLS does not clamp its input in OpenCV 3 or 4, so 0..255 input gives a
// 0..255 lightness; float RGB->Lab expects 0..1 (4.6 clips larger input).
namespace ocr_inpainting {
namespace {

cv::Mat OnePixel(const cv::Scalar& value) {
  return cv::Mat(1, 1, CV_32FC3, cv::Scalar(value[0], value[1], value[2]));
}

}  // namespace

void Rgb2Hsl(const cv::Scalar& rgb, cv::Scalar* hls) {
  // Not rescaled on purpose: the lightness stays on the 0..255 scale.
  cv::Mat converted;
  cv::cvtColor(OnePixel(rgb), converted, cv::COLOR_RGB2HLS);
  *hls = cv::mean(converted);
}

cv::Scalar GetLabColor(const cv::Scalar& rgb) {
  // Scaled to 0..1: the float Lab conversion clips larger input, which would
  // turn every colour brighter than 1/255 into white.
  const cv::Mat pixel(1, 1, CV_64FC3, cv::Scalar(rgb[0], rgb[1], rgb[2]));
  cv::Mat rgb_float;
  pixel.convertTo(rgb_float, CV_32FC3, 1.0 / 255.0);
  cv::Mat lab;
  cv::cvtColor(rgb_float, lab, cv::COLOR_RGB2Lab);
  return cv::mean(lab);
}

void GetRgbColor(const cv::Scalar& lab, cv::Scalar* rgb) {
  // Float Lab->RGB gives 0..1; scaled back to 0..255 as GetLabColor's input.
  cv::Mat rgb_float;
  cv::cvtColor(OnePixel(lab), rgb_float, cv::COLOR_Lab2RGB);
  cv::Mat rgb_8u;
  rgb_float.convertTo(rgb_8u, CV_8UC3, 255.0);
  *rgb = cv::mean(rgb_8u);
}

}  // namespace ocr_inpainting
