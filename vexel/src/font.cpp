#include "access.h"
#include "font_impl.h"
#include "kit_impl.h"

namespace Vexel {

Font::Font(const std::string& name, FileType fileType, bool antialiased)
    : impl_(std::make_shared<Impl>()) {
  // Only assets need a kit (its asset manager); the kit's log is used when
  // there is one.
  std::shared_ptr<Kit::Impl> kit = fileType == FILE_TYPE_ASSET || Kit::getCurrent() != nullptr
                                       ? internal::CurrentKit("a font asset")
                                       : nullptr;
  impl_->name = name;
  impl_->file_type = fileType;
  impl_->antialiased = antialiased;
  try {
    impl_->face = internal::FontFace::Load(name, fileType, kit ? kit->assets : nullptr);
  } catch (const Exception& error) {
    if (kit)
      kit->log.Write(internal::KitLog::kError, error.what());
    throw;
  }
  if (kit)
    kit->log.Write(internal::KitLog::kInfo, "Vexel: font \"" + name + "\" loaded");
}

Font::~Font() = default;

const std::string& Font::getName() const {
  return impl_->name;
}

Font::FileType Font::getFileType() const {
  return impl_->file_type;
}

bool Font::isAntialiased() const {
  return impl_->antialiased;
}

void Font::setReferenceCharacter(std::uint32_t codepoint) {
  impl_->reference_character = codepoint;
}

std::uint32_t Font::getReferenceCharacter() const {
  return impl_->reference_character;
}

}  // namespace Vexel
