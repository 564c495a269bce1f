#pragma once

#include <array>
#include <vector>

#include "quality/resolution/window_grid.h"

// From a window's radial power profile (radial_spectrum.h) to the highest
// frequency at which it still holds detail, and from nine windows to one
// number for the frame.
namespace image_resolution {

// Cut-offs are fractions of the Nyquist limit (0.5 cycles per pixel).
// A window or frame without detail reports kNoDetail.
inline constexpr double kNoDetail = 0.0;

// The median power of a ring of 8-bit rounding noise: an exponential
// distribution with mean 1/12 has median ln(2)/12.
inline constexpr double kRoundingNoiseMedian = 0.69314718055994531 / 12.0;
// Detail must stand this far above the noise (6 dB).
inline constexpr double kNoiseFloorMargin = 4.0;
// The band of coarse structure (fractions of Nyquist) that any window with
// detail has and that enlargement and defocus leave intact.
inline constexpr double kCoarseBandLow = 0.03;
inline constexpr double kCoarseBandHigh = 0.08;
// The finest band. Scene content has far less power here than in the coarse
// band; white noise (a blank wall under sensor noise) has as much. A window
// whose coarse band does not stand kNoiseFloorMargin above both its finest
// band and the rounding noise holds no detail.
inline constexpr double kFineBandLow = 0.85;
// The cut-off is where the whitened spectrum has fallen this far below its
// peak: -10 dB in power, an amplitude response of about 0.32.
inline constexpr double kWhitenedDrop = 0.1;

// The cut-off of one window in (0, 1], or kNoDetail (see kFineBandLow). `profile` as
// RadialPowerProfile returns it.
//
// Natural scenes and print have power falling about as 1/f²; multiplying by
// f² ("whitening") makes a sharp window's spectrum roughly flat up to the
// Nyquist limit, while enlargement and defocus make it fall steeply. Scanning
// upwards from the coarse band, the cut-off is the first frequency where the
// whitened spectrum has fallen kWhitenedDrop below its peak so far (the peak,
// not the coarse level: print concentrates its energy at the stroke
// frequencies and would otherwise read too sharp), or where the spectrum sinks
// to kNoiseFloorMargin times the rounding noise; interpolated between bins.
// A window that never falls reports 1.
double WindowCutoff(const std::vector<float>& profile);

// The frame's estimate: the median of the windows that hold detail (flat sky
// or wall neither votes nor drags the result down), or kNoDetail when none
// does. With an even count, the mean of the two middle values.
double CombineWindowCutoffs(const std::array<double, kWindowCount>& cutoffs);

}  // namespace image_resolution
