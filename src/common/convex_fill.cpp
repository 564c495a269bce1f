#include "common/convex_fill.h"

#include <cmath>
#include <vector>

#include <opencv2/imgproc.hpp>

namespace ocr {
namespace {

// One Sutherland-Hodgman step: the part of `polygon` on the side of the
// line `axis` = `bound` where `keep(coordinate)` holds.
template <typename Keep>
std::vector<cv::Point2d> Cut(const std::vector<cv::Point2d>& polygon, int axis, double bound,
                             Keep keep) {
  std::vector<cv::Point2d> kept;
  const auto along = [axis](const cv::Point2d& p) { return axis == 0 ? p.x : p.y; };
  for (std::size_t i = 0; i < polygon.size(); ++i) {
    const cv::Point2d& a = polygon[i];
    const cv::Point2d& b = polygon[(i + 1) % polygon.size()];
    const bool a_in = keep(along(a));
    if (a_in)
      kept.push_back(a);
    if (a_in != keep(along(b))) {
      const double t = (bound - along(a)) / (along(b) - along(a));
      cv::Point2d cut = a + t * (b - a);
      (axis == 0 ? cut.x : cut.y) = bound;
      kept.push_back(cut);
    }
  }
  return kept;
}

}  // namespace

void FillConvexPolygon(cv::Mat& image, const cv::Point* points, int count,
                       const cv::Scalar& color) {
  const double left = -kConvexFillMargin;
  const double top = -kConvexFillMargin;
  const double right = static_cast<double>(image.cols) + kConvexFillMargin;
  const double bottom = static_cast<double>(image.rows) + kConvexFillMargin;
  bool inside = true;
  for (int i = 0; i < count; ++i) {
    inside = inside && points[i].x >= left && points[i].x <= right && points[i].y >= top &&
             points[i].y <= bottom;
  }
  if (inside) {
    cv::fillConvexPoly(image, points, count, color, cv::LINE_8, 0);
    return;
  }
  std::vector<cv::Point2d> polygon(points, points + count);
  polygon = Cut(polygon, 0, left, [left](double v) { return v >= left; });
  polygon = Cut(polygon, 0, right, [right](double v) { return v <= right; });
  polygon = Cut(polygon, 1, top, [top](double v) { return v >= top; });
  polygon = Cut(polygon, 1, bottom, [bottom](double v) { return v <= bottom; });
  if (polygon.size() < 3)
    return;
  std::vector<cv::Point> rounded;
  for (const cv::Point2d& p : polygon)
    rounded.emplace_back(static_cast<int>(std::lround(p.x)), static_cast<int>(std::lround(p.y)));
  cv::fillConvexPoly(image, rounded.data(), static_cast<int>(rounded.size()), color, cv::LINE_8, 0);
}

}  // namespace ocr
