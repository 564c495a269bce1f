#include "quality/resolution/window_grid.h"

#include <algorithm>

#include <opencv2/core.hpp>

namespace image_resolution {

int ChooseWindowSide(cv::Size frame) {
  const int cell = std::min(frame.width, frame.height) / kGridCells;
  for (int side = std::min(cell, kMaxWindowSide) & ~1; side >= kMinWindowSide; side -= 2) {
    if (cv::getOptimalDFTSize(side) == side)
      return side;
  }
  return 0;
}

WindowGrid LayOutWindows(cv::Size frame, int side) {
  WindowGrid windows;
  for (int row = 0; row < kGridCells; ++row) {
    for (int col = 0; col < kGridCells; ++col) {
      // Cell bounds by integer division, so the cells tile the frame exactly.
      const int x0 = frame.width * col / kGridCells;
      const int x1 = frame.width * (col + 1) / kGridCells;
      const int y0 = frame.height * row / kGridCells;
      const int y1 = frame.height * (row + 1) / kGridCells;
      windows[row * kGridCells + col] =
          cv::Rect(x0 + (x1 - x0 - side) / 2, y0 + (y1 - y0 - side) / 2, side, side);
    }
  }
  return windows;
}

}  // namespace image_resolution
