#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "font_face.h"
#include "vexel/Font.h"

namespace Vexel {

// What a Font hands to the texts that use it; kept by them after the Font
// itself is gone.
class Font::Impl {
 public:
  std::string name;
  FileType file_type = FILE_TYPE_PATH;
  bool antialiased = true;
  std::uint32_t reference_character = 0;
  std::shared_ptr<internal::FontFace> face;
};

}  // namespace Vexel
