#pragma once

#include <cstdint>
#include <vector>

namespace Vexel::internal {

// The signed distance field of an anti-aliased coverage bitmap, as glyphs
// are drawn from: the bitmap grown by `spread` pixels on every side, each
// texel 128 on the outline, 16 levels more per pixel inside and 16 fewer per
// pixel outside, clamped to 0..255. Distances are exact Euclidean ones
// (two-pass squared distance transform), the outline placed within edge
// pixels by their coverage.
struct DistanceField {
  int width = 0;
  int height = 0;
  std::vector<std::uint8_t> texels;  // width x height, first row on top
};

// `coverage`: width x height bytes (0 outside, 255 inside), rows `pitch`
// bytes apart.
DistanceField ComputeDistanceField(const std::uint8_t* coverage, int width, int height, int pitch,
                                   int spread);

}  // namespace Vexel::internal
