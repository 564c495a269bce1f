#include "glyph_atlas.h"

#include <algorithm>
#include <cstring>

#include "vexel/Exception.h"

namespace Vexel::internal {

AtlasSlot GlyphAtlas::Add(const std::uint8_t* bitmap, int width, int height, int pitch) {
  if (width <= 0 || height <= 0)
    return {};
  if (width + 2 > kPageSize || height + 2 > kPageSize)
    throw Exception("Vexel: a glyph of " + std::to_string(width) + "x" + std::to_string(height) +
                    " pixels does not fit a glyph page");
  if (pages_.empty())
    pages_.emplace_back();
  Page* page = &pages_.back();
  if (page->cursor_x + width + 1 > kPageSize) {  // next shelf
    page->shelf_top += page->shelf_height + 1;
    page->shelf_height = 0;
    page->cursor_x = 1;
  }
  if (page->shelf_top + height + 1 > kPageSize) {  // next page
    pages_.emplace_back();
    page = &pages_.back();
  }
  const int x = page->cursor_x;
  const int y = page->shelf_top;
  for (int row = 0; row < height; ++row) {
    std::memcpy(&page->pixels[static_cast<std::size_t>(y + row) * kPageSize + x],
                bitmap + static_cast<std::ptrdiff_t>(row) * pitch, static_cast<std::size_t>(width));
  }
  page->cursor_x += width + 1;
  page->shelf_height = std::max(page->shelf_height, height);
  page->dirty_top = std::min(page->dirty_top, y);
  page->dirty_bottom = std::max(page->dirty_bottom, y + height);

  AtlasSlot slot;
  slot.page = static_cast<int>(pages_.size()) - 1;
  slot.u0 = static_cast<float>(x) / kPageSize;
  slot.v0 = static_cast<float>(y) / kPageSize;
  slot.u1 = static_cast<float>(x + width) / kPageSize;
  slot.v1 = static_cast<float>(y + height) / kPageSize;
  return slot;
}

void GlyphAtlas::Bind(int index, GLuint unit) {
  Page& page = pages_.at(static_cast<std::size_t>(index));
  glActiveTexture(GL_TEXTURE0 + unit);
  glPixelStorei(GL_UNPACK_ALIGNMENT, 1);
  if (!page.texture) {
    page.texture = std::make_shared<GlObject>(Gpu::Acquire(), GlObject::kTexture);
    glBindTexture(GL_TEXTURE_2D, page.texture->id());
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_LINEAR);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER, GL_LINEAR);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_WRAP_S, GL_CLAMP_TO_EDGE);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_WRAP_T, GL_CLAMP_TO_EDGE);
    glTexImage2D(GL_TEXTURE_2D, 0, GL_LUMINANCE, kPageSize, kPageSize, 0, GL_LUMINANCE,
                 GL_UNSIGNED_BYTE, page.pixels.data());
    page.dirty_top = kPageSize;
    page.dirty_bottom = 0;
    return;
  }
  glBindTexture(GL_TEXTURE_2D, page.texture->id());
  if (page.dirty_bottom > page.dirty_top) {
    glTexSubImage2D(GL_TEXTURE_2D, 0, 0, page.dirty_top, kPageSize,
                    page.dirty_bottom - page.dirty_top, GL_LUMINANCE, GL_UNSIGNED_BYTE,
                    &page.pixels[static_cast<std::size_t>(page.dirty_top) * kPageSize]);
    page.dirty_top = kPageSize;
    page.dirty_bottom = 0;
  }
}

}  // namespace Vexel::internal
