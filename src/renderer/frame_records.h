#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

#include "renderer/rect_mapping.h"
#include "renderer/render_records.h"

// Unpacking of the host's renderOneFrame arrays into one record per text.
namespace ocr_ar {

// One of the host's arrays: null when the host passed none.
template <typename T>
struct HostArray {
  const T* data = nullptr;
  std::size_t size = 0;

  // The `count` elements from `offset` on, or null when the array is absent
  // or too short to hold them.
  const T* At(std::size_t offset, std::size_t count) const {
    return data != nullptr && offset + count <= size ? data + offset : nullptr;
  }
};

// The per-text arrays of one renderOneFrame call (layout per text i:
// rectangles 5 values at 5*i, colour scales and shifts 3 at 3*i, the others
// one value at i).
struct FrameArrays {
  HostArray<double> patch_rects;
  HostArray<double> text_rects;
  HostArray<std::int64_t> ids;
  HostArray<std::int64_t> patch_mat_addrs;
  HostArray<double> color_scales;
  HostArray<double> color_shifts;
  HostArray<std::int32_t> colors;
};

// Everything the bridge draws for one text.
struct TextRecord {
  std::string text;
  ImageRect patch_rect;
  ImageRect text_rect;
  PatchRecord patch;
  Color color = Color::FromPacked(kDefaultTextColor);
};

// The record of text `index`. The patch record is built only when both the
// ids and the patch matrix addresses are given; a patch matrix that is not
// 8-bit RGBA in one piece contributes no pixels. A missing rectangle is all
// zero, a missing colour opaque black.
TextRecord UnpackTextRecord(const FrameArrays& arrays, std::size_t index, std::string text);

// The record of a text whose string could not be read: empty text, zero
// rectangles, no patch (id -1), opaque black.
TextRecord UnreadableTextRecord();

// Whether both rectangle arrays hold five values for each of `count` texts.
bool HasAllRects(const FrameArrays& arrays, std::size_t count);

}  // namespace ocr_ar
