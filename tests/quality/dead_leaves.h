#pragma once

#include <cstdint>

#include <opencv2/core.hpp>

// Camera-like test frames for the resolution estimator, shared with its
// benchmark.
namespace resolution_testing {

// A "dead leaves" texture (RGBA): overlapping discs of random colour with
// radii distributed as r^-3, drawn without anti-aliasing. Its power spectrum
// falls about as 1/f² like a natural scene's, with detail up to the pixel grid.
cv::Mat DeadLeaves(cv::Size size, uint64_t seed);

// The frame shrunk by `factor` and enlarged back (bicubic), as a digital zoom does.
cv::Mat Enlarged(const cv::Mat& frame, double factor);

}  // namespace resolution_testing
