// How well the analysis finds text on generated patches: mask coverage of
// the drawn text, background wrongly marked, and the distance between the
// detected and the drawn text colour. Also compares the library's choices on
// the two open points with their alternatives. Rerun with
//   ./build/bin/inpainting_analysis_accuracy [patch count] [seed]
#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <map>
#include <string>
#include <vector>

#include <opencv2/imgproc.hpp>

#include "analysis_variants.h"
#include "inpainting/analysis/color_contrast.h"
#include "inpainting/analysis/font_color.h"
#include "inpainting/analysis/synthetic_patch.h"
#include "inpainting/analysis/text_mask.h"

namespace {

using namespace ocr_inpainting;
using ocr_testing::Background;
using ocr_testing::CoveredShare;
using ocr_testing::PatchSpec;
using ocr_testing::SyntheticPatch;

double DeltaE(const cv::Scalar& a, const cv::Scalar& b) {
  const cv::Scalar la = GetLabColor(a);
  const cv::Scalar lb = GetLabColor(b);
  return std::sqrt((la[0] - lb[0]) * (la[0] - lb[0]) + (la[1] - lb[1]) * (la[1] - lb[1]) +
                   (la[2] - lb[2]) * (la[2] - lb[2]));
}

double MaxChannelDiff(const cv::Scalar& a, const cv::Scalar& b) {
  return std::max({std::abs(a[0] - b[0]), std::abs(a[1] - b[1]), std::abs(a[2] - b[2])});
}

double DrawnContrast(const PatchSpec& spec) {
  cv::Scalar text, background;
  GetLinearRGBColor(spec.text_color, text);
  GetLinearRGBColor(spec.background_color, background);
  return GetContrastRatio(GetEffectiveLuminance(text), GetEffectiveLuminance(background));
}

cv::Mat FarBackground(const SyntheticPatch& patch) {
  cv::Mat distance;
  cv::distanceTransform(patch.coverage == 0, distance, cv::DIST_L2, cv::DIST_MASK_PRECISE);
  return distance > 5;
}

struct Stats {
  std::vector<double> values;
  void Add(double v) { values.push_back(v); }
  double Mean() const {
    double sum = 0;
    for (double v : values)
      sum += v;
    return values.empty() ? 0 : sum / values.size();
  }
  double Quantile(double q) const {
    if (values.empty())
      return 0;
    std::vector<double> sorted = values;
    std::sort(sorted.begin(), sorted.end());
    return sorted[std::min(sorted.size() - 1, static_cast<size_t>(q * sorted.size()))];
  }
  double Min() const {
    return values.empty() ? 0 : *std::min_element(values.begin(), values.end());
  }
};

struct GroupStats {
  Stats text_in_mask, bg_in_mask, far_bg_in_mask, text_in_font, bg_in_font;
  Stats de_ideal, de_telea, channel_telea;
  int inverted = 0;  // font mask holding background rather than text
};

const char* BackgroundName(Background b) {
  switch (b) {
    case Background::kFlat:
      return "flat";
    case Background::kGradient:
      return "gradient";
    case Background::kTexture:
      return "texture";
  }
  return "?";
}

void PrintGroups(const std::map<std::string, GroupStats>& groups) {
  std::printf("%-26s %4s | %-13s %7s %7s | %7s %7s | %-15s %-15s %7s\n", "group", "n",
              "text in mask", "bg", "far bg", "font", "font bg", "dE ideal fill", "dE Telea fill",
              "maxch");
  std::printf("%-26s %4s | %-13s %7s %7s | %7s %7s | %-15s %-15s %7s\n", "", "", "mean (min)",
              "mean", "mean", "mean", "mean", "median (p90)", "median (p90)", "median");
  for (const auto& [name, g] : groups) {
    std::printf(
        "%-26s %4zu | %.4f (%.3f) %7.4f %7.4f | %7.4f %7.4f %4d | %6.2f (%6.2f) %6.2f (%6.2f) "
        "%7.1f\n",
        name.c_str(), g.text_in_mask.values.size(), g.text_in_mask.Mean(), g.text_in_mask.Min(),
        g.bg_in_mask.Mean(), g.far_bg_in_mask.Mean(), g.text_in_font.Mean(), g.bg_in_font.Mean(),
        g.inverted, g.de_ideal.Quantile(0.5), g.de_ideal.Quantile(0.9), g.de_telea.Quantile(0.5),
        g.de_telea.Quantile(0.9), g.channel_telea.Quantile(0.5));
  }
}

// The library's own path: GetMask, the pipeline's erase step, GetFontColor.
void MeasureLibrary(const std::vector<PatchSpec>& specs) {
  std::map<std::string, GroupStats> groups;
  for (const PatchSpec& spec : specs) {
    const SyntheticPatch patch = ocr_testing::DrawTextPatch(spec);
    cv::Mat mask, font_mask;
    int vertical_partition = -1;
    GetMask(patch.rgb, mask, font_mask, vertical_partition);
    cv::Scalar ideal, telea;
    GetFontColor(patch.rgb, mask, patch.background, font_mask, ideal);
    GetFontColor(patch.rgb, mask, ocr_testing::TeleaFill(patch.rgb, mask), font_mask, telea);

    const bool light = cv::sum(spec.text_color)[0] > cv::sum(spec.background_color)[0];
    const bool forced = DrawnContrast(spec) < 4.5;
    const std::string keys[] = {
        "all",
        std::string(light ? "light on dark" : "dark on light"),
        std::string("background ") + BackgroundName(spec.background),
        std::string(forced ? "contrast < 4.5 (forced)" : "contrast >= 4.5"),
    };
    for (const std::string& key : keys) {
      GroupStats& g = groups[key];
      g.text_in_mask.Add(CoveredShare(mask, patch.TextPixels()));
      g.bg_in_mask.Add(CoveredShare(mask, patch.BackgroundPixels()));
      g.far_bg_in_mask.Add(CoveredShare(mask, FarBackground(patch)));
      g.text_in_font.Add(CoveredShare(font_mask, patch.TextPixels()));
      g.inverted += CoveredShare(font_mask, patch.TextPixels()) < 0.5 ? 1 : 0;
      g.bg_in_font.Add(CoveredShare(font_mask, patch.BackgroundPixels()));
      g.de_ideal.Add(DeltaE(ideal, spec.text_color));
      g.de_telea.Add(DeltaE(telea, spec.text_color));
      g.channel_telea.Add(MaxChannelDiff(telea, spec.text_color));
    }
  }
  PrintGroups(groups);
}

// The colour's text-pixel selection: measured colour (before the contrast
// rule) against the drawn colour, with the pipeline's erase step.
void CompareTextSelection(const std::vector<PatchSpec>& specs) {
  using analysis_variants::Fallback;
  using analysis_variants::TextSelection;
  const std::pair<const char*, std::pair<TextSelection, Fallback>> variants[] = {
      {"font AND Otsu(change), else inpaint mask [library]",
       {TextSelection::kFontAndOtsuChange, Fallback::kInpaintMask}},
      {"font AND Otsu(change), else font mask",
       {TextSelection::kFontAndOtsuChange, Fallback::kFontMask}},
      {"font AND inpaint mask, else inpaint mask",
       {TextSelection::kFontAndInpaintMask, Fallback::kInpaintMask}},
      {"font AND inpaint mask, else font mask",
       {TextSelection::kFontAndInpaintMask, Fallback::kFontMask}},
      {"font AND change > 0, else inpaint mask",
       {TextSelection::kFontAndAnyChange, Fallback::kInpaintMask}},
  };
  std::printf("\n%-52s %-16s %-16s %8s\n", "text pixels for the colour", "dE measured", "dE final",
              "maxch");
  std::printf("%-52s %-16s %-16s %8s\n", "", "median (p90)", "median (p90)", "mean");
  for (const auto& [name, choice] : variants) {
    Stats measured, final_color, channel;
    for (const PatchSpec& spec : specs) {
      const SyntheticPatch patch = ocr_testing::DrawTextPatch(spec);
      cv::Mat mask, font_mask;
      int vertical_partition = -1;
      GetMask(patch.rgb, mask, font_mask, vertical_partition);
      const auto r =
          analysis_variants::FontColor(patch.rgb, mask, ocr_testing::TeleaFill(patch.rgb, mask),
                                       font_mask, choice.first, choice.second);
      measured.Add(DeltaE(r.measured, spec.text_color));
      final_color.Add(DeltaE(r.final, spec.text_color));
      channel.Add(MaxChannelDiff(r.measured, spec.text_color));
    }
    std::printf("%-52s %6.2f (%6.2f)  %6.2f (%6.2f)  %8.2f\n", name, measured.Quantile(0.5),
                measured.Quantile(0.9), final_color.Quantile(0.5), final_color.Quantile(0.9),
                channel.Mean());
  }
}

// Text covering little of its patch: a lone mark or small print in a box
// that the host enlarged generously.
std::vector<PatchSpec> SparseSpecs(int count, uint64_t seed) {
  static const char* kMarks[] = {"-", ".", "i", "1", "l", ":", "Ok", "no"};
  cv::RNG rng(seed);
  std::vector<PatchSpec> specs;
  for (int i = 0; i < count; ++i) {
    PatchSpec spec;
    spec.lines = {kMarks[i % 8]};
    spec.font_face = rng.uniform(0, 2) == 0 ? cv::FONT_HERSHEY_SIMPLEX : cv::FONT_HERSHEY_DUPLEX;
    spec.font_scale = rng.uniform(0.4, 0.9);
    spec.thickness = rng.uniform(1, 3);
    spec.size = cv::Size(rng.uniform(100, 240), rng.uniform(30, 60));
    const bool light = rng.uniform(0, 2) == 0;
    const int text = light ? rng.uniform(200, 256) : rng.uniform(0, 60);
    const int back = light ? rng.uniform(0, 60) : rng.uniform(190, 256);
    spec.text_color = cv::Scalar(text, text * 0.9, text * 0.8);
    spec.background_color = cv::Scalar::all(back);
    spec.background = i % 3 == 0 ? Background::kTexture : Background::kFlat;
    spec.background_color2 = cv::Scalar::all(5);
    spec.seed = rng.next();
    specs.push_back(spec);
  }
  return specs;
}

// The sparse-text rule: operands of the 5 % test and the font mask copy.
// "differ" counts the patches whose mask or colour is not the library's.
void CompareSparseRule(const std::vector<PatchSpec>& specs) {
  using analysis_variants::SparseCount;
  const std::pair<const char*, std::pair<SparseCount, bool>> variants[] = {
      {"count outlines + dilated sum, font kept [library]",
       {SparseCount::kContourPlusDilatedSum, false}},
      {"count outlines + dilated sum, outlines -> font",
       {SparseCount::kContourPlusDilatedSum, true}},
      {"count dilated sum only, font kept", {SparseCount::kDilatedSumOnly, false}},
      {"count dilated sum only, outlines -> font", {SparseCount::kDilatedSumOnly, true}},
  };
  std::printf("\n%-50s %6s %6s %-14s %7s %7s %-21s\n", "sparse rule", "sparse", "differ",
              "text in mask", "bg", "far bg", "dE final");
  std::printf("%-50s %6s %6s %-14s %7s %7s %-21s\n", "", "n", "n", "mean (min)", "mean", "mean",
              "mean median (p90)");
  std::vector<cv::Mat> library_masks;
  std::vector<cv::Scalar> library_colors;
  for (const auto& [name, choice] : variants) {
    int sparse = 0;
    int differ = 0;
    Stats text_in_mask, bg, far_bg, de;
    for (size_t i = 0; i < specs.size(); ++i) {
      const PatchSpec& spec = specs[i];
      const SyntheticPatch patch = ocr_testing::DrawTextPatch(spec);
      const auto m = analysis_variants::InpaintingMask(patch.rgb, choice.first, choice.second);
      sparse += m.sparse ? 1 : 0;
      text_in_mask.Add(CoveredShare(m.mask, patch.TextPixels()));
      bg.Add(CoveredShare(m.mask, patch.BackgroundPixels()));
      far_bg.Add(CoveredShare(m.mask, FarBackground(patch)));
      cv::Scalar color;
      GetFontColor(patch.rgb, m.mask, ocr_testing::TeleaFill(patch.rgb, m.mask), m.font_mask,
                   color);
      de.Add(DeltaE(color, spec.text_color));
      if (library_masks.size() < specs.size()) {
        library_masks.push_back(m.mask);
        library_colors.push_back(color);
      } else if (cv::norm(m.mask, library_masks[i], cv::NORM_INF) > 0 ||
                 color != library_colors[i]) {
        ++differ;
      }
    }
    std::printf("%-50s %6d %6d %.4f (%.3f) %7.4f %7.4f %6.2f %6.2f (%6.2f)\n", name, sparse, differ,
                text_in_mask.Mean(), text_in_mask.Min(), bg.Mean(), far_bg.Mean(), de.Mean(),
                de.Quantile(0.5), de.Quantile(0.9));
  }
}

}  // namespace

int main(int argc, char** argv) {
  // The analysis logs every step; keep only errors on the terminal.
  setenv("OCRAR_LOG_LEVEL", "6", 0);
  const int count = argc > 1 ? std::atoi(argv[1]) : 120;
  const uint64_t seed = argc > 2 ? std::strtoull(argv[2], nullptr, 10) : 2024;
  const std::vector<PatchSpec> specs = ocr_testing::VariedSpecs(count, seed);
  std::printf("%d generated patches (seed %llu): Hershey faces, 1-2 words or lines, sizes %s\n",
              count, static_cast<unsigned long long>(seed), "from the text, 25-35 % margins");
  std::printf(
      "text = pixels at least half covered by text; bg = pixels no text touches; far bg = more "
      "than 5 px from text.\ndE = CIE76 distance to the drawn colour in Lab (L 0..100); maxch = "
      "largest channel difference on 0..255.\n\n");
  MeasureLibrary(specs);
  CompareTextSelection(specs);
  const std::vector<PatchSpec> sparse = SparseSpecs(48, seed + 1);
  std::printf("\n48 sparse patches (a lone mark or short word in a large box):\n");
  CompareSparseRule(sparse);
  std::printf("\nThe %d varied patches above:\n", count);
  CompareSparseRule(specs);
  return 0;
}
