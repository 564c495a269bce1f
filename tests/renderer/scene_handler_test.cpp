#include <gtest/gtest.h>

#include "common/log.h"
#include "recording_scene.h"

namespace ocr_ar {
namespace {

using testing::RecordingScene;
using vexel_recording::CountEntries;
using vexel_recording::FindEntry;
using vexel_recording::LiveCount;
using vexel_recording::NodeState;

class SceneHandlerTest : public RecordingScene {};

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
  EXPECT_TRUE(fresh->GetCurrentTextCache().empty());
  EXPECT_TRUE(fresh->GetReusableTextCache().empty());
  EXPECT_FALSE(fresh->HasRenderer());
  EXPECT_EQ(fresh->GetFont(), nullptr);
}

TEST_F(SceneHandlerTest, BackgroundCornersStartAtOne) {
  float l = 0, t = 0, r = 0, b = 0;
  SceneHandler::Instance()->GetBackgroundRectCorners(&l, &t, &r, &b);
  EXPECT_EQ(l, 1.0f);
  EXPECT_EQ(t, 1.0f);
  EXPECT_EQ(r, 1.0f);
  EXPECT_EQ(b, 1.0f);
  SceneHandler::Instance()->SetBackgroundRectCorners(-1.0f, 0.5f, 1.0f, -0.5f);
  SceneHandler::Instance()->GetBackgroundRectCorners(&l, &t, &r, &b);
  EXPECT_EQ(t, 0.5f);
  EXPECT_EQ(b, -0.5f);
}

TEST_F(SceneHandlerTest, InitBuildsKitRendererSceneAndOrthographicCamera) {
  SceneHandler& handler = Handler();
  const std::vector<std::string> order = {"Kit Vexel.log",
                                          "Renderer 0",
                                          "Scene",
                                          "Scene.setBackgroundColor",
                                          "Scene.setShadowEnabled false",
                                          "Camera",
                                          "Camera.setProjectionMode 1",
                                          "Renderer.setScene"};
  EXPECT_EQ(vexel_recording::Journal(), order);

  EXPECT_EQ(handler.GetScene()->getBackgroundColor(), Vexel::Color(0, 0, 0, 0));
  Vexel::Camera& camera = *handler.GetCamera();
  EXPECT_EQ(camera.getParent(), Root(handler));
  EXPECT_EQ(camera.getProjectionMode(), Vexel::PROJECTION_ORTHOGRAPHIC);
  EXPECT_EQ(camera.getOrthographicWindowWidth(), 640.0f);
  EXPECT_EQ(camera.getOrthographicWindowHeight(), 480.0f);
  EXPECT_FALSE(camera.isAutomaticAspectRatio());
  EXPECT_EQ(camera.getNearClipDistance(), 1.0f);
  EXPECT_EQ(camera.getFarClipDistance(), 300.0f);
  float w = 0, h = 0;
  handler.GetOrthoCameraWidthHeight(&w, &h);
  EXPECT_EQ(w, 640.0f);
  EXPECT_EQ(h, 480.0f);
}

TEST_F(SceneHandlerTest, InitAgainReplacesEachObjectAfterBuildingItsSuccessor) {
  SceneHandler& handler = Handler();
  vexel_recording::ClearJournal();
  handler.Init(window_, nullptr, 320, 200, {}, {});
  const auto& journal = vexel_recording::Journal();
  EXPECT_LT(FindEntry("Kit Vexel.log"), FindEntry("~Kit"));
  EXPECT_LT(FindEntry("Renderer 0"), FindEntry("~Renderer"));
  EXPECT_LT(FindEntry("Scene"), FindEntry("~Scene"));
  EXPECT_EQ(CountEntries("Camera"), 1);
  EXPECT_EQ(CountEntries("~Camera"), 1);
  EXPECT_EQ(LiveCount("Kit"), 1);
  EXPECT_EQ(LiveCount("Scene"), 1);
  EXPECT_EQ(LiveCount("Camera"), 1);
  EXPECT_EQ(handler.GetCamera()->getOrthographicWindowWidth(), 320.0f);
  EXPECT_FALSE(journal.empty());
}

TEST_F(SceneHandlerTest, InitReappliesTheStoredLanguageOnceTheCameraExists) {
  SceneHandler* handler = SceneHandler::Instance();
  handler->SetTranslationLanguage("ja");  // before Init: stored only
  EXPECT_EQ(CountEntries("Font*"), 0);
  handler->Init(window_, nullptr, kWidth, kHeight, {}, {});
  EXPECT_LT(FindEntry("Camera"), FindEntry("Font NotoSansCJK-Regular.ttc 2"));
  ASSERT_NE(handler->GetFont(), nullptr);
  EXPECT_EQ(handler->GetFont()->getReferenceCharacter(), 0xFF41u);
}

TEST_F(SceneHandlerTest, DestructionGoesChildrenFirstThenSceneRendererKit) {
  Handler().CreateBackground(640, 480, 0, -1, 1, 1, -1);
  Draw(0, "Hallo", 1);
  vexel_recording::ClearJournal();
  SceneHandler::DeleteInstance();

  const int text = FindEntry("~Text Hallo");
  const int camera = FindEntry("~Camera");
  const int material = FindEntry("~Material", camera);  // the background's
  const int texture = FindEntry("~Texture RenderTexture");
  const int mesh = FindEntry("~Mesh BackgroundRectMesh");
  const int font = FindEntry("~Font NotoSansCJK-Regular.ttc");
  const int shared_mesh = FindEntry("~Mesh InpaintedRectMesh");
  const int scene = FindEntry("~Scene");
  const int renderer = FindEntry("~Renderer");
  const int kit = FindEntry("~Kit");
  for (int index : {text, camera, material, texture, mesh, font, shared_mesh, scene, renderer, kit})
    ASSERT_GE(index, 0);
  EXPECT_LT(text, camera);
  EXPECT_LT(camera, material);
  EXPECT_LT(material, texture);
  EXPECT_LT(texture, mesh);
  EXPECT_LT(mesh, font);
  EXPECT_LT(font, shared_mesh);
  EXPECT_LT(shared_mesh, scene);
  EXPECT_LT(scene, renderer);
  EXPECT_LT(renderer, kit);
  for (const char* type : {"Kit", "Renderer", "Scene", "Camera", "Texture", "Material", "Mesh",
                           "Object", "Font", "Text", "EmptyNode"}) {
    EXPECT_EQ(LiveCount(type), 0) << type;
  }
}

TEST_F(SceneHandlerTest, WithoutSceneCameraAndClearingDoNothing) {
  SceneHandler& handler = *SceneHandler::Instance();
  ocr::log::ScopedCapture log;
  handler.DeleteCamera();
  handler.ClearTextObjects(0, true);
  handler.ClearAllTextObjects(true);
  handler.RenderOneFrame();
  EXPECT_TRUE(vexel_recording::Journal().empty());
  EXPECT_TRUE(log.Texts().empty());
}

TEST_F(SceneHandlerTest, ClearAllOnAnEmptySceneLogsNothing) {
  SceneHandler& handler = Handler();
  ocr::log::ScopedCapture log;
  handler.ClearAllTextObjects(false);
  handler.ClearAllTextObjects(true);
  EXPECT_TRUE(log.Texts().empty());
  EXPECT_EQ(Root(handler)->getChildCount(), 1u);  // the camera
}

TEST_F(SceneHandlerTest, AnUnusedTextIsKeptFor249PassesAndRetiredOnThe250th) {
  SceneHandler& handler = Handler();
  Draw(0, "Ausgang", 5);
  const Vexel::Text* text = handler.GetCurrentTextCache().at("Ausgang").front().text.get();
  handler.UpdateTextObjectCache();
  for (int pass = 1; pass <= 249; ++pass)
    handler.ClearTextObjects(0, false);
  ASSERT_EQ(CachedCount(handler.GetReusableTextCache(), "Ausgang"), 1u);
  EXPECT_EQ(handler.GetUnusedFrameCount(text), 249);
  EXPECT_EQ(LiveCount("Text"), 1);

  handler.ClearTextObjects(0, false);
  EXPECT_EQ(handler.GetReusableTextCache().count("Ausgang"), 0u);  // key erased too
  EXPECT_EQ(handler.GetUnusedFrameCount(text), -1);
  EXPECT_EQ(LiveCount("Text"), 0);
  EXPECT_EQ(LiveCount("Texture"), 0);
  EXPECT_EQ(LiveCount("Object"), 0);
  EXPECT_EQ(LiveCount("Material"), 0);
}

TEST_F(SceneHandlerTest, ForcedClearingRetiresAtOnce) {
  SceneHandler& handler = Handler();
  Draw(0, "Eingang");
  handler.UpdateTextObjectCache();
  handler.ClearTextObjects(0, true);
  EXPECT_TRUE(handler.GetReusableTextCache().empty());
  EXPECT_EQ(LiveCount("Text"), 0);
}

TEST_F(SceneHandlerTest, ObjectsInDrawnSlotsAreKeptEvenWhenForced) {
  SceneHandler& handler = Handler();
  Draw(0, "eins");
  Draw(1, "zwei");
  handler.UpdateTextObjectCache();
  handler.ClearTextObjects(1, true);  // slot 0 counts as drawn
  EXPECT_EQ(CachedCount(handler.GetReusableTextCache(), "eins"), 1u);
  EXPECT_EQ(CachedCount(handler.GetReusableTextCache(), "zwei"), 0u);
}

TEST_F(SceneHandlerTest, ClearAllRetiresTheCurrentFrameToo) {
  SceneHandler& handler = Handler();
  Draw(0, "eins");
  handler.UpdateTextObjectCache();
  Draw(0, "zwei");  // current frame
  handler.ClearAllTextObjects(true);
  EXPECT_TRUE(handler.GetCurrentTextCache().empty());
  EXPECT_TRUE(handler.GetReusableTextCache().empty());
  EXPECT_EQ(LiveCount("Text"), 0);
}

TEST_F(SceneHandlerTest, ClearAllUnforcedKeepsTextsCachedButDetachesTheirSlots) {
  SceneHandler& handler = Handler();
  Draw(0, "eins");
  Draw(1, "zwei");
  ASSERT_EQ(handler.GetTextNodes()[1]->getParent(), Root(handler));
  handler.ClearAllTextObjects(false);
  EXPECT_EQ(CachedCount(handler.GetReusableTextCache(), "eins"), 1u);
  EXPECT_EQ(CachedCount(handler.GetReusableTextCache(), "zwei"), 1u);
  EXPECT_EQ(handler.GetTextNodes()[0]->getParent(), nullptr);
  EXPECT_EQ(handler.GetTextNodes()[1]->getParent(), nullptr);
}

TEST_F(SceneHandlerTest, ClearAllCatchesLogsAndReturns) {
  SceneHandler& handler = Handler();
  Draw(0, "eins");
  handler.UpdateTextObjectCache();
  ocr::log::ScopedCapture log;
  vexel_recording::FailOn("Node.removeChild");
  handler.ClearAllTextObjects(true);
  EXPECT_EQ(log.Texts(),
            std::vector<std::string>{"SceneHandler: caught exception in ClearAllTextObjects."});
  EXPECT_EQ(log.Records()[0].priority, ocr::log::kError);
}

TEST_F(SceneHandlerTest, UpdateTextObjectCacheSplicesUnderTheSameKey) {
  SceneHandler& handler = Handler();
  Draw(0, "gleich", 1);
  handler.UpdateTextObjectCache();
  Draw(0, "gleich", 1);  // reused
  Draw(1, "gleich", 2);  // a second object with the same text
  EXPECT_EQ(CachedCount(handler.GetCurrentTextCache(), "gleich"), 2u);
  EXPECT_EQ(CachedCount(handler.GetReusableTextCache(), "gleich"), 0u);
  handler.UpdateTextObjectCache();
  EXPECT_TRUE(handler.GetCurrentTextCache().empty());
  EXPECT_EQ(CachedCount(handler.GetReusableTextCache(), "gleich"), 2u);
  EXPECT_EQ(LiveCount("Text"), 2);
}

}  // namespace
}  // namespace ocr_ar
