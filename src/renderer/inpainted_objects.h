#pragma once

#include <limits>
#include <memory>

#include "vexel/Object.h"
#include "vexel/Text.h"
#include "vexel/Texture.h"

namespace ocr_ar {

// Destroys a patch object together with the material it was given (each
// patch has its own material; the object does not own it).
struct PatchObjectDeleter {
  void operator()(Vexel::Object* object) const;
};
using PatchObjectPtr = std::unique_ptr<Vexel::Object, PatchObjectDeleter>;

// The inpainted patch under one translated text: a quad on the shared
// unit-square mesh, the patch image, and the id of the content now in the
// texture (-1 when none).
struct InpaintedRectObject {
  PatchObjectPtr object;
  std::unique_ptr<Vexel::Texture> texture;
  long id = -1;
};

// Slot index of an object that is not (or no longer) placed in a slot.
inline constexpr unsigned int kRetiredSlotIndex = std::numeric_limits<unsigned int>::max();

// One translated text with the patch under it: the element of both text
// caches.
struct InpaintedTextObject {
  std::unique_ptr<Vexel::Text> text;  // may be null
  unsigned int slot_index = kRetiredSlotIndex;
  InpaintedRectObject patch;
};

}  // namespace ocr_ar
