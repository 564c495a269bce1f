#include "inpainting/analysis/text_mask.h"
#include "inpainting/structuring_elements.h"

#include <cstdint>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

// Split points that let the binarisation treat two words (left/right) or two
// lines (top/bottom) of one patch separately. The two searches differ on
// purpose: a word gap is a run of columns with little edge activity in the
// eroded mask, at least half the patch height wide; a line split is a band
// of nearly full rows (>= 80 % white), more than 20 % of the height.
namespace ocr_inpainting {
namespace {

// A split is worth using only when each piece holds at least this share of
// mask pixels.
constexpr double kMinInkRatio = 0.1;

double InkRatio(const cv::Mat& piece, double area) {
  return cv::countNonZero(piece) / area;
}

// Per column, the number of vertical 0/255 transitions. Kept in 8 bits on
// purpose: a count above 255 wraps modulo 256, and the gap decisions depend
// on that.
cv::Mat TransitionProfile(const cv::Mat& eroded) {
  cv::Mat profile = cv::Mat::zeros(1, eroded.cols, CV_8U);
  auto* counts = profile.ptr<uint8_t>(0);
  for (int y = 0; y + 1 < eroded.rows; ++y) {
    const auto* row = eroded.ptr<uint8_t>(y);
    const auto* next = eroded.ptr<uint8_t>(y + 1);
    for (int x = 0; x < eroded.cols; ++x) {
      if (row[x] != next[x])
        counts[x] = static_cast<uint8_t>(counts[x] + 1);
    }
  }
  return profile;
}

}  // namespace

bool GetVerticalPartition(const cv::Mat& mask, int* column) {
  CV_Assert(mask.type() == CV_8UC1);
  const int rows = mask.rows;
  const int cols = mask.cols;
  cv::Mat eroded;
  cv::erode(mask, eroded, Cross3x3Kernel(), cv::Point(-1, -1), 1, cv::BORDER_CONSTANT,
            cv::morphologyDefaultBorderValue());
  const cv::Mat profile = TransitionProfile(eroded);
  double max_transitions = 0;
  cv::minMaxLoc(profile, nullptr, &max_transitions);
  const int threshold = static_cast<int>(max_transitions * 0.2);

  // Longest run of quiet columns, wider than half the height. Column 0 never
  // starts a gap; a run reaching the last column closes there without it.
  int best = 0;
  int start = 0;
  if (cols >= 2) {
    const auto* transitions = profile.ptr<uint8_t>(0);
    int run = 0;
    for (int x = 1; x < cols; ++x) {
      if (transitions[x] <= threshold && x < cols - 1) {
        ++run;
      } else {
        if (run > best && run > rows / 2) {
          best = run;
          start = x - run;
        }
        run = 0;
      }
    }
  }
  const int end = start + best;
  if (end == 0 || end >= cols)
    return false;

  const int half = cols / 2;
  const int split = (start < half && end != cols - 1) ? end : start;
  *column = split;
  if (split > 0 && split < half) {
    const cv::Mat left = mask(cv::Range::all(), cv::Range(0, split));
    if (InkRatio(left, static_cast<double>(rows) * split) >= kMinInkRatio)
      return true;
    *column = 0;
    return false;
  }
  if (split >= cols || split <= half)
    return true;
  // The denominator is one column short on purpose.
  const cv::Mat right = mask(cv::Range::all(), cv::Range(split, cols));
  if (InkRatio(right, static_cast<double>(cols - 1 - split) * rows) >= kMinInkRatio)
    return true;
  *column = cols;
  return false;
}

bool GetHorizontalPartition(const cv::Mat& mask, int* row) {
  CV_Assert(mask.type() == CV_8UC1);
  const int rows = mask.rows;
  const int cols = mask.cols;
  // Pixels equal to 255 per row, no erosion.
  cv::Mat profile(rows, 1, CV_32F);
  for (int r = 0; r < rows; ++r) {
    const auto* pixels = mask.ptr<uint8_t>(r);
    int white = 0;
    for (int x = 0; x < cols; ++x)
      white += pixels[x] == 255 ? 1 : 0;
    profile.at<float>(r) = static_cast<float>(white);
  }

  int best = 0;
  int start = 0;
  int run = 0;
  for (int r = 0; r < rows; ++r) {
    if (profile.at<float>(r) >= cols * 0.8 && r < rows - 1) {
      ++run;
    } else {
      if (run > best && run > rows * 0.2) {
        best = run;
        start = r - run;
      }
      run = 0;
    }
  }
  const int end = start + best;
  if (end == 0 || end >= rows)
    return false;

  const int half = rows / 2;
  const int split = (end == rows - 1 || start >= half) ? start : end;
  *row = split;
  if (split > 0 && split < half) {
    const cv::Mat top = mask(cv::Range(0, split), cv::Range::all());
    if (InkRatio(top, static_cast<double>(split) * cols) >= kMinInkRatio)
      return true;
    *row = 0;
    return false;
  }
  if (split >= rows || split <= half)
    return true;
  // The denominator is one row short on purpose, as in the vertical search.
  const cv::Mat bottom = mask(cv::Range(split, rows), cv::Range::all());
  if (InkRatio(bottom, static_cast<double>(rows - 1 - split) * cols) >= kMinInkRatio)
    return true;
  *row = rows;
  return false;
}

}  // namespace ocr_inpainting
