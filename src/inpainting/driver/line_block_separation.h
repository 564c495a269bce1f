#pragma once

#include <vector>

#include <opencv2/core/mat.hpp>

namespace ocr_inpainting {

// Groups the rectangles of a request (flat values, five per rectangle) into
// blocks of neighbouring lines that are erased together in one enclosing
// patch. Scanning from each free rectangle with a box of positive area, the
// following rectangles join while the union of their upright boxes grows by
// less than 1.1 times the joining box's area, covers at most 15 % of the
// image and holds at most 40 % of all rectangles; the first rectangle that
// does not join ends the block. Only blocks of two or more lines are kept;
// then every remaining line becomes a one-member block of its own, so with
// two or more rectangles the result holds only blocks (multi-line ones first,
// in order of their first member) and no lines. A single rectangle stays a
// line. Member indices are ascending within a block.
void SmartSepLineAndBlock(const cv::Mat& image, const std::vector<double>& values,
                          std::vector<std::vector<double>>& block_values,
                          std::vector<double>& line_values,
                          std::vector<std::vector<unsigned int>>& block_indices,
                          std::vector<unsigned int>& line_indices);

}  // namespace ocr_inpainting
