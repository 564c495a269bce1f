// Scene handler: the current font, chosen by translation language.
//
// Languages without a font of their own get a default font from the assets,
// and switching to it first retires every text object (they were laid out
// with the old font). A font bound to the language by the host replaces the
// current one without that clearing: text objects still cached keep the
// font they were built with until they are retired. The asymmetry is
// deliberate.
#include <cstdint>
#include <memory>

#include "renderer/scene_handler.h"

namespace ocr_ar {
namespace {

constexpr const char* kDefaultFont = "NotoSansCJK-Regular.ttc";
constexpr const char* kSimplifiedChineseFont = "NoriChinese-Medium.ttf";
constexpr const char* kSimplifiedChinese = "zh-CHS";
// A host font path starting with this names a platform font by file name.
const std::string kPlatformFontPrefix = "/system/fonts/";
// U+FF41 (fullwidth small a): with it as reference character, lines of CJK
// text get the height of the ideographic em box instead of the font's tall
// vertical-layout ascender.
constexpr std::uint32_t kCjkReferenceCharacter = 0xFF41;

bool IsCjk(const std::string& language) {
  return language == "ja" || language == "ko" || language == kSimplifiedChinese;
}

}  // namespace

void SceneHandler::SetTranslationLanguageFont(const std::string& language,
                                              const std::string& fontPath) {
  language_fonts_[language] = fontPath;
}

void SceneHandler::SetTranslationLanguage(const std::string& language) {
  translation_language_ = language;
  if (kit_ == nullptr || scene_ == nullptr)
    return;  // applied by Init

  const auto mapped = language_fonts_.find(language);
  if (mapped == language_fonts_.end()) {
    const char* name = language == kSimplifiedChinese ? kSimplifiedChineseFont : kDefaultFont;
    if (font_ != nullptr && font_->getName() == name)
      return;
    ClearAllTextObjects(true);
    ReplaceFont(std::make_unique<Vexel::Font>(name, Vexel::Font::FILE_TYPE_ASSET, true), language);
    return;
  }

  const std::string& path = mapped->second;
  if (path.compare(0, kPlatformFontPrefix.size(), kPlatformFontPrefix) == 0) {
    const std::string name = path.substr(kPlatformFontPrefix.size());
    if (font_ != nullptr && font_->getName() == name)
      return;
    ReplaceFont(std::make_unique<Vexel::Font>(name, Vexel::Font::FILE_TYPE_SYSTEM, true), language);
    return;
  }
  if (font_ != nullptr && font_->getName() == path)
    return;
  ReplaceFont(std::make_unique<Vexel::Font>(path, Vexel::Font::FILE_TYPE_ASSET, true), language);
}

void SceneHandler::ReplaceFont(std::unique_ptr<Vexel::Font> font, const std::string& language) {
  font_ = std::move(font);
  if (IsCjk(language))
    font_->setReferenceCharacter(kCjkReferenceCharacter);
}

void SceneHandler::SetTranslationLanguageUseDefaultFont(const std::string& language) {
  const auto mapped = language_fonts_.find(language);
  if (mapped == language_fonts_.end())
    return;
  const std::string path = mapped->second;
  language_fonts_.erase(mapped);
  if (font_ == nullptr || font_->getName() != path)
    return;  // the entry is gone, the current font stays
  ClearAllTextObjects(true);
  font_.reset();
  SetTranslationLanguage(language);
}

void SceneHandler::EnsureFont() {
  // A host that never chose a language still gets its texts drawn, in the
  // default font.
  if (font_ == nullptr)
    SetTranslationLanguage(translation_language_);
}

}  // namespace ocr_ar
