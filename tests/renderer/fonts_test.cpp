#include <gtest/gtest.h>

#include "recording_scene.h"

namespace ocr_ar {
namespace {

using testing::RecordingScene;
using vexel_recording::CountEntries;
using vexel_recording::LiveCount;

class FontsTest : public RecordingScene {
 protected:
  const Vexel::Font& Current() {
    const Vexel::Font* font = Handler().GetFont();
    EXPECT_NE(font, nullptr);
    return *font;
  }
};

TEST_F(FontsTest, BeforeInitTheLanguageIsOnlyStored) {
  SceneHandler::Instance()->SetTranslationLanguage("zh-CHS");
  EXPECT_EQ(SceneHandler::Instance()->GetTranslationLanguage(), "zh-CHS");
  EXPECT_EQ(SceneHandler::Instance()->GetFont(), nullptr);
  EXPECT_EQ(CountEntries("Font*"), 0);
}

TEST_F(FontsTest, DefaultFontsPerLanguageWithTheCjkReferenceCharacter) {
  SceneHandler& handler = Handler();
  handler.SetTranslationLanguage("de");
  EXPECT_EQ(Current().getName(), "NotoSansCJK-Regular.ttc");
  EXPECT_EQ(Current().getFileType(), Vexel::Font::FILE_TYPE_ASSET);
  EXPECT_TRUE(Current().isAntialiased());
  EXPECT_EQ(Current().getReferenceCharacter(), 0u);

  handler.SetTranslationLanguage("zh-CHS");
  EXPECT_EQ(Current().getName(), "NoriChinese-Medium.ttf");
  EXPECT_EQ(Current().getFileType(), Vexel::Font::FILE_TYPE_ASSET);
  EXPECT_EQ(Current().getReferenceCharacter(), 0xFF41u);

  handler.SetTranslationLanguage("ko");
  EXPECT_EQ(Current().getName(), "NotoSansCJK-Regular.ttc");
  EXPECT_EQ(Current().getReferenceCharacter(), 0xFF41u);
  EXPECT_EQ(LiveCount("Font"), 1);
}

TEST_F(FontsTest, TheSameDefaultFontIsNotBuiltAgainNorAreTextsCleared) {
  SceneHandler& handler = Handler();
  handler.SetTranslationLanguage("en");
  Draw(0, "Exit");
  handler.SetTranslationLanguage("en");
  // "ja" shares the default font: no new font, and no reference character
  // either (it is written only into a new font).
  handler.SetTranslationLanguage("ja");
  EXPECT_EQ(CountEntries("Font*"), 1);
  EXPECT_EQ(Current().getReferenceCharacter(), 0u);
  EXPECT_EQ(LiveCount("Text"), 1);
  EXPECT_EQ(handler.GetTranslationLanguage(), "ja");
}

TEST_F(FontsTest, SwitchingDefaultFontsClearsAllTexts) {
  SceneHandler& handler = Handler();
  handler.SetTranslationLanguage("en");
  Draw(0, "Exit");
  handler.SetTranslationLanguage("zh-CHS");
  EXPECT_EQ(LiveCount("Text"), 0);
  Draw(0, "出口");
  handler.SetTranslationLanguage("en");
  EXPECT_EQ(LiveCount("Text"), 0);
  EXPECT_EQ(Current().getName(), "NotoSansCJK-Regular.ttc");
}

TEST_F(FontsTest, MappedFontsReplaceTheCurrentOneWithoutClearing) {
  SceneHandler& handler = Handler();
  handler.SetTranslationLanguage("en");
  Draw(0, "Exit");
  handler.SetTranslationLanguageFont("en", "fonts/Custom.ttf");
  EXPECT_EQ(Current().getName(), "NotoSansCJK-Regular.ttc");  // not until the language is set
  handler.SetTranslationLanguage("en");
  EXPECT_EQ(Current().getName(), "fonts/Custom.ttf");
  EXPECT_EQ(Current().getFileType(), Vexel::Font::FILE_TYPE_ASSET);
  EXPECT_EQ(LiveCount("Text"), 1);  // the deliberate asymmetry

  handler.SetTranslationLanguageFont("en", "/system/fonts/Roboto-Regular.ttf");
  handler.SetTranslationLanguage("en");
  EXPECT_EQ(Current().getName(), "Roboto-Regular.ttf");
  EXPECT_EQ(Current().getFileType(), Vexel::Font::FILE_TYPE_SYSTEM);
  handler.SetTranslationLanguage("en");
  EXPECT_EQ(CountEntries("Font Roboto-Regular.ttf 1"), 1);
  EXPECT_EQ(LiveCount("Text"), 1);
}

TEST_F(FontsTest, ThePlatformPrefixCountsOnlyAtTheStart) {
  SceneHandler& handler = Handler();
  handler.SetTranslationLanguageFont("ko", "/data/system/fonts/Nanum.ttf");
  handler.SetTranslationLanguage("ko");
  EXPECT_EQ(Current().getName(), "/data/system/fonts/Nanum.ttf");
  EXPECT_EQ(Current().getFileType(), Vexel::Font::FILE_TYPE_ASSET);
  EXPECT_EQ(Current().getReferenceCharacter(), 0xFF41u);
}

TEST_F(FontsTest, MappingOverwritesTheEarlierPath) {
  SceneHandler& handler = *SceneHandler::Instance();
  handler.SetTranslationLanguageFont("de", "a.ttf");
  handler.SetTranslationLanguageFont("de", "b.ttf");
  EXPECT_EQ(handler.GetLanguageFonts().at("de"), "b.ttf");
  EXPECT_EQ(handler.GetLanguageFonts().size(), 1u);
}

TEST_F(FontsTest, DefaultFontAgainWhenTheMappedFontIsCurrent) {
  SceneHandler& handler = Handler();
  handler.SetTranslationLanguageFont("de", "Fraktur.ttf");
  handler.SetTranslationLanguage("de");
  Draw(0, "Ausgang");
  handler.SetTranslationLanguageUseDefaultFont("de");
  EXPECT_TRUE(handler.GetLanguageFonts().empty());
  EXPECT_EQ(Current().getName(), "NotoSansCJK-Regular.ttc");
  EXPECT_EQ(LiveCount("Text"), 0);
  EXPECT_EQ(LiveCount("Font"), 1);
}

TEST_F(FontsTest, DefaultFontRequestOnlyRemovesAnEntryThatIsNotCurrent) {
  SceneHandler& handler = Handler();
  handler.SetTranslationLanguage("en");
  Draw(0, "Exit");
  handler.SetTranslationLanguageFont("de", "Fraktur.ttf");
  handler.SetTranslationLanguageUseDefaultFont("de");
  EXPECT_TRUE(handler.GetLanguageFonts().empty());
  EXPECT_EQ(Current().getName(), "NotoSansCJK-Regular.ttc");
  EXPECT_EQ(LiveCount("Text"), 1);
  handler.SetTranslationLanguageUseDefaultFont("fr");  // no entry: nothing
  EXPECT_EQ(CountEntries("Font*"), 1);
}

TEST_F(FontsTest, PlatformFontNameNeverMatchesItsPrefixedPath) {
  // The whole-path comparison keeps a platform font current after its entry
  // is removed: its name lacks the prefix.
  SceneHandler& handler = Handler();
  handler.SetTranslationLanguageFont("en", "/system/fonts/Roboto-Regular.ttf");
  handler.SetTranslationLanguage("en");
  handler.SetTranslationLanguageUseDefaultFont("en");
  EXPECT_TRUE(handler.GetLanguageFonts().empty());
  EXPECT_EQ(Current().getName(), "Roboto-Regular.ttf");
}

TEST_F(FontsTest, AFontThatFailsToLoadKeepsTheCurrentOneAndPropagates) {
  SceneHandler& handler = Handler();
  handler.SetTranslationLanguage("en");
  handler.SetTranslationLanguageFont("en", "missing.ttf");
  vexel_recording::FailOn("Font");
  EXPECT_THROW(handler.SetTranslationLanguage("en"), Vexel::Exception);
  EXPECT_EQ(Current().getName(), "NotoSansCJK-Regular.ttc");
}

TEST_F(FontsTest, TextsGetTheDefaultFontWhenNoLanguageWasChosen) {
  SceneHandler& handler = Handler();
  Draw(0, "Exit");
  EXPECT_EQ(Current().getName(), "NotoSansCJK-Regular.ttc");
  const Vexel::Text& text = *handler.GetCurrentTextCache().at("Exit").front().text;
  EXPECT_EQ(vexel_recording::NodeState(text).font_name, "NotoSansCJK-Regular.ttc");
}

}  // namespace
}  // namespace ocr_ar
