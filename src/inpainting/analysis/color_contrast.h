#pragma once

#include <opencv2/core/types.hpp>

// Colour conversions and the contrast rule for the detected text colour.
// Colours are cv::Scalar with channels 0, 1, 2 = R, G, B, gamma-encoded sRGB
// in 0..255 (channel 3 unused); linear colours have R, G, B in 0..1. Pure
// functions apart from logging; callable from any thread.
namespace ocr_inpainting {

// Linear value (0..1) of an encoded channel (0..255); the linear segment
// ends at 0.03928 on the encoded side.
double SRGBReverseConvert(double v);

// Encoded channel (0..255, neither rounded nor clamped) of a linear value.
double SRGBConvert(double lin);

// Channels 0..2 of `color` linearised into `linear`.
void GetLinearRGBColor(const cv::Scalar& color, cv::Scalar& linear);

// Relative luminance 0.2126 R + 0.7152 G + 0.0722 B of a linear colour.
double GetEffectiveLuminance(const cv::Scalar& linear);

// (max + 0.05) / (min + 0.05) of two luminances; at least 1.
double GetContrastRatio(double l1, double l2);

// Scales the linear colour uniformly by `factor`, reduced where needed so
// that no channel exceeds 1 (hue and channel ratios are kept).
void RGBColorEnhance(cv::Scalar& linear, double factor);

// Hue, lightness, saturation (OpenCV's H, L, S order) of a colour given in
// 0..255 without rescaling: channel 1 is (max + min) / 2 on 0..255.
void Rgb2Hsl(const cv::Scalar& rgb, cv::Scalar* hls);

// Lab (L 0..100, a and b about -127..127) of a colour in 0..255.
cv::Scalar GetLabColor(const cv::Scalar& rgb);

// Colour in 0..255 (rounded to 8 bits) of a Lab value as GetLabColor gives it.
void GetRgbColor(const cv::Scalar& lab, cv::Scalar* rgb);

// Forces a contrast ratio of 4.5 between `*color` (text) and `background` by
// scaling the text colour in linear space away from the background, damped
// for light colours. Returns true when `*color` was left unchanged (contrast
// sufficient, too close to 1 to tell a direction, or text already black),
// false when it was changed.
bool ForceColorContrast(const cv::Scalar& background, cv::Scalar* color);

}  // namespace ocr_inpainting
