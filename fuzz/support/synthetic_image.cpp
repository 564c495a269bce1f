#include "support/synthetic_image.h"

#include <opencv2/imgproc.hpp>

namespace ocr_fuzz {
namespace {

cv::Scalar Colour(FuzzInput& in) {
  const double r = in.Byte();
  const double g = in.Byte();
  const double b = in.Byte();
  return cv::Scalar(r, g, b, 255.0);
}

}  // namespace

cv::Mat SyntheticImage(FuzzInput& in, int rows, int cols, int channels) {
  cv::Mat image(rows, cols, CV_8UC(channels), Colour(in));
  if (image.empty())
    return image;
  const int shapes = in.Byte() % 6;
  for (int i = 0; i < shapes; ++i) {
    const cv::Point a(in.Range(0, cols), in.Range(0, rows));
    const cv::Point b(in.Range(0, cols), in.Range(0, rows));
    const cv::Scalar colour = Colour(in);
    const int kind = in.Byte() % 3;
    if (kind == 0)
      cv::rectangle(image, a, b, colour, cv::FILLED);
    else if (kind == 1)
      cv::line(image, a, b, colour, 1 + in.Byte() % 4);
    else
      cv::putText(image, "Ag", a, cv::FONT_HERSHEY_SIMPLEX, 0.3 + (in.Byte() % 8) * 0.25, colour,
                  1 + in.Byte() % 3);
  }
  const int noise = in.Byte() % 16;
  if (noise > 0) {
    cv::Mat grain(image.size(), image.type());
    cv::theRNG().state = 0x9e3779b97f4a7c15ULL + noise;
    cv::randu(grain, cv::Scalar::all(0), cv::Scalar::all(noise));
    image += grain;
  }
  return image;
}

}  // namespace ocr_fuzz
