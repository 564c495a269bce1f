#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include <opencv2/core.hpp>

// Text patches drawn in code for the analysis tests and the accuracy
// measurement: anti-aliased text of a known colour over a known background,
// with the text's coverage kept as ground truth.
namespace ocr_testing {

enum class Background { kFlat, kGradient, kTexture };

struct PatchRecipe {
  cv::Size size{160, 40};
  // One entry per text line, laid out top to bottom and centred.
  std::vector<std::string> lines{"Text"};
  int font_face = 0;  // cv::FONT_HERSHEY_SIMPLEX
  double font_scale = 1.0;
  int thickness = 2;
  cv::Scalar text_color{20, 20, 20};
  cv::Scalar background_color{235, 235, 235};
  // Second colour of a gradient (left to right) or amplitude of a texture.
  cv::Scalar background_color2{200, 220, 240};
  Background background = Background::kFlat;
  uint64_t seed = 1;
};

struct SyntheticPatch {
  cv::Mat rgb;         // CV_8UC3, R, G, B
  cv::Mat background;  // CV_8UC3, the same patch without the text
  cv::Mat coverage;    // CV_8UC1, 0..255 share of text in each pixel
  // Pixels at least half covered by text.
  cv::Mat TextPixels() const;
  // Pixels that no text touches.
  cv::Mat BackgroundPixels() const;
};

SyntheticPatch DrawTextPatch(const PatchRecipe& recipe);

// `count` varied recipes drawn from a seeded generator: Hershey font faces,
// sizes, one or two words or lines, dark-on-light and light-on-dark colours,
// flat, gradient and textured backgrounds. Text contrast is kept readable
// (luminance ratio at least 3).
std::vector<PatchRecipe> VariedRecipes(int count, uint64_t seed);

// The pipeline's erase step as the colour measure sees it: cv::inpaint
// (Telea, radius 3), at half resolution from 21 rows up.
cv::Mat TeleaFill(const cv::Mat& patch, const cv::Mat& mask);

// Share (0..1) of the non-zero pixels of `region` that are non-zero in `mask`.
double CoveredShare(const cv::Mat& mask, const cv::Mat& region);

}  // namespace ocr_testing
