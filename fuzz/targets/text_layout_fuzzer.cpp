// The kit's text handling on arbitrary bytes taken as UTF-8: decoding,
// normalising for display, and shaping and laying out lines (bidirectional
// runs, combining marks, line breaking in a container, alignment, extra
// spacing) with a Latin, an Arabic and a CJK face. Nothing may throw.
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <string>

#include "font_face.h"
#include "support/fuzz_input.h"
#include "text_layout.h"
#include "unicode_text.h"

namespace {

using Vexel::internal::FontFace;

// Loaded once: a face is shared by every text that uses it.
const FontFace& Face(int index) {
  static const std::shared_ptr<FontFace> faces[] = {
      FontFace::Load("DejaVuSans.ttf", Vexel::Font::FILE_TYPE_SYSTEM, nullptr),
      FontFace::Load("NotoSansArabic-Regular.ttf", Vexel::Font::FILE_TYPE_SYSTEM, nullptr),
      FontFace::Load("NotoSansCJK-Regular.ttc", Vexel::Font::FILE_TYPE_SYSTEM, nullptr),
  };
  return *faces[index % 3];
}

void CheckLayout(const Vexel::internal::TextLayout& layout) {
  for (const Vexel::internal::PlacedGlyph& glyph : layout.glyphs) {
    if (!std::isfinite(glyph.x) || !std::isfinite(glyph.y))
      std::abort();
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  ocr_fuzz::FuzzInput in(data, size);
  const FontFace& face = Face(in.Byte());
  Vexel::internal::LayoutParams params;
  const std::uint8_t width = in.Byte();
  // No container (no wrapping), or one from a fraction of an em to 60 ems.
  if (width != 0)
    params.container = Vexel::Rect(0.0f, 0.0f, width / 4.0f, -1.0f);
  params.alignment = static_cast<Vexel::Text::HorizontalAlignment>(in.Byte() % 3);
  params.extra_spacing = static_cast<std::int8_t>(in.Byte()) / 64.0f;
  // The fullwidth "a" is the reference character of CJK texts.
  params.line = in.Bool() ? face.ReferenceLineMetrics(0xFF41) : face.DefaultLineMetrics();
  // Long texts without long inputs: now and then the bytes are repeated, up
  // to 8 KB (longer texts only cost time: the layout is linear).
  constexpr std::size_t kMaxBytes = 8192;
  const int copies = in.Byte() == 0 ? 1 + in.Byte() % 64 : 1;
  std::string bytes = in.Rest();
  const std::string once = bytes;
  for (int i = 1; i < copies && bytes.size() + once.size() <= kMaxBytes; ++i)
    bytes += once;

  const std::u32string decoded = Vexel::internal::DecodeUtf8(bytes);
  // Decoding what was encoded changes nothing.
  if (Vexel::internal::DecodeUtf8(Vexel::internal::EncodeUtf8(decoded)) != decoded)
    std::abort();
  CheckLayout(Vexel::internal::LayOutText(decoded, face, params));
  const std::u32string shown = Vexel::internal::NormalizeForDisplay(decoded);
  CheckLayout(Vexel::internal::LayOutText(shown, face, params));
  return 0;
}
