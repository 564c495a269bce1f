#pragma once

#include <hb.h>

#include <cstdint>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "glyph_atlas.h"
#include "vexel/Font.h"

struct AAssetManager;
typedef struct FT_FaceRec_* FT_Face;

namespace Vexel::internal {

class FreeTypeLibrary;

// A line's extent around its baseline, in ems; both positive.
struct LineMetrics {
  float ascent = 0.0f;
  float descent = 0.0f;
  float height() const { return ascent + descent; }
};

// A glyph's ink box relative to its origin, in ems, y upwards.
struct GlyphInk {
  bool empty = true;
  float left = 0, top = 0, right = 0, bottom = 0;
};

// Where a line's ink lies by the font's design, in ems above the baseline
// (negative below), measured on the ink of reference glyphs.
struct DesignInk {
  float capital = 0.0f;    // top of "H"
  float ascender = 0.0f;   // highest of the capital and "b d f h k l"
  float descender = 0.0f;  // lowest of "g j p q y"
  bool has_ideograph = false;
  float ideograph_top = 0.0f;  // of U+56FD, a full-height ideograph
  float ideograph_bottom = 0.0f;
};

// A glyph ready to draw: its distance field's box relative to the glyph
// origin (ems, y upwards) and where the field lies in the atlas.
struct GlyphImage {
  float left = 0, top = 0, width = 0, height = 0;
  AtlasSlot slot;
};

// The loaded font file shared by every Font and Text made from the same
// source: shaping (HarfBuzz), outlines and distance fields (FreeType), and
// the glyph atlas of this face.
class FontFace {
 public:
  // Distance fields are rasterised at this size, with this spread (pixels
  // of distance on each side of an outline that the field encodes).
  static constexpr int kRasterPixelsPerEm = 48;
  static constexpr int kSpreadPixels = 8;

  // The face for this source, loaded or shared. Throws Vexel::Exception when
  // the file cannot be found or read or is no font. `assets` serves
  // FILE_TYPE_ASSET and may be null otherwise.
  static std::shared_ptr<FontFace> Load(const std::string& name, Font::FileType type,
                                        AAssetManager* assets);

  ~FontFace();
  FontFace(const FontFace&) = delete;
  FontFace& operator=(const FontFace&) = delete;

  hb_font_t* hb_font() const { return hb_font_; }
  float units_per_em() const { return units_per_em_; }
  bool HasCharacter(char32_t c) const;

  // Ascender to descender of the font.
  LineMetrics DefaultLineMetrics() const;
  // The line box set by a reference character (see Font::setReferenceCharacter);
  // the default metrics when the font does not map it.
  LineMetrics ReferenceLineMetrics(char32_t reference) const;

  const DesignInk& design_ink() const { return design_ink_; }

  GlyphInk Ink(std::uint32_t glyph) const;
  // The glyph's distance field, rasterised on first use.
  const GlyphImage& Image(std::uint32_t glyph);
  GlyphAtlas& atlas() { return atlas_; }

 private:
  FontFace(std::vector<std::uint8_t> data, const std::string& description);
  DesignInk MeasureDesignInk() const;

  std::shared_ptr<FreeTypeLibrary> library_;
  std::vector<std::uint8_t> data_;
  FT_Face ft_face_ = nullptr;
  hb_blob_t* hb_blob_ = nullptr;
  hb_face_t* hb_face_ = nullptr;
  hb_font_t* hb_font_ = nullptr;
  float units_per_em_ = 1000.0f;
  DesignInk design_ink_;
  GlyphAtlas atlas_;
  std::unordered_map<std::uint32_t, GlyphImage> images_;
};

}  // namespace Vexel::internal
