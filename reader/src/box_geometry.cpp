#include "box_geometry.h"

#include <cmath>

namespace textreader {
namespace {

float Length(cv::Point2f v) {
  return std::hypot(v.x, v.y);
}

}  // namespace

cv::RotatedRect Unclip(const cv::RotatedRect& box, float ratio) {
  const float w = box.size.width;
  const float h = box.size.height;
  const float perimeter = 2.0F * (w + h);
  if (perimeter <= 0.0F)
    return box;
  const float distance = w * h * ratio / perimeter;
  return {box.center, cv::Size2f(w + 2.0F * distance, h + 2.0F * distance), box.angle};
}

Corners ReadingCorners(const cv::RotatedRect& box) {
  // OpenCV's width edge runs along (cos a, sin a), its height edge along
  // (-sin a, cos a).
  const float radians = box.angle * static_cast<float>(CV_PI / 180.0);
  cv::Point2f along(std::cos(radians), std::sin(radians));
  cv::Point2f across(-along.y, along.x);
  float along_length = box.size.width;
  float across_length = box.size.height;
  // `along` becomes the edge nearer the x axis, pointing right; `across`
  // points down.
  if (std::abs(across.x) > std::abs(along.x)) {
    std::swap(along, across);
    std::swap(along_length, across_length);
  }
  if (along.x < 0.0F || (along.x == 0.0F && along.y > 0.0F))
    along = -along;
  if (across.y < 0.0F || (across.y == 0.0F && across.x < 0.0F))
    across = -across;
  const cv::Point2f half_along = along * (along_length / 2.0F);
  const cv::Point2f half_across = across * (across_length / 2.0F);
  const cv::Point2f c = box.center;
  const Corners page{c - half_along - half_across, c + half_along - half_across,
                     c + half_along + half_across, c - half_along + half_across};
  if (across_length < 1.5F * along_length)
    return page;
  // A tall box reads downwards: the letters' tops face right, so the reader's
  // top-left is the page's top-right.
  return {page[1], page[2], page[3], page[0]};
}

Corners TurnedHalfway(const Corners& corners) {
  return {corners[2], corners[3], corners[0], corners[1]};
}

cv::RotatedRect RectFromCorners(const Corners& corners) {
  const cv::Point2f centre = (corners[0] + corners[1] + corners[2] + corners[3]) * 0.25F;
  // Opposite edges averaged: a perspective quadrilateral is not a rectangle.
  const cv::Point2f along = (corners[1] - corners[0] + corners[2] - corners[3]) * 0.5F;
  const cv::Point2f down = (corners[3] - corners[0] + corners[2] - corners[1]) * 0.5F;
  const float angle = std::atan2(along.y, along.x) * static_cast<float>(180.0 / CV_PI);
  return {centre, cv::Size2f(Length(along), Length(down)), angle};
}

cv::Point2f PointAt(const Corners& corners, float u, float v) {
  const cv::Point2f top = corners[0] + (corners[1] - corners[0]) * u;
  const cv::Point2f bottom = corners[3] + (corners[2] - corners[3]) * u;
  return top + (bottom - top) * v;
}

}  // namespace textreader
