#include "line_grouping.h"

#include <algorithm>
#include <cmath>
#include <numeric>

#include <opencv2/imgproc.hpp>

#include "box_geometry.h"

namespace textreader {
namespace {

constexpr float kMaxAngleDifference = 8.0F;  // degrees
constexpr float kMaxHeightRatio = 1.5F;
constexpr float kMaxCentreOffset = 0.3F;  // of the mean height, across the line
constexpr float kMaxGap = 1.0F;           // of the mean height, along the line
constexpr float kMaxOverlap = 0.5F;       // of the shorter box, along the line

cv::Point2f Direction(const TextLine& line) {
  const float radians = line.rect.angle * static_cast<float>(CV_PI / 180.0);
  return {std::cos(radians), std::sin(radians)};
}

float AngleDifference(float a, float b) {
  const float d = std::fmod(std::abs(a - b), 360.0F);
  return std::min(d, 360.0F - d);
}

bool Continues(const TextLine& a, const TextLine& b) {
  if (AngleDifference(a.rect.angle, b.rect.angle) > kMaxAngleDifference)
    return false;
  const float ha = a.rect.size.height;
  const float hb = b.rect.size.height;
  if (std::max(ha, hb) > kMaxHeightRatio * std::min(ha, hb))
    return false;
  const float height = 0.5F * (ha + hb);
  const cv::Point2f along = Direction(a);
  const cv::Point2f across(-along.y, along.x);
  const cv::Point2f offset = b.rect.center - a.rect.center;
  if (std::abs(offset.dot(across)) > kMaxCentreOffset * height)
    return false;
  const float distance = std::abs(offset.dot(along));
  const float half_widths = 0.5F * (a.rect.size.width + b.rect.size.width);
  const float gap = distance - half_widths;
  if (gap > kMaxGap * height)
    return false;
  // Boxes lying on one another are two readings, not a continuation.
  return -gap < kMaxOverlap * std::min(a.rect.size.width, b.rect.size.width);
}

int Root(std::vector<int>& parent, int i) {
  while (parent[i] != i)
    i = parent[i] = parent[parent[i]];
  return i;
}

// The members (at least two) as one line: its direction the width-weighted
// mean of theirs, its extent all of their corners.
TextLine Join(std::vector<TextLine> members) {
  cv::Point2f along(0.0F, 0.0F);
  for (const TextLine& m : members)
    along += Direction(m) * m.rect.size.width;
  along *= 1.0F / std::max(std::hypot(along.x, along.y), 1e-6F);
  const cv::Point2f across(-along.y, along.x);
  const auto position = [&](const TextLine& m) { return m.rect.center.dot(along); };
  std::sort(members.begin(), members.end(),
            [&](const TextLine& a, const TextLine& b) { return position(a) < position(b); });
  float min_u = INFINITY, max_u = -INFINITY, min_v = INFINITY, max_v = -INFINITY;
  TextLine line;
  float weighted = 0.0F;
  std::size_t weight = 0;
  for (const TextLine& m : members) {
    for (const cv::Point2f& p : m.corners) {
      min_u = std::min(min_u, p.dot(along));
      max_u = std::max(max_u, p.dot(along));
      min_v = std::min(min_v, p.dot(across));
      max_v = std::max(max_v, p.dot(across));
    }
    if (!line.text.empty() && !m.text.empty())
      line.text += ' ';
    line.text += m.text;
    line.characters.insert(line.characters.end(), m.characters.begin(), m.characters.end());
    const std::size_t length = std::max<std::size_t>(m.text.size(), 1);
    weighted += m.confidence * static_cast<float>(length);
    weight += length;
  }
  const auto at = [&](float u, float v) { return along * u + across * v; };
  line.corners = {at(min_u, min_v), at(max_u, min_v), at(max_u, max_v), at(min_u, max_v)};
  line.rect = RectFromCorners(line.corners);
  line.confidence = weighted / static_cast<float>(weight);
  return line;
}

// A faint blob in the gap between two words makes a box of its own, inside
// the box of the line once the words are joined: the line holds whatever it
// could read.
std::vector<TextLine> WithoutNested(std::vector<TextLine> lines) {
  const auto inside = [](const TextLine& outer, const TextLine& inner) {
    return outer.rect.size.area() > inner.rect.size.area() &&
           cv::pointPolygonTest(
               std::vector<cv::Point2f>(outer.corners.begin(), outer.corners.end()),
               inner.rect.center, false) > 0;
  };
  std::vector<TextLine> kept;
  for (TextLine& line : lines) {
    if (std::none_of(lines.begin(), lines.end(),
                     [&](const TextLine& other) { return inside(other, line); }))
      kept.push_back(line);
  }
  return kept;
}

}  // namespace

std::vector<TextLine> GroupIntoLines(std::vector<TextLine> boxes) {
  const int n = static_cast<int>(boxes.size());
  std::vector<int> parent(n);
  std::iota(parent.begin(), parent.end(), 0);
  for (int i = 0; i < n; ++i)
    for (int j = i + 1; j < n; ++j)
      if (Continues(boxes[i], boxes[j]))
        parent[Root(parent, j)] = Root(parent, i);
  std::vector<std::vector<TextLine>> groups(n);
  for (int i = 0; i < n; ++i)
    groups[Root(parent, i)].push_back(std::move(boxes[i]));
  std::vector<TextLine> lines;
  for (std::vector<TextLine>& group : groups) {
    if (group.size() == 1)
      lines.push_back(std::move(group[0]));
    else if (group.size() > 1)
      lines.push_back(Join(std::move(group)));
  }
  return WithoutNested(std::move(lines));
}

void SortReadingOrder(std::vector<TextLine>& lines) {
  std::sort(lines.begin(), lines.end(),
            [](const TextLine& a, const TextLine& b) { return a.rect.center.y < b.rect.center.y; });
  // Neighbours on one row go left to right (an insertion sort by x within
  // rows, which keeps the order of rows).
  const auto same_row = [](const TextLine& a, const TextLine& b) {
    const float height = std::min(a.rect.size.height, b.rect.size.height);
    return std::abs(a.rect.center.y - b.rect.center.y) < 0.5F * height;
  };
  for (std::size_t i = 1; i < lines.size(); ++i) {
    for (std::size_t j = i; j > 0 && same_row(lines[j - 1], lines[j]) &&
                            lines[j].rect.center.x < lines[j - 1].rect.center.x;
         --j)
      std::swap(lines[j - 1], lines[j]);
  }
}

}  // namespace textreader
