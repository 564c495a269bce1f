#include "text_scene_support.h"

#include <algorithm>
#include <cmath>

#include <opencv2/imgproc.hpp>

#include "inpainting/driver/region_geometry.h"
#include "inpainting/inpainting_constants.h"

namespace ocr_testing {
namespace {

cv::Scalar RandomColor(cv::RNG& rng) {
  return cv::Scalar(rng.uniform(0, 256), rng.uniform(0, 256), rng.uniform(0, 256));
}

cv::Mat GradientBackground(const cv::Size& size, cv::RNG& rng) {
  const cv::Scalar from = RandomColor(rng);
  const cv::Scalar to = RandomColor(rng);
  const double angle = rng.uniform(0.0, CV_PI);
  const double dx = std::cos(angle);
  const double dy = std::sin(angle);
  const double span = std::abs(dx) * size.width + std::abs(dy) * size.height;
  const double offset = std::min(0.0, dx * size.width) + std::min(0.0, dy * size.height);
  cv::Mat image(size, CV_32FC3);
  for (int y = 0; y < size.height; ++y) {
    for (int x = 0; x < size.width; ++x) {
      const double t = (dx * x + dy * y - offset) / span;
      const cv::Scalar c = from * (1 - t) + to * t;
      image.at<cv::Vec3f>(y, x) = cv::Vec3f(float(c[0]), float(c[1]), float(c[2]));
    }
  }
  return image;
}

cv::Mat TextureBackground(const cv::Size& size, cv::RNG& rng) {
  // Paper or fabric: fine noise blurred a little on a base colour, with a weave.
  cv::Mat noise(size, CV_32FC1);
  rng.fill(noise, cv::RNG::NORMAL, 0.0, 1.0);
  cv::GaussianBlur(noise, noise, cv::Size(0, 0), 1.2);
  cv::normalize(noise, noise, -1.0, 1.0, cv::NORM_MINMAX);
  const cv::Scalar base = RandomColor(rng) * 0.6 + cv::Scalar::all(60);
  const double amplitude = rng.uniform(10.0, 28.0);
  const double period = rng.uniform(5.0, 11.0);
  cv::Mat image(size, CV_32FC3);
  for (int y = 0; y < size.height; ++y) {
    for (int x = 0; x < size.width; ++x) {
      const double weave =
          0.5 * (std::sin(2 * CV_PI * x / period) * std::sin(2 * CV_PI * y / period));
      const double v = amplitude * (noise.at<float>(y, x) + weave);
      image.at<cv::Vec3f>(y, x) =
          cv::Vec3f(float(base[0] + v), float(base[1] + v * 0.9), float(base[2] + v * 0.8));
    }
  }
  return image;
}

cv::Mat PhotoBackground(const cv::Size& size, cv::RNG& rng) {
  // Smooth shapes of many colours, softened, with sensor noise.
  cv::Mat image(size, CV_32FC3, RandomColor(rng));
  for (int k = 0; k < 40; ++k) {
    const cv::Point centre(rng.uniform(0, size.width), rng.uniform(0, size.height));
    const cv::Size axes(rng.uniform(10, size.width / 3 + 11),
                        rng.uniform(10, size.height / 3 + 11));
    cv::ellipse(image, centre, axes, rng.uniform(0.0, 180.0), 0, 360, RandomColor(rng), cv::FILLED,
                cv::LINE_AA);
  }
  cv::GaussianBlur(image, image, cv::Size(0, 0), rng.uniform(2.0, 6.0));
  cv::Mat noise(size, CV_32FC3);
  rng.fill(noise, cv::RNG::NORMAL, 0.0, 3.0);
  return image + noise;
}

const char* const kWords[] = {"Menu",   "Apotheke",  "Bahnhof", "SALE",    "Tagesgericht",
                              "open",   "Kaffee",    "24h",     "Ausgang", "Preis 3,50",
                              "Notruf", "zum Hafen", "Bakery",  "Ticket",  "Eingang"};
const int kFonts[] = {cv::FONT_HERSHEY_SIMPLEX,
                      cv::FONT_HERSHEY_DUPLEX,
                      cv::FONT_HERSHEY_COMPLEX,
                      cv::FONT_HERSHEY_TRIPLEX,
                      cv::FONT_HERSHEY_SIMPLEX | cv::FONT_ITALIC,
                      cv::FONT_HERSHEY_PLAIN};

}  // namespace

cv::Mat MakeBackground(Background kind, const cv::Size& size, uint64_t seed) {
  cv::RNG rng(seed);
  cv::Mat image;
  switch (kind) {
    case Background::kGradient:
      image = GradientBackground(size, rng);
      break;
    case Background::kTexture:
      image = TextureBackground(size, rng);
      break;
    case Background::kPhoto:
      image = PhotoBackground(size, rng);
      break;
  }
  cv::Mat out;
  image.convertTo(out, CV_8UC3);
  return out;
}

TextScene DrawTextLines(const cv::Mat& background, const std::vector<DrawnTextLine>& lines) {
  TextScene scene;
  scene.background = background.clone();
  scene.lines = lines;
  cv::Mat frame;
  background.convertTo(frame, CV_32FC3);
  scene.text_alpha = cv::Mat::zeros(background.size(), CV_32FC1);
  for (const DrawnTextLine& line : lines) {
    int baseline = 0;
    const cv::Size text =
        cv::getTextSize(line.text, line.font, line.scale, line.thickness, &baseline);
    const int margin = 4 + line.thickness;
    const cv::Size canvas_size(text.width + 2 * margin, text.height + baseline + 2 * margin);
    cv::Mat canvas = cv::Mat::zeros(canvas_size, CV_8UC1);
    cv::putText(canvas, line.text, cv::Point(margin, margin + text.height), line.font, line.scale,
                cv::Scalar(255), line.thickness, cv::LINE_AA);

    // Canvas centre onto the line's centre, turned by the line's angle.
    const double t = line.angle * CV_PI / 180.0;
    const double c = std::cos(t);
    const double s = std::sin(t);
    const cv::Point2d half(canvas_size.width * 0.5, canvas_size.height * 0.5);
    const cv::Mat to_frame =
        (cv::Mat_<double>(2, 3) << c, -s, line.centre.x - (c * half.x - s * half.y), s, c,
         line.centre.y - (s * half.x + c * half.y));
    cv::Mat coverage;
    cv::warpAffine(canvas, coverage, to_frame, background.size(), cv::INTER_LINEAR,
                   cv::BORDER_CONSTANT, cv::Scalar(0));
    cv::Mat alpha;
    coverage.convertTo(alpha, CV_32F, 1.0 / 255.0);
    scene.text_alpha = cv::max(scene.text_alpha, alpha);

    cv::Mat alpha3;
    cv::cvtColor(alpha, alpha3, cv::COLOR_GRAY2RGB);
    const cv::Mat ink(background.size(), CV_32FC3, line.color);
    frame = frame.mul(cv::Scalar::all(1.0) - alpha3) + ink.mul(alpha3);

    // The tight box around the drawn glyphs, enlarged as the host does.
    const cv::Size2f tight(float(text.width + line.thickness),
                           float(text.height + baseline + line.thickness));
    const cv::Size2f sent(float(tight.width * ocr_inpainting::kInpaintRectWidthRatio),
                          float(tight.height * ocr_inpainting::kInpaintRectHeightRatio));
    // The glyph box sits at canvas (margin, margin) .. + (text.w, text.h + baseline).
    const cv::Point2d box_centre(margin + text.width * 0.5,
                                 margin + (text.height + baseline) * 0.5);
    const cv::Point2d offset = box_centre - half;
    const cv::Point2f centre(float(line.centre.x + c * offset.x - s * offset.y),
                             float(line.centre.y + s * offset.x + c * offset.y));
    scene.rects.emplace_back(centre, sent, line.angle);
  }
  frame.convertTo(scene.frame, CV_8UC3);
  scene.values = FlattenRects(scene.rects);
  return scene;
}

TextScene MakeRandomTextScene(Background kind, const cv::Size& size, int count, uint64_t seed) {
  cv::RNG rng(seed ^ 0x5eedULL);
  const cv::Mat background = MakeBackground(kind, size, seed);
  std::vector<DrawnTextLine> lines;
  const int rows = std::max(count, 1);
  const float row_height = float(size.height) / float(rows);
  for (int k = 0; k < count; ++k) {
    DrawnTextLine line;
    line.text = kWords[rng.uniform(0, int(std::size(kWords)))];
    if (rng.uniform(0, 2) == 1)
      line.text += std::string(" ") + kWords[rng.uniform(0, int(std::size(kWords)))];
    line.font = kFonts[rng.uniform(0, int(std::size(kFonts)))];
    line.scale = std::min(rng.uniform(0.6, 2.0), row_height / 40.0 + 0.3);
    line.thickness = std::max(1, int(std::lround(line.scale * rng.uniform(1.0, 2.5))));
    line.angle = float(rng.uniform(-20.0, 20.0));
    line.centre = cv::Point2f(float(size.width) * float(rng.uniform(0.3, 0.7)),
                              row_height * (float(k) + 0.5f));
    // Dark text on light ground or light on dark, from the local background.
    const cv::Point at(std::clamp(int(line.centre.x), 0, size.width - 1),
                       std::clamp(int(line.centre.y), 0, size.height - 1));
    const cv::Vec3b ground = background.at<cv::Vec3b>(at);
    const double luma = 0.3 * ground[0] + 0.59 * ground[1] + 0.11 * ground[2];
    const cv::Scalar hue = RandomColor(rng) * 0.35;
    line.color = luma > 110 ? hue : cv::Scalar::all(255) - hue;
    lines.push_back(line);
  }
  return DrawTextLines(background, lines);
}

std::vector<double> FlattenRects(const std::vector<cv::RotatedRect>& rects) {
  std::vector<double> values;
  for (const cv::RotatedRect& r : rects)
    values.insert(values.end(), {r.center.x, r.center.y, r.size.width, r.size.height, r.angle});
  return values;
}

void CompositeOverlay(const cv::Mat& overlay, const cv::RotatedRect& rect, cv::Mat& frame) {
  if (overlay.empty())
    return;
  cv::Size size;
  cv::Mat to_image;
  ocr_inpainting::GetSizeAndTransform(rect, size, to_image, ocr_inpainting::kLinePatchCap);
  // Premultiplied, so that interpolation across the patch border does not
  // mix the transparent outside's colour into the overlay.
  cv::Mat premultiplied;
  overlay.convertTo(premultiplied, CV_32FC4, 1.0 / 255.0);
  std::vector<cv::Mat> channels;
  cv::split(premultiplied, channels);
  for (int ch = 0; ch < 3; ++ch)
    channels[ch] = channels[ch].mul(channels[3]);
  cv::merge(channels, premultiplied);
  cv::Mat warped;
  cv::warpAffine(premultiplied, warped, to_image, frame.size(), cv::INTER_LINEAR,
                 cv::BORDER_CONSTANT, cv::Scalar::all(0));
  for (int y = 0; y < frame.rows; ++y) {
    for (int x = 0; x < frame.cols; ++x) {
      const cv::Vec4f& o = warped.at<cv::Vec4f>(y, x);
      if (o[3] <= 0.0f)
        continue;
      cv::Vec3b& f = frame.at<cv::Vec3b>(y, x);
      for (int ch = 0; ch < 3; ++ch)
        f[ch] = cv::saturate_cast<uchar>(255.0f * o[ch] + f[ch] * (1.0f - o[3]));
    }
  }
}

}  // namespace ocr_testing
