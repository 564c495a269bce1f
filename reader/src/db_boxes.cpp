#include "db_boxes.h"

#include <algorithm>

#include <opencv2/imgproc.hpp>

#include "box_geometry.h"

namespace textreader {
namespace {

// Regions thinner than these (map pixels before and after unclipping,
// image pixels at the end) are noise, not text.
constexpr float kMinCoreSide = 3.0F;
constexpr float kMinGrownSide = 5.0F;
constexpr float kMinImageSide = 3.0F;

float ShortSide(const cv::RotatedRect& box) {
  return std::min(box.size.width, box.size.height);
}

// Mean probability inside the box (its pixels on the map).
float BoxScore(const cv::Mat& probability, const cv::RotatedRect& box) {
  const cv::Rect bounds = box.boundingRect() & cv::Rect(cv::Point(), probability.size());
  if (bounds.empty())
    return 0.0F;
  cv::Point2f corners[4];
  box.points(corners);
  std::vector<cv::Point> polygon;
  for (const cv::Point2f& p : corners)
    polygon.emplace_back(cvRound(p.x) - bounds.x, cvRound(p.y) - bounds.y);
  cv::Mat mask = cv::Mat::zeros(bounds.size(), CV_8U);
  cv::fillPoly(mask, std::vector<std::vector<cv::Point>>{polygon}, cv::Scalar(1));
  return static_cast<float>(cv::mean(probability(bounds), mask)[0]);
}

// The box scaled from the map to the image and clipped to it.
cv::RotatedRect ToImage(const cv::RotatedRect& box, cv::Size map_size, cv::Size image_size) {
  const float sx = static_cast<float>(image_size.width) / map_size.width;
  const float sy = static_cast<float>(image_size.height) / map_size.height;
  cv::Point2f corners[4];
  box.points(corners);
  std::vector<cv::Point2f> scaled;
  for (const cv::Point2f& p : corners) {
    scaled.emplace_back(std::clamp(p.x * sx, 0.0F, static_cast<float>(image_size.width)),
                        std::clamp(p.y * sy, 0.0F, static_cast<float>(image_size.height)));
  }
  return cv::minAreaRect(scaled);
}

}  // namespace

std::vector<cv::RotatedRect> BoxesFromMap(const cv::Mat& probability, const DbParameters& params,
                                          cv::Size image_size) {
  CV_Assert(probability.type() == CV_32F);
  cv::Mat text = probability > params.threshold;
  std::vector<std::vector<cv::Point>> contours;
  cv::findContours(text, contours, cv::RETR_EXTERNAL, cv::CHAIN_APPROX_SIMPLE);
  if (static_cast<int>(contours.size()) > params.max_candidates) {
    std::partial_sort(contours.begin(), contours.begin() + params.max_candidates, contours.end(),
                      [](const auto& a, const auto& b) { return a.size() > b.size(); });
    contours.resize(params.max_candidates);
  }
  std::vector<cv::RotatedRect> boxes;
  for (const std::vector<cv::Point>& contour : contours) {
    const cv::RotatedRect core = cv::minAreaRect(contour);
    if (ShortSide(core) < kMinCoreSide)
      continue;
    if (BoxScore(probability, core) < params.box_threshold)
      continue;
    const cv::RotatedRect grown = Unclip(core, params.unclip_ratio);
    if (ShortSide(grown) < kMinGrownSide)
      continue;
    const cv::RotatedRect box = ToImage(grown, probability.size(), image_size);
    if (box.size.width <= kMinImageSide || box.size.height <= kMinImageSide)
      continue;
    boxes.push_back(box);
  }
  return boxes;
}

}  // namespace textreader
