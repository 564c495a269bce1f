#include "inpainting/analysis/synthetic_patch.h"

#include <algorithm>
#include <cmath>

#include <opencv2/imgproc.hpp>
#include <opencv2/photo.hpp>

namespace ocr_testing {

namespace {

// Background of the given kind, without text.
cv::Mat DrawBackground(const PatchRecipe& recipe) {
  cv::Mat background(recipe.size, CV_8UC3, recipe.background_color);
  if (recipe.background == Background::kGradient) {
    for (int x = 0; x < recipe.size.width; ++x) {
      const double t =
          recipe.size.width > 1 ? static_cast<double>(x) / (recipe.size.width - 1) : 0.0;
      const cv::Scalar color = recipe.background_color * (1.0 - t) + recipe.background_color2 * t;
      background.col(x).setTo(color);
    }
  } else if (recipe.background == Background::kTexture) {
    // Smooth noise: random values blurred, added around the base colour.
    cv::RNG rng(recipe.seed);
    cv::Mat noise(recipe.size, CV_32FC3);
    rng.fill(noise, cv::RNG::NORMAL, 0.0, 1.0);
    cv::GaussianBlur(noise, noise, cv::Size(0, 0), 2.0);
    cv::Mat base;
    background.convertTo(base, CV_32FC3);
    std::vector<cv::Mat> planes;
    cv::split(noise, planes);
    for (int c = 0; c < 3; ++c)
      planes[c] *= recipe.background_color2[c] * 2.0;
    cv::merge(planes, noise);
    cv::Mat textured = base + noise;
    textured.convertTo(background, CV_8UC3);
  }
  return background;
}

// Blends `color` over `background` with the 0..255 coverage as alpha.
cv::Mat Compose(const cv::Mat& background, const cv::Mat& coverage, const cv::Scalar& color) {
  cv::Mat alpha;
  coverage.convertTo(alpha, CV_32F, 1.0 / 255.0);
  cv::Mat alpha3;
  cv::merge(std::vector<cv::Mat>{alpha, alpha, alpha}, alpha3);
  cv::Mat base;
  background.convertTo(base, CV_32FC3);
  const cv::Mat ink(background.size(), CV_32FC3, color);
  cv::Mat ones(background.size(), CV_32FC3, cv::Scalar::all(1.0));
  cv::Mat blended = base.mul(ones - alpha3) + ink.mul(alpha3);
  cv::Mat out;
  blended.convertTo(out, CV_8UC3);
  return out;
}

double RelativeLuminance(const cv::Scalar& color) {
  double linear[3];
  for (int c = 0; c < 3; ++c) {
    const double v = color[c] / 255.0;
    linear[c] = v <= 0.03928 ? v / 12.92 : std::pow((v + 0.055) / 1.055, 2.4);
  }
  return 0.2126 * linear[0] + 0.7152 * linear[1] + 0.0722 * linear[2];
}

cv::Scalar RandomColor(cv::RNG& rng, int lo, int hi) {
  return cv::Scalar(rng.uniform(lo, hi), rng.uniform(lo, hi), rng.uniform(lo, hi));
}

}  // namespace

cv::Mat SyntheticPatch::TextPixels() const {
  return coverage >= 128;
}

cv::Mat SyntheticPatch::BackgroundPixels() const {
  return coverage == 0;
}

SyntheticPatch DrawTextPatch(const PatchRecipe& recipe) {
  SyntheticPatch patch;
  patch.background = DrawBackground(recipe);
  patch.coverage = cv::Mat::zeros(recipe.size, CV_8UC1);

  // Lines stacked with a gap of half a line height, the block centred.
  std::vector<cv::Size> sizes;
  std::vector<int> baselines;
  int block_height = 0;
  for (const std::string& line : recipe.lines) {
    int baseline = 0;
    sizes.push_back(
        cv::getTextSize(line, recipe.font_face, recipe.font_scale, recipe.thickness, &baseline));
    baselines.push_back(baseline);
    block_height += sizes.back().height + baseline;
  }
  const int gap = recipe.lines.size() > 1 ? sizes[0].height / 2 : 0;
  block_height += gap * static_cast<int>(recipe.lines.size() - 1);
  int top = (recipe.size.height - block_height) / 2;
  for (size_t i = 0; i < recipe.lines.size(); ++i) {
    const cv::Point origin((recipe.size.width - sizes[i].width) / 2, top + sizes[i].height);
    cv::putText(patch.coverage, recipe.lines[i], origin, recipe.font_face, recipe.font_scale,
                cv::Scalar(255), recipe.thickness, cv::LINE_AA);
    top += sizes[i].height + baselines[i] + gap;
  }
  patch.rgb = Compose(patch.background, patch.coverage, recipe.text_color);
  return patch;
}

std::vector<PatchRecipe> VariedRecipes(int count, uint64_t seed) {
  static const int kFaces[] = {cv::FONT_HERSHEY_SIMPLEX, cv::FONT_HERSHEY_DUPLEX,
                               cv::FONT_HERSHEY_COMPLEX, cv::FONT_HERSHEY_TRIPLEX,
                               cv::FONT_HERSHEY_PLAIN};
  static const std::vector<std::vector<std::string>> kTexts = {
      {"Text"}, {"Exit 12"}, {"open    daily"}, {"Menu", "Carte"}, {"Station"}, {"SALE"}};
  cv::RNG rng(seed);
  std::vector<PatchRecipe> recipes;
  while (static_cast<int>(recipes.size()) < count) {
    PatchRecipe recipe;
    recipe.font_face = kFaces[rng.uniform(0, 5)];
    recipe.lines = kTexts[rng.uniform(0, static_cast<int>(kTexts.size()))];
    recipe.font_scale =
        rng.uniform(0.6, 1.6) * (recipe.font_face == cv::FONT_HERSHEY_PLAIN ? 2 : 1);
    recipe.thickness = rng.uniform(1, 4);
    const bool light_text = rng.uniform(0, 3) == 0;
    recipe.text_color = light_text ? RandomColor(rng, 170, 256) : RandomColor(rng, 0, 120);
    recipe.background_color = light_text ? RandomColor(rng, 0, 90) : RandomColor(rng, 150, 256);
    recipe.background = static_cast<Background>(rng.uniform(0, 3));
    recipe.background_color2 = recipe.background == Background::kTexture
                                   ? cv::Scalar::all(rng.uniform(3, 10))
                                   : recipe.background_color + RandomColor(rng, -30, 31);
    recipe.seed = rng.next();
    // Fit the patch around the text with margins like the host's boxes.
    int width = 0;
    int height = 0;
    for (const std::string& line : recipe.lines) {
      int baseline = 0;
      const cv::Size size =
          cv::getTextSize(line, recipe.font_face, recipe.font_scale, recipe.thickness, &baseline);
      width = std::max(width, size.width);
      height += size.height + baseline;
    }
    height += static_cast<int>(recipe.lines.size() - 1) * height / 4;
    recipe.size = cv::Size(width * 125 / 100 + 4, height * 135 / 100 + 4);
    const double l1 = RelativeLuminance(recipe.text_color);
    const double l2 = RelativeLuminance(recipe.background_color);
    if ((std::max(l1, l2) + 0.05) / (std::min(l1, l2) + 0.05) >= 3.0)
      recipes.push_back(recipe);
  }
  return recipes;
}

cv::Mat TeleaFill(const cv::Mat& patch, const cv::Mat& mask) {
  cv::Mat filled;
  if (patch.rows < 21) {
    cv::inpaint(patch, mask, filled, 3.0, cv::INPAINT_TELEA);
    return filled;
  }
  cv::Mat small_patch;
  cv::resize(patch, small_patch, cv::Size(), 0.5, 0.5, cv::INTER_LINEAR);
  cv::Mat small_mask;
  cv::resize(mask, small_mask, small_patch.size(), 0, 0, cv::INTER_LINEAR);
  cv::Mat small_filled;
  cv::inpaint(small_patch, small_mask, small_filled, 3.0, cv::INPAINT_TELEA);
  cv::resize(small_filled, filled, patch.size(), 0, 0, cv::INTER_LINEAR);
  return filled;
}

double CoveredShare(const cv::Mat& mask, const cv::Mat& region) {
  const int total = cv::countNonZero(region);
  if (total == 0)
    return 0.0;
  return static_cast<double>(cv::countNonZero(mask & region)) / total;
}

}  // namespace ocr_testing
