// Rotated boxes of text: growing a detected box, and the corners and
// rectangle of a line as its reader sees it (see text_reader.h).
#ifndef TEXTREADER_BOX_GEOMETRY_H_
#define TEXTREADER_BOX_GEOMETRY_H_

#include <array>

#include <opencv2/core.hpp>

namespace textreader {

using Corners = std::array<cv::Point2f, 4>;  // top-left, top-right, bottom-right, bottom-left

// The detector's map marks a shrunk core of each text region: grows `box` by
// area * ratio / perimeter on every side (a rectangle's offset polygon).
cv::RotatedRect Unclip(const cv::RotatedRect& box, float ratio);

// The corners of a detected box in reading terms, assuming the text reads
// along the box's edge nearest the x axis from left to right, unless the
// box is at least 1.5 times as tall as wide: then it reads downwards.
// Upside-down text is left for the direction classifier to turn.
Corners ReadingCorners(const cv::RotatedRect& box);

// The same box read the other way round (turned by 180 degrees).
Corners TurnedHalfway(const Corners& corners);

// Centre, width along the reading direction, height, and the reading
// direction's angle in degrees (-180, 180], y down.
cv::RotatedRect RectFromCorners(const Corners& corners);

// The point at fractions (u along the reading direction, v down the line's
// height) of the quadrilateral.
cv::Point2f PointAt(const Corners& corners, float u, float v);

}  // namespace textreader

#endif  // TEXTREADER_BOX_GEOMETRY_H_
