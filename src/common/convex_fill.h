#pragma once

#include <opencv2/core.hpp>

namespace ocr {

// cv::fillConvexPoly for polygons built from the host's rectangles, which
// can reach anywhere. OpenCV walks every row from the polygon's top to the
// image's bottom edge, above the image or not, so a corner a billion rows up
// costs seconds; and its edge slopes overflow for corners 2^30 apart, which
// ends the process with a division by zero. So the polygon is first cut to
// the image grown by kConvexFillMargin on every side. A polygon inside that
// box is drawn exactly as OpenCV draws it; the vertices of a cut lie on the
// box, rounded to whole pixels.
inline constexpr int kConvexFillMargin = 1 << 16;
void FillConvexPolygon(cv::Mat& image, const cv::Point* points, int count, const cv::Scalar& color);

}  // namespace ocr
