#include "font_face.h"

#include <android/asset_manager.h>
#include <ft2build.h>
#include FT_FREETYPE_H
#include FT_TRUETYPE_TABLES_H

#include <algorithm>
#include <fstream>
#include <iterator>
#include <map>
#include <mutex>
#include <string_view>

#include "distance_field.h"
#include "platform/kit_files.h"

namespace Vexel::internal {

// One FreeType library for the process, kept while any face uses it.
class FreeTypeLibrary {
 public:
  FreeTypeLibrary() {
    if (FT_Init_FreeType(&library_) != 0)
      throw Exception("Vexel: FreeType could not be initialised");
  }
  ~FreeTypeLibrary() { FT_Done_FreeType(library_); }
  FT_Library get() const { return library_; }

  static std::shared_ptr<FreeTypeLibrary> Shared() {
    static std::weak_ptr<FreeTypeLibrary> shared;
    std::shared_ptr<FreeTypeLibrary> library = shared.lock();
    if (!library) {
      library = std::make_shared<FreeTypeLibrary>();
      shared = library;
    }
    return library;
  }

 private:
  FT_Library library_ = nullptr;
};

namespace {

// Where a font's bytes come from.
struct FontSource {
  std::string key;          // identifies the bytes, for sharing faces
  std::string description;  // for messages
  std::string path;         // file to read, or empty for an asset
  AAssetManager* assets = nullptr;
};

FontSource Resolve(const std::string& name, Font::FileType type, AAssetManager* assets) {
  const std::string quoted = "\"" + name + "\"";
  FontSource source;
  switch (type) {
    case Font::FILE_TYPE_PATH:
      source.path = name;
      source.description = "file " + name;
      break;
    case Font::FILE_TYPE_SYSTEM:
      source.path = platform::FindSystemFont(name);
      if (source.path.empty()) {
        throw Exception("Vexel: platform font " + quoted + " not found in " +
                        platform::SystemFontLocation());
      }
      source.description = "platform font " + source.path;
      break;
    case Font::FILE_TYPE_ASSET:
      if (assets == nullptr) {
        throw Exception("Vexel: font " + quoted +
                        " is an asset, but the current kit has no asset manager");
      }
      source.assets = assets;
      source.description = "asset " + name;
      source.key = "asset:" + std::to_string(reinterpret_cast<std::uintptr_t>(assets)) + ":";
      break;
    default:
      throw Exception("Vexel: font " + quoted + " has an unknown file type " +
                      std::to_string(static_cast<int>(type)));
  }
  source.key += source.path.empty() ? name : "path:" + source.path;
  return source;
}

std::vector<std::uint8_t> Read(const std::string& name, const FontSource& source) {
  std::vector<std::uint8_t> data;
  const std::string quoted = "\"" + name + "\"";
  if (!source.path.empty()) {
    std::ifstream file(source.path, std::ios::binary);
    if (!file)
      throw Exception("Vexel: font " + quoted + " not found: cannot open " + source.path);
    data.assign(std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>());
    if (file.bad())
      throw Exception("Vexel: font " + quoted + " cannot be read from " + source.path);
    return data;
  }
  AAsset* asset = AAssetManager_open(source.assets, name.c_str(), AASSET_MODE_BUFFER);
  if (asset == nullptr)
    throw Exception("Vexel: font asset " + quoted + " not found");
  const auto* bytes = static_cast<const std::uint8_t*>(AAsset_getBuffer(asset));
  if (bytes != nullptr)
    data.assign(bytes, bytes + AAsset_getLength64(asset));
  AAsset_close(asset);
  if (bytes == nullptr)
    throw Exception("Vexel: font asset " + quoted + " cannot be read");
  return data;
}

}  // namespace

std::shared_ptr<FontFace> FontFace::Load(const std::string& name, Font::FileType type,
                                         AAssetManager* assets) {
  // Faces in use are shared: a CJK collection is tens of megabytes.
  static std::mutex mutex;
  static std::map<std::string, std::weak_ptr<FontFace>> loaded;
  const FontSource source = Resolve(name, type, assets);
  std::lock_guard<std::mutex> lock(mutex);
  auto found = loaded.find(source.key);
  if (found != loaded.end()) {
    if (std::shared_ptr<FontFace> face = found->second.lock())
      return face;
  }
  std::shared_ptr<FontFace> face(
      new FontFace(Read(name, source), "\"" + name + "\" (" + source.description + ")"));
  for (auto it = loaded.begin(); it != loaded.end();)
    it = it->second.expired() ? loaded.erase(it) : std::next(it);
  loaded[source.key] = face;
  return face;
}

FontFace::FontFace(std::vector<std::uint8_t> data, const std::string& description)
    : library_(FreeTypeLibrary::Shared()), data_(std::move(data)) {
  // Face 0: of a collection, its first face.
  if (data_.empty() || FT_New_Memory_Face(library_->get(), data_.data(),
                                          static_cast<FT_Long>(data_.size()), 0, &ft_face_) != 0) {
    throw Exception("Vexel: font " + description + " is not a readable font file");
  }
  if (!FT_IS_SCALABLE(ft_face_) || ft_face_->units_per_EM == 0) {
    FT_Done_Face(ft_face_);
    throw Exception("Vexel: font " + description + " has no scalable outlines");
  }
  FT_Set_Pixel_Sizes(ft_face_, 0, kRasterPixelsPerEm);
  units_per_em_ = static_cast<float>(ft_face_->units_per_EM);
  hb_blob_ = hb_blob_create(reinterpret_cast<const char*>(data_.data()),
                            static_cast<unsigned int>(data_.size()), HB_MEMORY_MODE_READONLY,
                            nullptr, nullptr);
  hb_face_ = hb_face_create(hb_blob_, 0);
  hb_font_ = hb_font_create(hb_face_);
  // Positions in font units; the layout divides by units per em.
  hb_font_set_scale(hb_font_, static_cast<int>(units_per_em_), static_cast<int>(units_per_em_));
  design_ink_ = MeasureDesignInk();
}

DesignInk FontFace::MeasureDesignInk() const {
  // Extremes of the ink of those characters the font maps and inks.
  auto measure = [this](std::u32string_view characters, bool top, float& value) {
    bool found = false;
    for (const char32_t c : characters) {
      hb_codepoint_t glyph = 0;
      if (!hb_font_get_nominal_glyph(hb_font_, c, &glyph) || glyph == 0)
        continue;
      const GlyphInk ink = Ink(glyph);
      if (ink.empty)
        continue;
      const float edge = top ? ink.top : ink.bottom;
      value = !found ? edge : top ? std::max(value, edge) : std::min(value, edge);
      found = true;
    }
    return found;
  };
  DesignInk ink;
  // Without the Latin references (a font of another script), the OS/2 cap
  // height, else the line's ascender and descender, stand in.
  if (!measure(U"H", true, ink.capital)) {
    const auto* os2 = static_cast<const TT_OS2*>(FT_Get_Sfnt_Table(ft_face_, FT_SFNT_OS2));
    ink.capital = os2 != nullptr && os2->version >= 2 && os2->sCapHeight > 0
                      ? static_cast<float>(os2->sCapHeight) / units_per_em_
                      : DefaultLineMetrics().ascent;
  }
  ink.ascender = ink.capital;
  float ascender = 0.0f;
  if (measure(U"bdfhkl", true, ascender))
    ink.ascender = std::max(ink.ascender, ascender);
  if (!measure(U"gjpqy", false, ink.descender))
    ink.descender = -DefaultLineMetrics().descent;
  ink.has_ideograph = measure(U"\u56FD", true, ink.ideograph_top) &&
                      measure(U"\u56FD", false, ink.ideograph_bottom);
  return ink;
}

FontFace::~FontFace() {
  hb_font_destroy(hb_font_);
  hb_face_destroy(hb_face_);
  hb_blob_destroy(hb_blob_);
  FT_Done_Face(ft_face_);
}

bool FontFace::HasCharacter(char32_t c) const {
  hb_codepoint_t glyph = 0;
  return hb_font_get_nominal_glyph(hb_font_, c, &glyph) != 0 && glyph != 0;
}

LineMetrics FontFace::DefaultLineMetrics() const {
  LineMetrics metrics;
  metrics.ascent = static_cast<float>(ft_face_->ascender) / units_per_em_;
  metrics.descent = static_cast<float>(-ft_face_->descender) / units_per_em_;
  if (metrics.height() <= 0.0f) {
    metrics.ascent = 0.8f;
    metrics.descent = 0.2f;
  }
  return metrics;
}

LineMetrics FontFace::ReferenceLineMetrics(char32_t reference) const {
  hb_codepoint_t glyph = 0;
  if (reference == 0 || !hb_font_get_nominal_glyph(hb_font_, reference, &glyph) || glyph == 0)
    return DefaultLineMetrics();
  const float height =
      static_cast<float>(hb_font_get_glyph_h_advance(hb_font_, glyph)) / units_per_em_;
  if (height <= 0.0f)
    return DefaultLineMetrics();
  float above = static_cast<float>(ft_face_->ascender);
  float below = static_cast<float>(-ft_face_->descender);
  const auto* os2 = static_cast<const TT_OS2*>(FT_Get_Sfnt_Table(ft_face_, FT_SFNT_OS2));
  if (os2 != nullptr && os2->sTypoAscender - os2->sTypoDescender > 0) {
    above = os2->sTypoAscender;
    below = -os2->sTypoDescender;
  }
  LineMetrics metrics;
  metrics.ascent = above + below > 0.0f ? height * above / (above + below) : height * 0.8f;
  metrics.descent = height - metrics.ascent;
  return metrics;
}

GlyphInk FontFace::Ink(std::uint32_t glyph) const {
  hb_glyph_extents_t extents{};
  GlyphInk ink;
  if (!hb_font_get_glyph_extents(hb_font_, glyph, &extents) || extents.width == 0 ||
      extents.height == 0)
    return ink;
  ink.empty = false;
  ink.left = static_cast<float>(extents.x_bearing) / units_per_em_;
  ink.right = static_cast<float>(extents.x_bearing + extents.width) / units_per_em_;
  ink.top = static_cast<float>(extents.y_bearing) / units_per_em_;
  ink.bottom = static_cast<float>(extents.y_bearing + extents.height) / units_per_em_;
  return ink;
}

const GlyphImage& FontFace::Image(std::uint32_t glyph) {
  auto found = images_.find(glyph);
  if (found != images_.end())
    return found->second;
  // The outline's coverage at the raster size, turned into a distance field
  // here: much faster than rendering the field from the outline directly.
  GlyphImage image;
  if (FT_Load_Glyph(ft_face_, glyph, FT_LOAD_NO_HINTING | FT_LOAD_NO_BITMAP) == 0 &&
      FT_Render_Glyph(ft_face_->glyph, FT_RENDER_MODE_NORMAL) == 0) {
    const FT_Bitmap& bitmap = ft_face_->glyph->bitmap;
    if (bitmap.width > 0 && bitmap.rows > 0 && bitmap.pitch > 0 &&
        bitmap.pixel_mode == FT_PIXEL_MODE_GRAY) {
      const DistanceField field =
          ComputeDistanceField(bitmap.buffer, static_cast<int>(bitmap.width),
                               static_cast<int>(bitmap.rows), bitmap.pitch, kSpreadPixels);
      image.slot = atlas_.Add(field.texels.data(), field.width, field.height, field.width);
      const auto px = static_cast<float>(kRasterPixelsPerEm);
      image.left = static_cast<float>(ft_face_->glyph->bitmap_left - kSpreadPixels) / px;
      image.top = static_cast<float>(ft_face_->glyph->bitmap_top + kSpreadPixels) / px;
      image.width = static_cast<float>(field.width) / px;
      image.height = static_cast<float>(field.height) / px;
    }
  }
  return images_.emplace(glyph, image).first->second;
}

}  // namespace Vexel::internal
