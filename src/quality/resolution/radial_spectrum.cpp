#include "quality/resolution/radial_spectrum.h"

#include <algorithm>
#include <cmath>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

namespace image_resolution {
namespace {

// Removes the least-squares plane a + b·x + c·y. With coordinates centred on
// the window the three normal equations decouple into plain sums.
void RemovePlane(cv::Mat& window) {
  const int side = window.rows;
  const double centre = (side - 1) / 2.0;
  double sum = 0.0, sum_x = 0.0, sum_y = 0.0, sum_xx = 0.0;
  for (int y = 0; y < side; ++y) {
    const float* row = window.ptr<float>(y);
    double row_sum = 0.0;
    for (int x = 0; x < side; ++x) {
      row_sum += row[x];
      sum_x += row[x] * (x - centre);
    }
    sum += row_sum;
    sum_y += row_sum * (y - centre);
  }
  for (int x = 0; x < side; ++x)
    sum_xx += (x - centre) * (x - centre);
  sum_xx *= side;  // the same for y
  const double a = sum / (static_cast<double>(side) * side);
  const double b = sum_x / sum_xx;
  const double c = sum_y / sum_xx;
  for (int y = 0; y < side; ++y) {
    float* row = window.ptr<float>(y);
    for (int x = 0; x < side; ++x)
      row[x] -= static_cast<float>(a + b * (x - centre) + c * (y - centre));
  }
}

}  // namespace

SpectrumPlan MakeSpectrumPlan(int side) {
  CV_Assert(side >= 4 && side % 2 == 0);
  SpectrumPlan plan;
  plan.side = side;
  plan.bins = side / 2;
  cv::createHanningWindow(plan.taper, cv::Size(side, side), CV_32F);
  plan.taper_energy = plan.taper.dot(plan.taper);

  // A real input has a conjugate-symmetric spectrum: columns 0..side/2 hold
  // every frequency once (up to the self-symmetric columns 0 and side/2).
  const int columns = plan.bins + 1;
  plan.bin_of.assign(static_cast<size_t>(side) * columns, -1);
  std::vector<int> counts(plan.bins + 1, 0);
  for (int v = 0; v < side; ++v) {
    const int fv = v <= plan.bins ? v : v - side;
    for (int u = 0; u < columns; ++u) {
      const int bin = static_cast<int>(std::lround(std::hypot(u, fv)));
      if (bin < 1 || bin > plan.bins)
        continue;  // the mean, and the corners beyond the Nyquist ring
      plan.bin_of[static_cast<size_t>(v) * columns + u] = bin;
      ++counts[bin];
    }
  }
  plan.bin_start.assign(plan.bins + 2, 0);
  for (int bin = 1; bin <= plan.bins; ++bin)
    plan.bin_start[bin + 1] = plan.bin_start[bin] + counts[bin];
  return plan;
}

std::vector<float> RadialPowerProfile(const cv::Mat& grey_window, const SpectrumPlan& plan) {
  CV_Assert(grey_window.type() == CV_8UC1 && grey_window.rows == plan.side &&
            grey_window.cols == plan.side);
  cv::Mat window;
  grey_window.convertTo(window, CV_32F);
  RemovePlane(window);
  window = window.mul(plan.taper);

  cv::Mat spectrum;
  cv::dft(window, spectrum, cv::DFT_COMPLEX_OUTPUT);

  // Group the powers by ring, then take each ring's median.
  std::vector<float> grouped(static_cast<size_t>(plan.bin_start[plan.bins + 1]));
  std::vector<int> cursor(plan.bin_start.begin(), plan.bin_start.end() - 1);
  const int columns = plan.bins + 1;
  const float scale = static_cast<float>(1.0 / plan.taper_energy);
  for (int v = 0; v < plan.side; ++v) {
    const cv::Vec2f* row = spectrum.ptr<cv::Vec2f>(v);
    const int* bins = &plan.bin_of[static_cast<size_t>(v) * columns];
    for (int u = 0; u < columns; ++u) {
      if (bins[u] > 0)
        grouped[cursor[bins[u]]++] = (row[u][0] * row[u][0] + row[u][1] * row[u][1]) * scale;
    }
  }
  std::vector<float> profile(plan.bins + 1, 0.0f);
  for (int bin = 1; bin <= plan.bins; ++bin) {
    auto first = grouped.begin() + plan.bin_start[bin];
    auto last = grouped.begin() + plan.bin_start[bin + 1];
    auto middle = first + (last - first) / 2;
    std::nth_element(first, middle, last);
    profile[bin] = *middle;
  }
  return profile;
}

}  // namespace image_resolution
