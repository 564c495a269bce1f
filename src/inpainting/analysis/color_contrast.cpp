#include "inpainting/analysis/color_contrast.h"

#include <algorithm>
#include <cmath>

#include "common/log.h"
#include "common/nanotime.h"

namespace ocr_inpainting {
namespace {

constexpr double kInverse255 = 0.00392156862745098;
// The linear segment ends at 0.03928 on the encoded side (the older sRGB
// figure, not 0.04045); the threshold and both slopes are kept consistent
// with it.
constexpr double kEncodedThreshold = 0.03928;
constexpr double kLinearThreshold = 0.003040247678018576;  // 0.03928 / 12.92
constexpr double kDecodeLowSlope = 0.0003035269835488375;  // 1 / (255 * 12.92)
constexpr double kDecodeScale = 0.0037171266610909765;     // 1 / (255 * 1.055)
constexpr double kDecodeOffset = 0.05213270142180095;      // 0.055 / 1.055
constexpr double kGamma = 2.4;
constexpr double kInverseGamma = 0.4166666666666667;

constexpr double kMinContrast = 4.5;
// Ratios this close to 1 give no reliable direction (lighter or darker).
constexpr double kDeadZone = 0.1;
constexpr double kBlackLuminance = 0.01;
// On a dark background the target for darker text is lowered so that it
// stays positive: 0.01 + 0.003 / background luminance.
constexpr double kDarkBackgroundFactor = 16.666666666666664;  // 1 / 0.06
// Light colours (by HLS lightness on 0..255) get at most 70 % less change.
constexpr double kDampingSlope = 0.002745098039215686;  // 0.7 / 255

void LogLinear(const cv::Scalar& linear) {
  OCR_LOGD("Linear RGB color = (%.4f,%.4f,%.4f)", linear[0], linear[1], linear[2]);
}

}  // namespace

double SRGBReverseConvert(double v) {
  if (v * kInverse255 >= kEncodedThreshold)
    return std::pow(v * kDecodeScale + kDecodeOffset, kGamma);
  return v * kDecodeLowSlope;
}

double SRGBConvert(double lin) {
  double encoded = 0.0;
  if (lin > kLinearThreshold)
    encoded = 1.055 * std::pow(lin, kInverseGamma) - 0.055;
  else
    encoded = 12.92 * lin;
  return encoded * 255.0;
}

void GetLinearRGBColor(const cv::Scalar& color, cv::Scalar& linear) {
  for (int c = 0; c < 3; ++c)
    linear[c] = SRGBReverseConvert(color[c]);
  LogLinear(linear);
}

double GetEffectiveLuminance(const cv::Scalar& linear) {
  return 0.2126 * linear[0] + 0.7152 * linear[1] + 0.0722 * linear[2];
}

double GetContrastRatio(double l1, double l2) {
  const double hi = std::max(l1, l2);
  const double lo = std::min(l1, l2);
  return (hi + 0.05) / (lo + 0.05);
}

void RGBColorEnhance(cv::Scalar& linear, double factor) {
  // Each test uses the scale in force at that point, so the scale ends as the
  // largest value up to `factor` that keeps every channel <= 1. A channel at
  // 0 never limits it.
  double scale = factor;
  for (int c = 0; c < 3; ++c) {
    if (linear[c] * scale > 1.0)
      scale = 1.0 / linear[c];
  }
  for (int c = 0; c < 3; ++c)
    linear[c] = std::min(linear[c] * scale, 1.0);
  OCR_LOGD("RGB enhanced color = (%.4f,%.4f,%.4f)", linear[0], linear[1], linear[2]);
}

bool ForceColorContrast(const cv::Scalar& background, cv::Scalar* color) {
  const uint64_t start_ns = get_nanotime();
  cv::Scalar linear_background;
  GetLinearRGBColor(background, linear_background);
  cv::Scalar linear_color;
  GetLinearRGBColor(*color, linear_color);

  // Damping input: the HLS lightness (channel 1), logged as "sat"; lightness
  // rather than saturation is intended.
  cv::Scalar hls;
  Rgb2Hsl(*color, &hls);
  const double damping_input = hls[1];

  const double background_luminance = GetEffectiveLuminance(linear_background);
  const double color_luminance = GetEffectiveLuminance(linear_color);
  const double ratio = GetContrastRatio(background_luminance, color_luminance);
  OCR_LOGD("ForceColorContrast - Existing color contrast = %.2f", ratio);
  if (ratio >= kMinContrast)
    return true;
  if (std::abs(ratio - 1.0) < kDeadZone) {
    OCR_LOGD("ForceColorContrast - contrast is too low to detect the right enhancement direction");
    return true;
  }

  double target_luminance = 0.0;
  if (background_luminance > color_luminance) {
    if (color_luminance < kBlackLuminance) {
      OCR_LOGD("ForceColorContrast - color is already black");
      return true;
    }
    double k = kMinContrast;
    if (background_luminance * kDarkBackgroundFactor < kMinContrast)
      k = background_luminance * kDarkBackgroundFactor;
    target_luminance = (background_luminance + 0.05) / k - 0.05;
  } else {
    target_luminance = (background_luminance + 0.05) * kMinContrast - 0.05;
  }

  const double factor = target_luminance / color_luminance;
  const double corrected = (factor - 1.0) * (1.0 - damping_input * kDampingSlope) + 1.0;
  OCR_LOGD(
      "ForceColorContrast - enhancement in RGB linear space: original = %.2f, corrected = %.2f, "
      "sat = %.2f",
      factor, corrected, damping_input);
  RGBColorEnhance(linear_color, corrected);
  for (int c = 0; c < 3; ++c)
    (*color)[c] = SRGBConvert(linear_color[c]);

  const uint64_t end_ns = get_nanotime();
  OCR_LOGD("ForceColorContrast took %lld ns", static_cast<long long>(end_ns - start_ns));
  return false;
}

}  // namespace ocr_inpainting
