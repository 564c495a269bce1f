#include <algorithm>
#include <array>

#include "access.h"
#include "draw_context.h"
#include "font_impl.h"
#include "node_impl.h"
#include "program.h"
#include "text_layout.h"
#include "unicode_text.h"
#include "vexel/Text.h"

namespace Vexel {
namespace {

using internal::GlObject;
using internal::Matrix4;

// Glyph quads sample a distance field: 128 is the outline, every 16 levels
// one raster pixel further in (above) or out (below). The coverage of a
// screen pixel follows from how many screen pixels a raster pixel spans.
constexpr const char* kTextVertex =
    "#version 100\n"
    "attribute vec2 position; attribute vec2 uv0; uniform mat4 worldViewProj;\n"
    "varying vec2 uv;\n"
    "void main() { uv = uv0; gl_Position = worldViewProj * vec4(position, 0.0, 1.0); }\n";
constexpr const char* kTextFragment =
    "#version 100\n"
    "precision mediump float;\n"
    "uniform sampler2D glyphs; uniform vec4 color; uniform float distanceScale;\n"
    "varying vec2 uv;\n"
    "void main() {\n"
    "  float distance = texture2D(glyphs, uv).r - 128.0 / 255.0;\n"
    "  float coverage = clamp(distance * distanceScale + 0.5, 0.0, 1.0);\n"
    "  gl_FragColor = vec4(color.rgb, color.a * coverage);\n"
    "}\n";

constexpr float kLevelsPerRasterPixel = 16.0f;
// Glyph quads use 16-bit indices: 4 vertices a glyph.
constexpr std::size_t kMaxGlyphs = 65536 / 4;

class TextImpl : public Node::Impl {
 public:
  void Invalidate() { layout_dirty = true; }
  void EnsureLayout();
  void Draw(const Matrix4& world, internal::DrawContext& context) override;

  std::shared_ptr<Font::Impl> font;
  std::string text;
  Rect container;
  Text::HorizontalAlignment alignment = Text::ALIGN_LEFT;
  float extra_spacing = 0.0f;
  Color color{0.0f, 0.0f, 0.0f, 1.0f};

  bool layout_dirty = true;
  std::uint32_t laid_out_reference = 0;
  internal::TextLayout layout;
  Rect line_ink;

  // Glyph quads grouped by atlas page: x, y, u, v per vertex.
  struct Batch {
    int page;
    std::size_t first_index;
    std::size_t index_count;
  };
  std::vector<float> vertices;
  std::vector<std::uint16_t> indices;
  std::vector<Batch> batches;
  bool buffers_dirty = true;
  std::shared_ptr<GlObject> vertex_buffer;
  std::shared_ptr<GlObject> index_buffer;
  std::shared_ptr<internal::Program> program;
};

void TextImpl::EnsureLayout() {
  const std::uint32_t reference = font ? font->reference_character : 0;
  if (!layout_dirty && reference == laid_out_reference)
    return;
  layout_dirty = false;
  laid_out_reference = reference;
  layout = internal::TextLayout();
  line_ink = Rect();
  vertices.clear();
  indices.clear();
  batches.clear();
  buffers_dirty = true;
  if (!font || text.empty())
    return;
  internal::FontFace& face = *font->face;
  internal::LayoutParams params;
  params.container = container;
  params.alignment = alignment;
  params.extra_spacing = extra_spacing;
  params.line = face.ReferenceLineMetrics(reference);
  const std::u32string characters = internal::DecodeUtf8(text);
  layout = internal::LayOutText(characters, face, params);
  if (layout.line_count > 0) {
    const internal::DesignInk& design = face.design_ink();
    const bool ideographic = reference != 0 && face.HasCharacter(reference) && design.has_ideograph;
    const bool descends =
        std::any_of(characters.begin(), characters.end(), internal::IsSmallOrCaselessLetter);
    const float top = ideographic ? design.ideograph_top
                      : descends  ? design.ascender
                                  : design.capital;
    const float bottom = ideographic ? design.ideograph_bottom : descends ? design.descender : 0.0f;
    line_ink = Rect(layout.bounds.left, layout.first_baseline + top, layout.bounds.right,
                    layout.last_baseline + bottom);
  }

  struct Quad {
    int page;
    std::array<float, 16> vertex;
  };
  std::vector<Quad> quads;
  for (const internal::PlacedGlyph& placed : layout.glyphs) {
    if (quads.size() == kMaxGlyphs)
      break;
    const internal::GlyphImage& image = face.Image(placed.glyph);
    if (image.slot.page < 0)
      continue;
    const float left = placed.x + image.left;
    const float top = placed.y + image.top;
    const float right = left + image.width;
    const float bottom = top - image.height;
    const internal::AtlasSlot& s = image.slot;
    quads.push_back(Quad{s.page,
                         {left, top, s.u0, s.v0, right, top, s.u1, s.v0, left, bottom, s.u0, s.v1,
                          right, bottom, s.u1, s.v1}});
  }
  std::stable_sort(quads.begin(), quads.end(),
                   [](const Quad& a, const Quad& b) { return a.page < b.page; });
  for (std::size_t i = 0; i < quads.size(); ++i) {
    if (batches.empty() || batches.back().page != quads[i].page)
      batches.push_back(Batch{quads[i].page, indices.size(), 0});
    vertices.insert(vertices.end(), quads[i].vertex.begin(), quads[i].vertex.end());
    const auto base = static_cast<std::uint16_t>(i * 4);
    for (std::uint16_t corner : {0, 1, 2, 2, 1, 3})
      indices.push_back(static_cast<std::uint16_t>(base + corner));
    batches.back().index_count += 6;
  }
}

void TextImpl::Draw(const Matrix4& world, internal::DrawContext& context) {
  EnsureLayout();
  if (batches.empty() || color.a <= 0.0f)
    return;
  if (!program) {
    program = internal::Gpu::Acquire()->GetProgram("VexelTextVertexShader", kTextVertex,
                                                   "VexelTextFragmentShader", kTextFragment);
  }
  if (buffers_dirty) {
    if (!vertex_buffer) {
      vertex_buffer = std::make_shared<GlObject>(internal::Gpu::Acquire(), GlObject::kBuffer);
      index_buffer = std::make_shared<GlObject>(internal::Gpu::Acquire(), GlObject::kBuffer);
    }
    glBindBuffer(GL_ARRAY_BUFFER, vertex_buffer->id());
    glBufferData(GL_ARRAY_BUFFER, static_cast<GLsizeiptr>(vertices.size() * sizeof(float)),
                 vertices.data(), GL_STATIC_DRAW);
    glBindBuffer(GL_ELEMENT_ARRAY_BUFFER, index_buffer->id());
    glBufferData(GL_ELEMENT_ARRAY_BUFFER,
                 static_cast<GLsizeiptr>(indices.size() * sizeof(std::uint16_t)), indices.data(),
                 GL_STATIC_DRAW);
    buffers_dirty = false;
  }
  const Matrix4 world_view_projection = context.view_projection * world;
  const float pixels_per_em = internal::PixelsPerUnit(world_view_projection, context);
  const float distance_scale = font->antialiased
                                   ? 255.0f / kLevelsPerRasterPixel * pixels_per_em /
                                         static_cast<float>(internal::FontFace::kRasterPixelsPerEm)
                                   : 1.0e4f;

  glUseProgram(program->id());
  if (const auto* u = program->uniform("worldViewProj"))
    glUniformMatrix4fv(u->location, 1, GL_FALSE, world_view_projection.m.data());
  if (const auto* u = program->uniform("color"))
    glUniform4f(u->location, color.r, color.g, color.b, color.a);
  if (const auto* u = program->uniform("distanceScale"))
    glUniform1f(u->location, distance_scale);
  if (const auto* u = program->uniform("glyphs"))
    glUniform1i(u->location, 0);
  internal::RenderState state;
  state.blend = internal::RenderState::kAlpha;
  state.depth_write = false;
  internal::ApplyRenderState(state);

  const GLint position_stream = program->attribute("position");
  const GLint uv = program->attribute("uv0");
  glBindBuffer(GL_ARRAY_BUFFER, vertex_buffer->id());
  glBindBuffer(GL_ELEMENT_ARRAY_BUFFER, index_buffer->id());
  glEnableVertexAttribArray(static_cast<GLuint>(position_stream));
  glVertexAttribPointer(static_cast<GLuint>(position_stream), 2, GL_FLOAT, GL_FALSE,
                        4 * sizeof(float), nullptr);
  glEnableVertexAttribArray(static_cast<GLuint>(uv));
  glVertexAttribPointer(static_cast<GLuint>(uv), 2, GL_FLOAT, GL_FALSE, 4 * sizeof(float),
                        reinterpret_cast<const void*>(2 * sizeof(float)));
  for (const Batch& batch : batches) {
    font->face->atlas().Bind(batch.page, 0);
    glDrawElements(GL_TRIANGLES, static_cast<GLsizei>(batch.index_count), GL_UNSIGNED_SHORT,
                   reinterpret_cast<const void*>(batch.first_index * sizeof(std::uint16_t)));
  }
  glDisableVertexAttribArray(static_cast<GLuint>(position_stream));
  glDisableVertexAttribArray(static_cast<GLuint>(uv));
  glBindBuffer(GL_ARRAY_BUFFER, 0);
  glBindBuffer(GL_ELEMENT_ARRAY_BUFFER, 0);
}

TextImpl& Of(const Text& text) {
  return static_cast<TextImpl&>(internal::Access::ImplOf<Node>(text));
}

}  // namespace

Text::Text() : Node(std::make_unique<TextImpl>()) {}
Text::~Text() = default;

void Text::setFont(const Font& font) {
  Of(*this).font = internal::Access::SharedImplOf(font);
  Of(*this).Invalidate();
}

void Text::setText(const std::string& utf8) {
  Of(*this).text = utf8;
  Of(*this).Invalidate();
}

const std::string& Text::getText() const {
  return Of(*this).text;
}

void Text::normalizeText() {
  TextImpl& t = Of(*this);
  t.text = internal::EncodeUtf8(internal::NormalizeForDisplay(internal::DecodeUtf8(t.text)));
  t.Invalidate();
}

void Text::setContainerRect(const Rect& rect) {
  Of(*this).container = rect;
  Of(*this).Invalidate();
}

Rect Text::getContainerRect() const {
  return Of(*this).container;
}

void Text::setHorizontalAlignment(HorizontalAlignment alignment) {
  if (alignment < ALIGN_LEFT || alignment > ALIGN_RIGHT) {
    throw Exception("Vexel: unknown horizontal alignment " +
                    std::to_string(static_cast<int>(alignment)));
  }
  Of(*this).alignment = alignment;
  Of(*this).Invalidate();
}

Text::HorizontalAlignment Text::getHorizontalAlignment() const {
  return Of(*this).alignment;
}

void Text::setExtraSpaceBetweenChars(float textUnits) {
  Of(*this).extra_spacing = textUnits;
  Of(*this).Invalidate();
}

float Text::getExtraSpaceBetweenChars() const {
  return Of(*this).extra_spacing;
}

void Text::setColor(const Color& color) {
  Of(*this).color = color;
}

Color Text::getColor() const {
  return Of(*this).color;
}

void Text::initialize() {
  Of(*this).EnsureLayout();
}

Rect Text::getBoundingBox() const {
  TextImpl& t = Of(*this);
  t.EnsureLayout();
  return t.layout.bounds;
}

Rect Text::getInkBounds() const {
  TextImpl& t = Of(*this);
  t.EnsureLayout();
  return t.layout.ink;
}

Rect Text::getLineInkBox() const {
  TextImpl& t = Of(*this);
  t.EnsureLayout();
  return t.line_ink;
}

std::size_t Text::getLineCount() const {
  TextImpl& t = Of(*this);
  t.EnsureLayout();
  return t.layout.line_count;
}

}  // namespace Vexel
