#include "inpainting/driver/line_block_separation.h"

#include <cmath>
#include <cstdio>
#include <set>

#include "common/log.h"
#include "inpainting/driver/cut_into_vector.h"
#include "inpainting/driver/rect_clipping.h"
#include "inpainting/driver/rect_decoding.h"
#include "inpainting/inpainting_constants.h"

namespace ocr_inpainting {
namespace {

// Share of all rectangles that one block may hold, share of the image that a
// growing block may cover, and the growth of the union (beyond the joining
// box's own area, relative to it) that still lets a line join.
constexpr double kMaxMemberShare = 0.4;
constexpr double kMaxBlockImageShare = 0.15;
constexpr double kMaxExtraGrowth = 0.1;

// The upright box of a rectangle with each field truncated toward zero, kept
// in double so that boxes from any host data cannot overflow.
cv::Rect2d TruncatedBox(const cv::RotatedRect& rect) {
  const cv::Rect2f box = rect.boundingRect2f();
  return cv::Rect2d(std::trunc(box.x), std::trunc(box.y), std::trunc(box.width),
                    std::trunc(box.height));
}

// Members of the block that starts at `seed`: the following boxes, in order,
// as long as each one joins.
std::vector<unsigned int> GrowBlock(const std::vector<cv::Rect2d>& boxes, unsigned int seed,
                                    unsigned int max_members, double image_area) {
  std::vector<unsigned int> group = {seed};
  cv::Rect2d united = boxes[seed];
  double previous_area = united.area();
  for (unsigned int j = seed + 1; j < boxes.size(); ++j) {
    const cv::Rect2d& box = boxes[j];
    if (!HasPositiveSides(box) || image_area * kMaxBlockImageShare < united.area() ||
        group.size() > max_members) {
      break;
    }
    const cv::Rect2d grown = united | box;
    if (!HasPositiveSides(grown))
      break;
    const double extra = (grown.area() - previous_area - box.area()) / box.area();
    if (!(extra < kMaxExtraGrowth)) {
      OCR_LOGI("INPAINT_BLOCK_TAG: block stopped at i = %d, j = %d", static_cast<int>(seed),
               static_cast<int>(j));
      break;
    }
    group.push_back(j);
    united = grown;
    previous_area = grown.area();
  }
  return group;
}

void LogSeparation(unsigned int count, const std::vector<unsigned int>& line_indices,
                   const std::vector<std::vector<unsigned int>>& block_indices) {
  OCR_LOGD("kavoSmart start smart sep total %d", static_cast<int>(count));
  for (const unsigned int line : line_indices)
    OCR_LOGD("kavoSmart smart sep line:%d", static_cast<int>(line));
  OCR_LOGD("kavoSmart start block sep");
  for (size_t b = 0; b < block_indices.size(); ++b) {
    OCR_LOGD("kavoSmart sep block num %d", static_cast<int>(b));
    for (size_t m = 0; m < block_indices[b].size(); ++m)
      OCR_LOGD("kavoSmart sep block Num %d, Ind %d", static_cast<int>(b), static_cast<int>(m));
  }
  OCR_LOGD("kavoSmart end smart sep");
}

}  // namespace

void SmartSepLineAndBlock(const cv::Mat& image, const std::vector<double>& values,
                          std::vector<std::vector<double>>& block_values,
                          std::vector<double>& line_values,
                          std::vector<std::vector<unsigned int>>& block_indices,
                          std::vector<unsigned int>& line_indices) {
  block_values.clear();
  line_values.clear();
  block_indices.clear();
  line_indices.clear();
  const double image_area = static_cast<double>(image.rows) * image.cols;

  const std::vector<cv::RotatedRect> rects = TransformVector2RotatedRect(values);
  const auto count = static_cast<unsigned int>(rects.size());
  std::vector<cv::Rect2d> boxes;
  boxes.reserve(count);
  for (const cv::RotatedRect& rect : rects)
    boxes.push_back(TruncatedBox(rect));
  const auto max_members = static_cast<unsigned int>(count * kMaxMemberShare);

  if (count <= 1) {
    if (count == 1)
      line_indices.push_back(0);
    line_values = values;
    return;
  }

  std::set<unsigned int> tagged;
  for (unsigned int i = 0; i < count; ++i) {
    if (tagged.count(i) != 0 || !HasPositiveSides(boxes[i]))
      continue;
    const std::vector<unsigned int> group = GrowBlock(boxes, i, max_members, image_area);
    if (group.size() <= 1)
      continue;
    for (const unsigned int member : group) {
      if (!tagged.insert(member).second)
        std::fputs("error in tagged_idx insert for block_i already in\n", stdout);
    }
    block_indices.push_back(group);
  }

  for (unsigned int i = 0; i < count; ++i) {
    if (tagged.count(i) == 0)
      line_indices.push_back(i);
  }
  CutIntoVector(line_values, values, line_indices, kValsPerRect);
  block_values.resize(block_indices.size());
  for (size_t b = 0; b < block_indices.size(); ++b)
    CutIntoVector(block_values[b], values, block_indices[b], kValsPerRect);

  // Lines are erased as one-member blocks: the block path's enclosing patch
  // and edge mask serve a single line as well.
  for (const unsigned int line : line_indices) {
    std::vector<double> single;
    CutIntoVector(single, values, {line}, kValsPerRect);
    block_values.push_back(single);
    block_indices.push_back({line});
  }
  line_values.clear();
  line_indices.clear();

  LogSeparation(count, line_indices, block_indices);
}

}  // namespace ocr_inpainting
