#pragma once

#include <opencv2/core.hpp>

namespace ocr {

// cv::fillConvexPoly for polygons built from the host's rectangles, which
// can reach anywhere. OpenCV walks every row from the polygon's top down to
// the image's bottom edge, above the image or not, so a corner a billion
// rows up costs seconds. The part of the polygon more than
// kConvexFillMargin rows above the image is cut away first; any polygon
// that stays below that line is drawn exactly as OpenCV draws it (the
// vertices of a cut lie on that line, rounded to whole pixels).
inline constexpr int kConvexFillMargin = 1 << 16;
void FillConvexPolygon(cv::Mat& image, const cv::Point* points, int count, const cv::Scalar& color);

}  // namespace ocr
