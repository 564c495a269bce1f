#include "distance_field.h"

#include <algorithm>
#include <cmath>

namespace Vexel::internal {
namespace {

constexpr float kInfinity = 1e20f;
constexpr float kLevelsPerPixel = 16.0f;

// Squared distance transform of one row or column in place (lower envelope
// of parabolas), over `n` values `stride` apart.
void Transform1D(float* grid, int n, int stride, std::vector<float>& f, std::vector<int>& v,
                 std::vector<float>& z) {
  for (int i = 0; i < n; ++i)
    f[i] = grid[i * stride];
  auto intersection = [&](int q, int p) {
    return ((f[q] + static_cast<float>(q * q)) - (f[p] + static_cast<float>(p * p))) /
           static_cast<float>(2 * (q - p));
  };
  int k = 0;
  v[0] = 0;
  z[0] = -kInfinity;
  z[1] = kInfinity;
  for (int q = 1; q < n; ++q) {
    float s = intersection(q, v[k]);
    while (s <= z[k]) {  // z[0] is -infinity: stops at k = 0
      --k;
      s = intersection(q, v[k]);
    }
    ++k;
    v[k] = q;
    z[k] = s;
    z[k + 1] = kInfinity;
  }
  k = 0;
  for (int q = 0; q < n; ++q) {
    while (z[k + 1] < static_cast<float>(q))
      ++k;
    const float d = static_cast<float>(q - v[k]);
    grid[q * stride] = d * d + f[v[k]];
  }
}

void Transform2D(std::vector<float>& grid, int width, int height) {
  const int longest = std::max(width, height);
  std::vector<float> f(longest);
  std::vector<int> v(longest);
  std::vector<float> z(longest + 1);
  for (int x = 0; x < width; ++x)
    Transform1D(grid.data() + x, height, width, f, v, z);
  for (int y = 0; y < height; ++y)
    Transform1D(grid.data() + static_cast<std::ptrdiff_t>(y) * width, width, 1, f, v, z);
}

}  // namespace

DistanceField ComputeDistanceField(const std::uint8_t* coverage, int width, int height, int pitch,
                                   int spread) {
  DistanceField field;
  field.width = width + 2 * spread;
  field.height = height + 2 * spread;
  const std::size_t size = static_cast<std::size_t>(field.width) * field.height;
  // Squared distance to the outline from outside (0 inside) and from inside
  // (0 outside); edge pixels start at their coverage's offset from 0.5.
  std::vector<float> outer(size, kInfinity);
  std::vector<float> inner(size, 0.0f);
  for (int y = 0; y < height; ++y) {
    for (int x = 0; x < width; ++x) {
      const float a = coverage[static_cast<std::ptrdiff_t>(y) * pitch + x] / 255.0f;
      const std::size_t i = static_cast<std::size_t>(y + spread) * field.width + (x + spread);
      if (a >= 1.0f) {
        outer[i] = 0.0f;
        inner[i] = kInfinity;
      } else if (a > 0.0f) {
        outer[i] = std::pow(std::max(0.0f, 0.5f - a), 2.0f);
        inner[i] = std::pow(std::max(0.0f, a - 0.5f), 2.0f);
      }
    }
  }
  Transform2D(outer, field.width, field.height);
  Transform2D(inner, field.width, field.height);
  field.texels.resize(size);
  for (std::size_t i = 0; i < size; ++i) {
    const float inside = std::sqrt(inner[i]) - std::sqrt(outer[i]);  // > 0 inside
    const float level = std::round(128.0f + kLevelsPerPixel * inside);
    field.texels[i] = static_cast<std::uint8_t>(std::clamp(level, 0.0f, 255.0f));
  }
  return field;
}

}  // namespace Vexel::internal
