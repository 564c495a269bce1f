#include "common/convex_fill.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <vector>

#include <opencv2/imgproc.hpp>

namespace ocr {
namespace {

int RoundToInt(double value) {
  constexpr double kMax = std::numeric_limits<int>::max();
  constexpr double kMin = std::numeric_limits<int>::min();
  return static_cast<int>(std::lround(std::min(std::max(value, kMin), kMax)));
}

}  // namespace

void FillConvexPolygon(cv::Mat& image, const cv::Point* points, int count,
                       const cv::Scalar& color) {
  constexpr int kTop = -kConvexFillMargin;
  bool reaches_above = false;
  for (int i = 0; i < count; ++i)
    reaches_above = reaches_above || points[i].y < kTop;
  if (!reaches_above) {
    cv::fillConvexPoly(image, points, count, color, cv::LINE_8, 0);
    return;
  }
  // One Sutherland-Hodgman step against the half-plane y >= kTop.
  std::vector<cv::Point> kept;
  for (int i = 0; i < count; ++i) {
    const cv::Point& a = points[i];
    const cv::Point& b = points[(i + 1) % count];
    const bool a_in = a.y >= kTop;
    const bool b_in = b.y >= kTop;
    if (a_in)
      kept.push_back(a);
    if (a_in != b_in) {
      const double t = (static_cast<double>(kTop) - a.y) / (static_cast<double>(b.y) - a.y);
      kept.emplace_back(RoundToInt(a.x + t * (static_cast<double>(b.x) - a.x)), kTop);
    }
  }
  if (kept.size() >= 3)
    cv::fillConvexPoly(image, kept.data(), static_cast<int>(kept.size()), color, cv::LINE_8, 0);
}

}  // namespace ocr
