#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "vexel/Exception.h"

namespace Vexel {

// A font face loaded from a TrueType/OpenType file; of a collection (.ttc)
// the first face. Texts share the face: destroying a Font does not disturb
// the texts that were given it.
//
// A font that cannot be found or read throws Vexel::Exception naming the
// font and where it was looked for.
class Font {
 public:
  enum FileType {
    FILE_TYPE_PATH = 0,    // a path in the file system
    FILE_TYPE_SYSTEM = 1,  // a platform font by file name: /system/fonts on a
                           // phone, the font directories under /usr/share/fonts
                           // (searched recursively) on Linux
    FILE_TYPE_ASSET = 2,   // a file read through the current kit's asset manager
  };

  // `antialiased`: glyph edges are smoothed over one screen pixel; false
  // draws hard edges.
  Font(const std::string& name, FileType fileType, bool antialiased);
  ~Font();
  Font(const Font&) = delete;
  Font& operator=(const Font&) = delete;

  // The name the font was created with.
  const std::string& getName() const;
  FileType getFileType() const;
  bool isAntialiased() const;

  // The reference character sizes the lines of texts laid out with this font.
  // 0 (the default): a line is as tall as the font's ascender minus its
  // descender. Otherwise, when the font maps that character: a line is as
  // tall as the character's glyph box is wide (its advance; one em for a
  // fullwidth form such as U+FF41), split around the baseline in the
  // proportion of the font's typographic ascender to descender. CJK fonts
  // declare ascenders tall enough for vertical layout; a fullwidth reference
  // character gives their lines the height of the ideographic em box instead.
  void setReferenceCharacter(std::uint32_t codepoint);
  std::uint32_t getReferenceCharacter() const;

  class Impl;

 private:
  friend struct detail::Access;
  std::shared_ptr<Impl> impl_;
};

}  // namespace Vexel
