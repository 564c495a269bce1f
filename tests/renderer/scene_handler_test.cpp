#include <gtest/gtest.h>

#include "common/log.h"
#include "recording_scene.h"

namespace ocr_ar::testing {
namespace {

using SceneHandlerTest = RecordingScene;

// The fonts built so far: "Font <name> <file type> <antialiased>".
std::vector<std::string> FontsMade() {
  std::vector<std::string> fonts;
  for (const std::string& entry : Journal()) {
    if (entry.rfind("Font ", 0) == 0)
      fonts.push_back(entry);
  }
  return fonts;
}

TEST_F(SceneHandlerTest, InstanceIsASingletonRebuiltFreshAfterDelete) {
  SceneHandler* first = SceneHandler::Instance();
  EXPECT_EQ(SceneHandler::Instance(), first);
  first->SetTranslationLanguage("ja");
  first->SetTranslationLanguageFont("de", "x.ttf");
  SceneHandler::DeleteInstance();
  SceneHandler::DeleteInstance();  // harmless twice
  SceneHandler* fresh = SceneHandler::Instance();
  EXPECT_EQ(fresh->GetTranslationLanguage(), "");
  EXPECT_TRUE(fresh->GetLanguageFonts().empty());
  std::vector<float> corners(4);
  fresh->GetBackgroundRectCorners(&corners[0], &corners[1], &corners[2], &corners[3]);
  EXPECT_EQ(corners, std::vector<float>(4, 1.0f));
}

TEST_F(SceneHandlerTest, InitBuildsKitRendererSceneCameraThenAppliesTheStoredLanguage) {
  SceneHandler::Instance()->SetTranslationLanguage("ja");  // stored only
  EXPECT_TRUE(Journal().empty());
  const std::vector<std::string> order = {"Kit Vexel.log",
                                          "Renderer 0",
                                          "Scene",
                                          "Camera",
                                          "Camera.setOrthographicWindowSize 640 480",
                                          "Font NotoSansCJK-Regular.ttc 2 true"};
  Handler();
  EXPECT_EQ(Journal(), order);
  EXPECT_EQ(Handler().GetFont()->getReferenceCharacter(), 0xFF41u);
  EXPECT_EQ(Handler().GetCamera()->getParent(), Root());
}

TEST_F(SceneHandlerTest, DestructionGoesChildrenFirstThenSceneRendererKit) {
  Handler().CreateBackground(640, 480, 0, -1, 1, 1, -1);
  Draw(0, "Hallo", 1);
  Journal().clear();
  SceneHandler::DeleteInstance();
  int at = 0;
  for (const char* entry : {"~Text", "~Camera", "~Material", "~Texture RenderTexture",
                            "~Mesh BackgroundRectMesh", "~Font NotoSansCJK-Regular.ttc 2 true",
                            "~Mesh InpaintedRectMesh", "~Scene", "~Renderer 0", "~Kit Vexel.log"}) {
    const int found = FindEntry(entry, at);
    ASSERT_GE(found, 0) << entry << " missing or out of order";
    at = found + 1;
  }
  for (const char* type : {"Kit", "Renderer", "Scene", "Camera", "Texture", "Material", "Mesh",
                           "Object", "Font", "Text"}) {
    EXPECT_EQ(LiveCount(type), 0) << type;
  }
}

TEST_F(SceneHandlerTest, AnUnusedTextIsKeptFor249PassesAndRetiredOnThe250th) {
  Draw(0, "Ausgang", 5, true);
  const Vexel::Text* text = Current("Ausgang").text.get();
  Handler().UpdateTextObjectCache();
  for (int pass = 1; pass <= 249; ++pass)
    Handler().ClearTextObjects(0, false);
  ASSERT_EQ(Cached("Ausgang"), 1u);
  EXPECT_EQ(Handler().GetUnusedFrameCount(text), 249);
  EXPECT_EQ(LiveCount("Text"), 1);

  Handler().ClearTextObjects(0, false);
  EXPECT_EQ(Handler().GetReusableTextCache().count("Ausgang"), 0u);  // the key goes too
  EXPECT_EQ(Handler().GetUnusedFrameCount(text), -1);
  for (const char* type : {"Text", "Texture", "Object", "Material"})
    EXPECT_EQ(LiveCount(type), 0) << type;
}

TEST_F(SceneHandlerTest, ForcedClearingRetiresAtOnceAllButTheDrawnSlots) {
  Draw(0, "eins");
  Draw(1, "zwei");
  Handler().UpdateTextObjectCache();
  Handler().ClearTextObjects(1, true);  // slot 0 counts as drawn
  EXPECT_EQ(Cached("eins"), 1u);
  EXPECT_EQ(Cached("zwei"), 0u);
  EXPECT_EQ(LiveCount("Text"), 1);

  // Clearing all detaches every slot, keeping the current frame's texts
  // cached; forced, it retires them too.
  Draw(1, "drei");
  Handler().ClearAllTextObjects(false);
  EXPECT_EQ(Cached("drei"), 1u);
  EXPECT_EQ(Slot(0)->getParent(), nullptr);
  EXPECT_EQ(Slot(1)->getParent(), nullptr);
  Draw(0, "eins");
  Handler().ClearAllTextObjects(true);
  EXPECT_TRUE(Handler().GetCurrentTextCache().empty());
  EXPECT_TRUE(Handler().GetReusableTextCache().empty());
  EXPECT_EQ(LiveCount("Text"), 0);
}

TEST_F(SceneHandlerTest, ClearingAllCatchesLogsAndReturns) {
  ocr::log::ScopedCapture log;
  Handler().ClearAllTextObjects(true);  // nothing to clear: nothing logged
  Draw(0, "eins");
  vexel_recording::Failures() = {"Node.removeChild"};
  Handler().ClearAllTextObjects(true);
  ASSERT_EQ(log.Texts(),
            std::vector<std::string>{"SceneHandler: caught exception in ClearAllTextObjects."});
  EXPECT_EQ(log.Records()[0].priority, ocr::log::kError);
}

TEST_F(SceneHandlerTest, DefaultFontsAreBuiltOnlyWhenTheLanguageNeedsAnotherOne) {
  Handler().SetTranslationLanguage("en");
  Draw(0, "Exit");
  Handler().SetTranslationLanguage("en");
  Handler().SetTranslationLanguage("ja");  // the same default font: kept, texts too
  EXPECT_EQ(LiveCount("Text"), 1);
  EXPECT_EQ(Handler().GetFont()->getReferenceCharacter(), 0u);  // only a new font gets it
  Handler().SetTranslationLanguage("zh-CHS");  // another font: every text retired first
  EXPECT_EQ(LiveCount("Text"), 0);
  EXPECT_EQ(Handler().GetFont()->getReferenceCharacter(), 0xFF41u);
  Draw(0, "出口");
  Handler().SetTranslationLanguage("ko");
  EXPECT_EQ(LiveCount("Text"), 0);
  EXPECT_EQ(FontsMade(), (std::vector<std::string>{"Font NotoSansCJK-Regular.ttc 2 true",
                                                   "Font NoriChinese-Medium.ttf 2 true",
                                                   "Font NotoSansCJK-Regular.ttc 2 true"}));
  EXPECT_EQ(LiveCount("Font"), 1);
}

TEST_F(SceneHandlerTest, MappedFontsReplaceTheCurrentOneWithoutClearingTexts) {
  Handler().SetTranslationLanguage("en");
  Draw(0, "Exit");
  const std::pair<const char*, const char*> cases[] = {
      {"fonts/Custom.ttf", "Font fonts/Custom.ttf 2 true"},
      {"/system/fonts/Roboto-Regular.ttf", "Font Roboto-Regular.ttf 1 true"},
      {"/data/system/fonts/Nanum.ttf", "Font /data/system/fonts/Nanum.ttf 2 true"}};
  for (const auto& [path, font] : cases) {
    Handler().SetTranslationLanguageFont("en", path);
    EXPECT_NE(FontsMade().back(), font);  // not before the language is set again
    Handler().SetTranslationLanguage("en");
    Handler().SetTranslationLanguage("en");  // the same font again: not rebuilt
    EXPECT_EQ(FontsMade().back(), font);
  }
  EXPECT_EQ(FontsMade().size(), 4u);
  EXPECT_EQ(LiveCount("Text"), 1);  // never cleared, unlike a change of default font

  // Back to the default font: only the entry goes unless the mapped font is
  // current (a platform font's name lacks its path's prefix: never current).
  Handler().SetTranslationLanguageFont("de", "/system/fonts/Roboto-Regular.ttf");
  Handler().SetTranslationLanguage("de");
  Handler().SetTranslationLanguageUseDefaultFont("de");
  Handler().SetTranslationLanguageUseDefaultFont("fr");  // no entry
  EXPECT_EQ(Handler().GetFont()->getName(), "Roboto-Regular.ttf");
  EXPECT_EQ(LiveCount("Text"), 1);
  Handler().SetTranslationLanguage("en");
  Handler().SetTranslationLanguageUseDefaultFont("en");
  EXPECT_TRUE(Handler().GetLanguageFonts().empty());
  EXPECT_EQ(Handler().GetFont()->getName(), "NotoSansCJK-Regular.ttc");
  EXPECT_EQ(LiveCount("Text"), 0);
}

TEST_F(SceneHandlerTest, TextsAreNormalisedExceptInTheBoldCjkFace) {
  Draw(0, "Exit");
  Handler().SetTranslationLanguageFont("ja", "/system/fonts/NotoSansCJK-Bold.ttc");
  Handler().SetTranslationLanguage("ja");
  Draw(1, "非常口");
  EXPECT_EQ(CountEntries("Text.normalizeText"), 1);
  EXPECT_EQ(Handler().GetFont()->getReferenceCharacter(), 0xFF41u);
}

}  // namespace
}  // namespace ocr_ar::testing
