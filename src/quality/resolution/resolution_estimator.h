#pragma once

#include <opencv2/core/mat.hpp>

#include "quality/resolution/spectral_cutoff.h"

// Effective resolution of one camera frame: how much real detail it holds,
// as opposed to how many pixels it has. A frame that was upscaled, defocused
// or heavily compressed reports less than a sharp one of the same size.
//
// Contract (the same as com.quenda.tessel.utils.ResolutionJNI#ImgResEstimate):
//   input   a cv::Mat with 8-bit unsigned depth and 4 (R, G, B, A), 3 (R, G, B)
//           or 1 (grey) channels, at least 3 × kMinWindowSide = 96 pixels on
//           its shorter side; read only.
//   result  the highest spatial frequency at which the frame still holds
//           detail, as a fraction of its Nyquist limit (0.5 cycles per pixel):
//             (0, 1]      1 is detail up to the pixel grid; a frame enlarged
//                         by a factor s from a sharp one reads about 1/s
//                         (about 0.8/s after bilinear enlargement, which also
//                         softens); a Gaussian defocus of sigma >= 2 px
//                         about 0.5/sigma.
//                         Multiplied by the width (height) it gives the
//                         effective pixels across (down). The smallest
//                         value is the bottom of the coarse band: 0.03 for
//                         frames of 600 px or more on the shorter side,
//                         rising to 0.19 for the smallest frames.
//             kNoDetail   (0.0) the frame is valid but no window holds
//                         detail: blank, or nothing but noise (a blank wall).
//             kNotMeasured (-1.0) the input cannot be measured: null, empty,
//                         too small or of another type; an error line says why.
//
// Method: nine square windows on a 3×3 grid (window_grid.h), each reduced to
// grey, evaluated in parallel with TBB: radial power spectrum
// (radial_spectrum.h), then the cut-off where it falls to the noise floor or
// well below its peak once whitened (spectral_cutoff.h); the
// frame's value is the median over the windows that hold detail.
//
// What it does not see: the block edges of nearest-neighbour enlargement are
// real edges in the frame and count as detail; moderate compression (JPEG
// quality 50 and better) leaves the estimate at 1.
namespace image_resolution {

inline constexpr double kNotMeasured = -1.0;

// Logs one debug line per call with the result, or one error line when the
// input cannot be measured. Thread-safe; `frame` may be null.
double EstimateResolution(const cv::Mat* frame);

}  // namespace image_resolution
