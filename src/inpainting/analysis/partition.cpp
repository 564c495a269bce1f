#include "inpainting/analysis/text_mask.h"
#include "inpainting/structuring_elements.h"

#include <cstdint>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

// Split points that let the binarisation treat two words (left/right) or two
// lines (top/bottom) of one patch separately. Both searches find the longest
// gap along their axis and then choose the split and check the ink on each
// side the same way (LongestGap, ChooseSplit). What a gap is differs on
// purpose: a word gap is a run of columns with little edge activity in the
// eroded mask, longer than half the patch height, and column 0 never starts
// one; a line gap is a band of nearly full rows (>= 80 % white, no erosion),
// longer than 20 % of the height.
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

enum class Axis { kColumns, kRows };

// Columns or rows [begin, end) of `mask`.
cv::Mat Piece(const cv::Mat& mask, Axis axis, int begin, int end) {
  return axis == Axis::kColumns ? mask(cv::Range::all(), cv::Range(begin, end))
                                : mask(cv::Range(begin, end), cv::Range::all());
}

struct Gap {
  int start = 0;
  int length = 0;
};

// The longest run of consecutive positions in [first, n) that `in_gap`
// accepts and that is longer than `min_length`; the first such run wins a
// tie. The last position never extends a run: a run reaching it closes there
// without it.
template <typename InGap>
Gap LongestGap(int first, int n, double min_length, InGap in_gap) {
  Gap best;
  int run = 0;
  for (int i = first; i < n; ++i) {
    if (in_gap(i) && i < n - 1) {
      ++run;
    } else {
      if (run > best.length && run > min_length)
        best = {i - run, run};
      run = 0;
    }
  }
  return best;
}

// The split at `gap` along `axis`: its far edge when the gap starts in the
// first half and does not end on the last position, else its near edge.
// A split in the first half is kept only when the piece before it holds
// enough ink (else *at = 0), one in the second half only when the piece
// after it does (else *at = n). False when there is no gap or no split.
bool ChooseSplit(const cv::Mat& mask, Axis axis, const Gap& gap, int* at) {
  const int n = axis == Axis::kColumns ? mask.cols : mask.rows;
  const int across = axis == Axis::kColumns ? mask.rows : mask.cols;
  const int end = gap.start + gap.length;
  if (end == 0 || end >= n)
    return false;

  const int half = n / 2;
  const int split = (gap.start < half && end != n - 1) ? end : gap.start;
  *at = split;
  if (split > 0 && split < half) {
    if (InkRatio(Piece(mask, axis, 0, split), static_cast<double>(across) * split) >= kMinInkRatio)
      return true;
    *at = 0;
    return false;
  }
  if (split >= n || split <= half)
    return true;
  // The denominator is one column or row short on purpose.
  if (InkRatio(Piece(mask, axis, split, n), static_cast<double>(n - 1 - split) * across) >=
      kMinInkRatio)
    return true;
  *at = n;
  return false;
}

}  // namespace

bool GetVerticalPartition(const cv::Mat& mask, int* column) {
  CV_Assert(mask.type() == CV_8UC1);
  cv::Mat eroded;
  cv::erode(mask, eroded, Cross3x3Kernel(), cv::Point(-1, -1), 1, cv::BORDER_CONSTANT,
            cv::morphologyDefaultBorderValue());
  const cv::Mat profile = TransitionProfile(eroded);
  double max_transitions = 0;
  cv::minMaxLoc(profile, nullptr, &max_transitions);
  const int threshold = static_cast<int>(max_transitions * 0.2);

  const auto* transitions = profile.ptr<uint8_t>(0);
  const Gap gap =
      LongestGap(1, mask.cols, mask.rows / 2, [&](int x) { return transitions[x] <= threshold; });
  return ChooseSplit(mask, Axis::kColumns, gap, column);
}

bool GetHorizontalPartition(const cv::Mat& mask, int* row) {
  CV_Assert(mask.type() == CV_8UC1);
  const int cols = mask.cols;
  // Pixels equal to 255 per row.
  cv::Mat profile(mask.rows, 1, CV_32F);
  for (int r = 0; r < mask.rows; ++r) {
    const auto* pixels = mask.ptr<uint8_t>(r);
    int white = 0;
    for (int x = 0; x < cols; ++x)
      white += pixels[x] == 255 ? 1 : 0;
    profile.at<float>(r) = static_cast<float>(white);
  }

  const Gap gap = LongestGap(0, mask.rows, mask.rows * 0.2,
                             [&](int r) { return profile.at<float>(r) >= cols * 0.8; });
  return ChooseSplit(mask, Axis::kRows, gap, row);
}

}  // namespace ocr_inpainting
