#include "moving_text_scene.h"

#include <algorithm>
#include <cmath>
#include <string>

#include <opencv2/imgproc.hpp>

namespace tracking_testing {
namespace {

constexpr double kPi = 3.14159265358979323846;
// The page is larger than the frame so that panning never shows its edge.
constexpr double kPageScale = 1.5;
constexpr int kTextPadding = 4;

// Eases in and out: smooth start and stop of the camera motion.
double Ease(double t) {
  return 0.5 - 0.5 * std::cos(kPi * t);
}

std::string RandomLine(cv::RNG& rng, int font, double scale, int thickness, int target_width) {
  static const char kLetters[] = "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789";
  std::string line;
  for (;;) {
    std::string word;
    const int length = rng.uniform(2, 9);
    for (int i = 0; i < length; ++i)
      word += kLetters[rng.uniform(0, static_cast<int>(sizeof(kLetters)) - 1)];
    const std::string candidate = line.empty() ? word : line + " " + word;
    int baseline = 0;
    if (!line.empty() &&
        cv::getTextSize(candidate, font, scale, thickness, &baseline).width > target_width)
      return line;
    line = candidate;
  }
}

}  // namespace

MovingTextScene::MovingTextScene(const SceneOptions& options) : options_(options) {
  cv::RNG rng(options_.seed);
  const cv::Size frame = options_.frame_size;
  const cv::Size page_size(static_cast<int>(frame.width * kPageScale),
                           static_cast<int>(frame.height * kPageScale));

  // Paper: a warm colour with a soft gradient and fine grain.
  page_.create(page_size, CV_8UC3);
  for (int y = 0; y < page_size.height; ++y) {
    const double shade = 12.0 * y / page_size.height;
    page_.row(y).setTo(cv::Scalar(236 - shade, 231 - shade, 214 - shade));
  }
  cv::Mat grain(page_size, CV_16SC3);
  rng.fill(grain, cv::RNG::NORMAL, 0, 3);
  cv::Mat page16;
  page_.convertTo(page16, CV_16SC3);
  page16 += grain;
  page16.convertTo(page_, CV_8UC3);

  // Text lines in the middle of the frame-0 view, one per slot, sizes varying.
  static const int kFonts[] = {cv::FONT_HERSHEY_SIMPLEX, cv::FONT_HERSHEY_DUPLEX,
                               cv::FONT_HERSHEY_COMPLEX, cv::FONT_HERSHEY_TRIPLEX};
  static const cv::Scalar kInks[] = {cv::Scalar(25, 25, 30), cv::Scalar(30, 45, 125),
                                     cv::Scalar(120, 25, 25)};
  const cv::Point2f page_centre(page_size.width * 0.5f, page_size.height * 0.5f);
  const float view_w = frame.width * 0.72f, view_h = frame.height * 0.74f;
  const float slot_h = view_h / static_cast<float>(std::max(1, options_.line_count));
  for (int i = 0; i < options_.line_count; ++i) {
    const int font = kFonts[i % 4];
    const int thickness = 1 + i % 3;
    // Hershey glyphs are about 30 px tall (baseline included) at scale 1.
    const double max_scale = std::max(0.35, slot_h * 0.65 / 30.0);
    const double scale = max_scale * rng.uniform(0.5, 1.0);
    const int target_width = static_cast<int>(view_w * rng.uniform(0.45, 0.95));
    const std::string text = RandomLine(rng, font, scale, thickness, target_width);
    int baseline = 0;
    const cv::Size text_size = cv::getTextSize(text, font, scale, thickness, &baseline);
    const float left = page_centre.x - view_w * 0.5f +
                       static_cast<float>(rng.uniform(
                           0.0, std::max(1.0, static_cast<double>(view_w - text_size.width))));
    const float slot_top = page_centre.y - view_h * 0.5f + slot_h * static_cast<float>(i);
    const float base_y = slot_top + (slot_h + text_size.height - baseline) * 0.5f;
    const cv::Point origin(cvRound(left), cvRound(base_y));
    cv::putText(page_, text, origin, font, scale, kInks[i % 3], thickness, cv::LINE_AA);
    page_lines_.emplace_back(static_cast<float>(origin.x - kTextPadding),
                             static_cast<float>(origin.y - text_size.height - kTextPadding),
                             static_cast<float>(text_size.width + 2 * kTextPadding),
                             static_cast<float>(text_size.height + baseline + 2 * kTextPadding));
  }
}

cv::Mat MovingTextScene::Motion(int k) const {
  const double t =
      options_.frame_count > 1 ? static_cast<double>(k) / (options_.frame_count - 1) : 0.0;
  const double e = Ease(t);
  const double zoom = 1.0 + (options_.total_zoom - 1.0) * e;
  const double angle = options_.total_rotation_deg * e * kPi / 180.0;
  const double c = zoom * std::cos(angle), s = zoom * std::sin(angle);
  const double page_cx = page_.cols * 0.5, page_cy = page_.rows * 0.5;
  const double tx = options_.frame_size.width * 0.5 + options_.total_pan.x * e;
  const double ty = options_.frame_size.height * 0.5 + options_.total_pan.y * e;
  // x' = zoom * R(angle) * (x - page centre) + frame centre + pan; R turns
  // clockwise on screen, as cv::RotatedRect angles do.
  cv::Mat m = (cv::Mat_<double>(2, 3) << c, -s, tx - c * page_cx + s * page_cy, s, c,
               ty - s * page_cx - c * page_cy);
  return m;
}

double MovingTextScene::BlurSigma(int k) const {
  return options_.blur && k % 7 == 4 ? 1.3 : 0.0;
}

cv::Mat MovingTextScene::Frame(int k) const {
  cv::Mat frame;
  cv::warpAffine(page_, frame, Motion(k), options_.frame_size, cv::INTER_LINEAR,
                 cv::BORDER_REFLECT_101);
  const double sigma = BlurSigma(k);
  if (sigma > 0.0)
    cv::GaussianBlur(frame, frame, cv::Size(0, 0), sigma);
  if (options_.noise_sigma > 0.0) {
    cv::RNG rng(options_.seed * 31 + static_cast<uint64_t>(k));
    cv::Mat noise(frame.size(), CV_16SC3);
    rng.fill(noise, cv::RNG::NORMAL, 0, options_.noise_sigma);
    cv::Mat frame16;
    frame.convertTo(frame16, CV_16SC3);
    frame16 += noise;
    frame16.convertTo(frame, CV_8UC3);
  }
  return frame;
}

std::vector<cv::RotatedRect> MovingTextScene::TruthRects(int k) const {
  const cv::Mat m = Motion(k);
  const double scale = std::hypot(m.at<double>(0, 0), m.at<double>(1, 0));
  const double angle = std::atan2(m.at<double>(1, 0), m.at<double>(0, 0)) * 180.0 / kPi;
  std::vector<cv::RotatedRect> rects;
  for (const cv::Rect2f& line : page_lines_) {
    const double cx = line.x + line.width * 0.5, cy = line.y + line.height * 0.5;
    const cv::Point2f centre(
        static_cast<float>(m.at<double>(0, 0) * cx + m.at<double>(0, 1) * cy + m.at<double>(0, 2)),
        static_cast<float>(m.at<double>(1, 0) * cx + m.at<double>(1, 1) * cy + m.at<double>(1, 2)));
    rects.emplace_back(
        centre,
        cv::Size2f(static_cast<float>(line.width * scale), static_cast<float>(line.height * scale)),
        static_cast<float>(angle));
  }
  return rects;
}

CentreError MeasureCentreError(const std::vector<cv::RotatedRect>& tracked,
                               const std::vector<cv::RotatedRect>& truth) {
  CentreError error;
  const size_t n = std::min(tracked.size(), truth.size());
  for (size_t i = 0; i < n; ++i) {
    const double d = cv::norm(tracked[i].center - truth[i].center);
    error.mean += d / static_cast<double>(n);
    error.max = std::max(error.max, d);
  }
  return error;
}

}  // namespace tracking_testing
