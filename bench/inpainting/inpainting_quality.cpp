// Quality of the inpainting pipeline on a generated evaluation set, against
// the Otsu + full-resolution Telea baseline: PSNR of the erased frame against
// the clean background inside the text rectangles, and CIEDE2000 between the
// returned and the true text colour.
//
//   inpainting_quality [frames per background]   (default 6)

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include <opencv2/imgproc.hpp>

#include "color_difference.h"
#include "inpainting/driver/inpainting_request.h"
#include "otsu_telea_baseline.h"
#include "text_scene_support.h"

namespace {

using ocr_testing::Background;

// Squared error and pixel count inside the rectangles.
struct ErrorSum {
  double squared = 0;
  double pixels = 0;

  void Add(const cv::Mat& result, const cv::Mat& truth, const cv::Mat& mask) {
    cv::Mat diff;
    cv::absdiff(result, truth, diff);
    diff.convertTo(diff, CV_64F);
    cv::Mat squares = diff.mul(diff);
    squares.setTo(cv::Scalar::all(0), mask == 0);
    const cv::Scalar sums = cv::sum(squares);
    squared += sums[0] + sums[1] + sums[2];
    pixels += 3.0 * cv::countNonZero(mask);
  }
  double Psnr() const { return 10 * std::log10(255.0 * 255.0 * pixels / std::max(squared, 1e-9)); }
};

struct ColorErrors {
  std::vector<double> values;
  void Add(const cv::Scalar& found, const cv::Scalar& truth) {
    values.push_back(
        ocr_bench::Ciede2000(ocr_bench::SrgbToLab(found), ocr_bench::SrgbToLab(truth)));
  }
  double Mean() const {
    double sum = 0;
    for (double v : values)
      sum += v;
    return values.empty() ? 0 : sum / double(values.size());
  }
  double Median() const {
    std::vector<double> sorted = values;
    std::sort(sorted.begin(), sorted.end());
    return sorted.empty() ? 0 : sorted[sorted.size() / 2];
  }
};

struct Scores {
  ErrorSum untouched;
  ErrorSum engine;
  ErrorSum baseline;
  ColorErrors engine_color;
  ColorErrors baseline_color;
  int lines = 0;
  int frames = 0;
};

cv::Mat RectMask(const cv::Size& size, const std::vector<cv::RotatedRect>& rects) {
  cv::Mat mask = cv::Mat::zeros(size, CV_8UC1);
  for (const cv::RotatedRect& rect : rects) {
    cv::Point2f corners[4];
    rect.points(corners);
    std::vector<cv::Point> polygon;
    for (const cv::Point2f& c : corners)
      polygon.emplace_back(cvRound(c.x), cvRound(c.y));
    cv::fillConvexPoly(mask, polygon, cv::Scalar(255));
  }
  return mask;
}

cv::Scalar Unpack(int32_t packed) {
  const auto bits = static_cast<uint32_t>(packed);
  return cv::Scalar(bits & 0xFF, (bits >> 8) & 0xFF, (bits >> 16) & 0xFF);
}

void Evaluate(const ocr_testing::TextScene& scene, Scores& scores) {
  const cv::Mat inside = RectMask(scene.frame.size(), scene.rects);
  scores.untouched.Add(scene.frame, scene.background, inside);

  std::vector<cv::Mat> overlays(scene.rects.size());
  std::vector<cv::Mat*> outputs;
  for (cv::Mat& overlay : overlays)
    outputs.push_back(&overlay);
  std::vector<int32_t> packed;
  if (ocr_inpainting::AnswerInpaintingRequest(scene.frame, scene.values, outputs, packed) != 0) {
    std::fprintf(stderr, "request refused\n");
    std::exit(1);
  }
  cv::Mat composited = scene.frame.clone();
  for (size_t i = 0; i < overlays.size(); ++i)
    ocr_testing::CompositeOverlay(overlays[i], scene.rects[i], composited);
  scores.engine.Add(composited, scene.background, inside);

  const ocr_bench::BaselineResult baseline = ocr_bench::OtsuTeleaBaseline(scene.frame, scene.rects);
  scores.baseline.Add(baseline.frame, scene.background, inside);

  for (size_t i = 0; i < scene.lines.size(); ++i) {
    scores.engine_color.Add(Unpack(packed[i]), scene.lines[i].color);
    scores.baseline_color.Add(baseline.colors[i], scene.lines[i].color);
  }
  scores.lines += static_cast<int>(scene.lines.size());
  ++scores.frames;
}

void CheckCiede2000() {
  // Reference pairs published with the CIEDE2000 formula's test data.
  const struct {
    cv::Vec3d a, b;
    double expected;
  } pairs[] = {{{50, 2.6772, -79.7751}, {50, 0, -82.7485}, 2.0425},
               {{50, 0, 0}, {50, -1, 2}, 2.3669},
               {{50, 2.5, 0}, {73, 25, -18}, 27.1492},
               {{60.2574, -34.0099, 36.2677}, {60.4626, -34.1751, 39.4387}, 1.2644},
               {{2.0776, 0.0795, -1.135}, {0.9033, -0.0636, -0.5514}, 0.9082}};
  for (const auto& p : pairs) {
    if (std::abs(ocr_bench::Ciede2000(p.a, p.b) - p.expected) > 1e-4) {
      std::fprintf(stderr, "CIEDE2000 self-check failed\n");
      std::exit(1);
    }
  }
}

void Print(const char* name, const Scores& s) {
  std::printf(
      "%-10s %3d frames %3d lines | PSNR in rects: text left %.2f dB, engine %.2f dB, "
      "baseline %.2f dB | colour dE00 mean/median: engine %.2f / %.2f, baseline %.2f / %.2f\n",
      name, s.frames, s.lines, s.untouched.Psnr(), s.engine.Psnr(), s.baseline.Psnr(),
      s.engine_color.Mean(), s.engine_color.Median(), s.baseline_color.Mean(),
      s.baseline_color.Median());
}

}  // namespace

int main(int argc, char** argv) {
  CheckCiede2000();
  const int frames = argc > 1 ? std::max(1, std::atoi(argv[1])) : 6;
  const struct {
    const char* name;
    Background kind;
  } kinds[] = {{"gradient", Background::kGradient},
               {"texture", Background::kTexture},
               {"photo", Background::kPhoto}};
  Scores all;
  for (const auto& kind : kinds) {
    Scores scores;
    for (int f = 0; f < frames; ++f) {
      const ocr_testing::TextScene scene =
          ocr_testing::MakeRandomTextScene(kind.kind, {640, 480}, 6, 1000 + 37 * f);
      Evaluate(scene, scores);
      Evaluate(scene, all);
    }
    Print(kind.name, scores);
  }
  Print("all", all);
  return 0;
}
