#pragma once

#include <algorithm>
#include <cstdio>
#include <vector>

namespace ocr_inpainting {

// Gathers into `out` (cleared first) the groups of `group_size` values of
// `source` whose group indices are listed in `indices`, in that order. An
// index past the end is reported on standard output; only the values that
// exist are copied for it.
template <typename T>
void CutIntoVector(std::vector<T>& out, const std::vector<T>& source,
                   std::vector<unsigned int> indices, unsigned int group_size) {
  out.clear();
  out.reserve(indices.size() * group_size);
  for (const unsigned int index : indices) {
    const size_t begin = static_cast<size_t>(index) * group_size;
    const size_t end = begin + group_size;
    if (end > source.size())
      std::fputs("error in CutIntoVector exceed max dimension\n", stdout);
    if (begin < source.size())
      out.insert(out.end(), source.begin() + begin, source.begin() + std::min(end, source.size()));
  }
}

}  // namespace ocr_inpainting
