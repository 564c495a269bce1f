#pragma once

#include <array>

#include <opencv2/core/types.hpp>

// Where the estimator looks: nine square windows, one centred in each cell of
// a 3×3 grid over the frame, so that the estimate samples the whole field of
// view (centre, edges and corners, where lens softness differs).
namespace image_resolution {

inline constexpr int kGridCells = 3;
inline constexpr int kWindowCount = kGridCells * kGridCells;
// Larger windows resolve the spectrum more finely but cost more; 256 keeps
// nine transforms within a few milliseconds on a phone.
inline constexpr int kMaxWindowSide = 256;
// Below this a window has too few frequency bins for a cut-off to mean much.
inline constexpr int kMinWindowSide = 32;

using WindowGrid = std::array<cv::Rect, kWindowCount>;

// The side of the square windows for a frame: the largest even size that the
// DFT handles quickly (2^a 3^b 5^c) and that fits a grid cell, at most
// kMaxWindowSide. Returns 0 when it would be below kMinWindowSide.
int ChooseWindowSide(cv::Size frame);

// The nine windows of side `side`, row by row, each centred in its grid cell.
WindowGrid LayOutWindows(cv::Size frame, int side);

}  // namespace image_resolution
