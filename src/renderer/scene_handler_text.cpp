// Scene handler: translated text objects, each with its inpainted patch
// under it, placed in the slot node of its index.
#include <algorithm>
#include <cmath>
#include <stdexcept>

#include "renderer/scene_handler.h"
#include "renderer/shader_sources.h"
#include "renderer/text_fitting.h"

namespace ocr_ar {
namespace {

// Texts drawn with this face are used as given, without the kit's
// normalisation: the face is a platform font the host binds for texts it has
// prepared itself (line breaks and spacing included).
constexpr const char* kUnnormalisedFont = "NotoSansCJK-Bold.ttc";

Vexel::Color ToKitColor(const Color& colour) {
  return Vexel::Color::fromBytes(colour.channel[0], colour.channel[1], colour.channel[2],
                                 colour.channel[3]);
}

// What SetTextObjectScale fits to the rectangle and PlaceText centres on it.
Vexel::Rect FittedBoxOf(const Vexel::Text& text) {
  return text_fit::FittedBox(text.getBoundingBox(), text.getLineInkBox(), text.getInkBounds());
}

Vexel::Vector3 ToVector3(const double* values) {
  return {static_cast<float>(values[0]), static_cast<float>(values[1]),
          static_cast<float>(values[2])};
}

}  // namespace

InpaintedTextObject& SceneHandler::UpdateOrCreateInpaintedTextObject(const std::string& text,
                                                                     const Color& colour, long id,
                                                                     const void* patchData,
                                                                     int patchWidth,
                                                                     int patchHeight) {
  const auto cached = reusable_text_cache_.find(text);
  if (cached != reusable_text_cache_.end()) {
    // Of several cached objects with this text, the one whose patch already
    // holds this id needs no upload.
    auto& candidates = cached->second;
    auto chosen = std::find_if(candidates.begin(), candidates.end(),
                               [id](const InpaintedTextObject& o) { return o.patch.id == id; });
    if (chosen == candidates.end())
      chosen = candidates.begin();
    auto& current = current_text_cache_[text];
    current.splice(current.end(), candidates, chosen);
    if (candidates.empty())
      reusable_text_cache_.erase(cached);
    InpaintedTextObject& object = current.back();
    if (object.text != nullptr)
      object.text->setColor(ToKitColor(colour));
    UpdateOrCreateInpaintedRectObject(object.patch, id, patchData, patchWidth, patchHeight);
    return object;
  }

  InpaintedTextObject object;
  object.text = std::make_unique<Vexel::Text>();
  if (font_ != nullptr)
    object.text->setFont(*font_);
  object.text->setText(text);
  if (font_ == nullptr || font_->getName() != kUnnormalisedFont)
    object.text->normalizeText();
  // An empty container: one line (normalised texts hold no line breaks),
  // centred on x = 0; SetTextObjectScale fits it to its rectangle.
  object.text->setContainerRect(Vexel::Rect());
  object.text->setHorizontalAlignment(Vexel::Text::ALIGN_CENTER);
  object.text->initialize();
  object.text->setColor(ToKitColor(colour));
  object.patch = CreateInpaintedRectObject(id, patchData, patchWidth, patchHeight);
  auto& current = current_text_cache_[text];
  current.push_back(std::move(object));
  return current.back();
}

void SceneHandler::DrawTextObject(unsigned int index, const std::string& text,
                                  const PositionScaleAngle& textPlacement, const Color& colour,
                                  long id, const void* patchData, const double* colorScale,
                                  const double* colorShift, int patchImageWidth,
                                  int patchImageHeight, const PositionScaleAngle& patchPlacement) {
  if (scene_ == nullptr)
    throw std::logic_error("SceneHandler::DrawTextObject: no scene");
  // Before the cache lookup: when no font is loaded yet this loads the
  // language's font, and loading a font retires every text object.
  EnsureFont();
  InpaintedTextObject& object = UpdateOrCreateInpaintedTextObject(
      text, colour, id, patchData, patchImageWidth, patchImageHeight);

  CreateInpaintedTextObjectNodes(index);
  Vexel::EmptyNode& slot = *text_nodes_[index];
  slot.removeAllChildren();
  Vexel::Node* root = scene_->getRootNode();
  if (slot.getParent() != root)
    slot.setParent(root);
  // The patch first: children draw in attachment order, the text over it.
  if (object.patch.object != nullptr) {
    PlacePatch(object.patch, patchPlacement, colorScale, colorShift);
    slot.addChild(object.patch.object.get());
  }
  if (object.text != nullptr) {
    PlaceText(*object.text, textPlacement);
    slot.addChild(object.text.get());
  }
  object.slot_index = index;
  unused_frame_counts_[object.text.get()] = 0;
}

void SceneHandler::PlacePatch(InpaintedRectObject& patch, const PositionScaleAngle& placement,
                              const double* colorScale, const double* colorShift) {
  Vexel::Object& quad = *patch.object;
  quad.setPosition(placement.x, placement.y, -kOverlayDepth);
  quad.setScale(placement.scale_x, placement.scale_y, 1.0f);
  quad.setRotation(Vexel::Degrees(placement.angle));
  if (Vexel::Material* material = quad.getMaterial(0)) {
    // Like the text colour, the patch is corrected only with both a scale
    // and a shift; otherwise it is drawn as delivered.
    const bool corrected = colorScale != nullptr && colorShift != nullptr;
    material->setShaderUniform(Vexel::Material::SHADER_FRAGMENT, shaders::kColorScale,
                               corrected ? ToVector3(colorScale) : Vexel::Vector3(1, 1, 1));
    material->setShaderUniform(Vexel::Material::SHADER_FRAGMENT, shaders::kColorShift,
                               corrected ? ToVector3(colorShift) : Vexel::Vector3(0, 0, 0));
  }
}

void SceneHandler::PlaceText(Vexel::Text& text, const PositionScaleAngle& placement) {
  SetTextObjectScale(text, Vexel::Vector2(placement.scale_x, placement.scale_y),
                     Vexel::Degrees(placement.angle));
  // Centred by its fitted ink box, so the baseline lands where the
  // original's stood (see text_fitting.h).
  const Vexel::Vector2 offset =
      text_fit::CentreOffset(FittedBoxOf(text), text.getScale().x, placement.angle);
  text.setPosition(placement.x - offset.x, placement.y - offset.y, -kOverlayDepth);
}

void SceneHandler::SetTextObjectScale(Vexel::Text& text, const Vexel::Vector2& size,
                                      const Vexel::Degrees& angle) {
  Vexel::Rect bounds = FittedBoxOf(text);
  const unsigned int gaps = text_fit::CountCharacterGaps(text.getText());
  const float spacing = text.getExtraSpaceBetweenChars();
  const float natural_width = bounds.width() - spacing * static_cast<float>(gaps);
  const float wanted = text_fit::ChooseExtraSpacing(natural_width, bounds.height(), gaps, size);
  if (std::fabs(wanted - spacing) > text_fit::kSpacingTolerance) {
    text.setExtraSpaceBetweenChars(wanted);
    bounds = FittedBoxOf(text);
  }
  // Scaled from the laid-out bounds, so whatever the spacing did the text
  // stays inside its rectangle.
  const float scale = text_fit::FitScale(bounds, size);
  text.setScale(scale, scale, 1.0f);
  text.setRotation(angle);
}

}  // namespace ocr_ar
