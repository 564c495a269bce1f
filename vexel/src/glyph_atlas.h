#pragma once

#include <GLES2/gl2.h>

#include <cstdint>
#include <memory>
#include <vector>

#include "gpu.h"

namespace Vexel::internal {

// Where a glyph's distance field lies in the atlas.
struct AtlasSlot {
  int page = -1;  // -1: the glyph has nothing to draw (a space)
  float u0 = 0, v0 = 0, u1 = 0, v1 = 0;
};

// Single-channel pages of glyph distance fields, packed in shelves. Pages
// are kept in memory and copied to the device (only their changed rows)
// when a text is drawn.
class GlyphAtlas {
 public:
  static constexpr int kPageSize = 1024;

  // Copies a width x height bitmap (rows `pitch` bytes apart, first row on
  // top) into a free place; one blank texel is kept around each glyph.
  AtlasSlot Add(const std::uint8_t* bitmap, int width, int height, int pitch);

  // Brings the page's texture up to date and binds it to the unit.
  void Bind(int page, GLuint unit);

  std::size_t page_count() const { return pages_.size(); }

 private:
  struct Page {
    std::vector<std::uint8_t> pixels = std::vector<std::uint8_t>(kPageSize * kPageSize, 0);
    int shelf_top = 1;
    int shelf_height = 0;
    int cursor_x = 1;
    int dirty_top = kPageSize;
    int dirty_bottom = 0;
    std::shared_ptr<GlObject> texture;
  };

  std::vector<Page> pages_;
};

}  // namespace Vexel::internal
