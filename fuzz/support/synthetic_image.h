#pragma once

#include <opencv2/core.hpp>

#include "support/fuzz_input.h"

// Camera-like test images from a handful of input bytes: a background colour,
// a few filled and outlined shapes in other colours (text-like strokes and
// blocks) and a little noise, so that the pipelines find edges, corners and
// colour contrast without the fuzzer spending bytes on pixels.
namespace ocr_fuzz {

// An 8-bit image of `rows` x `cols` with `channels` channels (any of 1..4).
cv::Mat SyntheticImage(FuzzInput& in, int rows, int cols, int channels);

}  // namespace ocr_fuzz
