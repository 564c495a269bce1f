#pragma once

#include <vector>

#include <opencv2/core/mat.hpp>

// The radial power spectrum of one square grey window.
//
// Units: the window is detrended (a least-squares plane removed, so an
// illumination gradient is not mistaken for detail), tapered with a 2-D Hann
// window (so its borders do not leak a cross of false high frequencies) and
// transformed with cv::dft. Powers are divided by the taper's energy, which
// makes white noise of variance s² read s² in every bin: the 8-bit rounding
// every frame carries (variance 1/12) has a known level.
//
// Bin k (1..side/2) is the ring of frequencies whose radius rounds to k, that
// is k / (side/2) of the Nyquist limit. A ring reports the median of its
// powers rather than the mean: lines and spikes in the 2-D spectrum (the 8×8
// block grid of a compressed frame, the staircase of a quantised gradient, a
// periodic pattern) then do not pass for broadband detail.
namespace image_resolution {

// What every window of one size shares: built once per call, read-only while
// the windows are evaluated in parallel.
struct SpectrumPlan {
  int side = 0;
  int bins = 0;                // side / 2: bin k covers radius k, k = 1..bins
  cv::Mat taper;               // side × side CV_32F Hann window
  double taper_energy = 0.0;   // sum of the squared taper
  std::vector<int> bin_of;     // per half-spectrum sample (side rows × bins+1 columns): bin or -1
  std::vector<int> bin_start;  // bins + 2 offsets into a buffer grouped by bin
};

// `side` must be even and at least 4.
SpectrumPlan MakeSpectrumPlan(int side);

// Radial profile of a side × side CV_8UC1 window: element k (1..bins) is the
// median normalised power of ring k; element 0 (the mean) is left at 0.
std::vector<float> RadialPowerProfile(const cv::Mat& grey_window, const SpectrumPlan& plan);

}  // namespace image_resolution
