#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include <opencv2/core.hpp>

// Synthetic camera frames with text lines, for the inpainting benchmarks and
// the quality evaluation: the clean background and every line's colour are known.
namespace ocr_testing {

enum class Background { kGradient, kTexture, kPhoto };

struct DrawnTextLine {
  std::string text;
  cv::Point2f centre;  // of the text box, in frame pixels
  float angle = 0;     // degrees, cv::RotatedRect convention
  double scale = 1.0;  // cv::putText font scale
  int font = 0;        // cv::HersheyFonts
  int thickness = 2;
  cv::Scalar color;  // R, G, B
};

struct TextScene {
  cv::Mat frame;       // CV_8UC3, R, G, B: background with the text drawn
  cv::Mat background;  // the same without the text
  std::vector<DrawnTextLine> lines;
  // Per line: the box the host would send, i.e. the tight text box enlarged
  // by the host's width and height ratios.
  std::vector<cv::RotatedRect> rects;
  std::vector<double> values;  // rects, five doubles each
  cv::Mat text_alpha;          // CV_32F coverage of the drawn text, 0..1
};

cv::Mat MakeBackground(Background kind, const cv::Size& size, uint64_t seed);

// Draws `lines` (anti-aliased, rotated about their centres) onto `background`.
TextScene DrawTextLines(const cv::Mat& background, const std::vector<DrawnTextLine>& lines);

// A frame with `count` random lines of words on the given background.
TextScene MakeRandomTextScene(Background kind, const cv::Size& size, int count, uint64_t seed);

// Flat rectangle values of `rects` (five doubles each).
std::vector<double> FlattenRects(const std::vector<cv::RotatedRect>& rects);

// The RGBA overlay of `rect` composited by its alpha onto `frame` (CV_8UC3):
// the overlay is mapped back along the same patch-to-image transform that cut
// it (same size cap as the pipeline's line patches).
void CompositeOverlay(const cv::Mat& overlay, const cv::RotatedRect& rect, cv::Mat& frame);

}  // namespace ocr_testing
