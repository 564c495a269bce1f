#include "renderer/renderer_bridge.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <string>
#include <vector>

#include "common/log.h"
#include "recording_scene.h"

namespace ocr_ar {
namespace {

using testing::CountEntries;
using testing::HostFrame;
using testing::Journal;
using testing::LiveCount;

std::string FrameLine(const cv::Mat& image, int texts) {
  char line[128];
  std::snprintf(line, sizeof(line), "Vexel: renderOneFrame image(%p %d %d) text(%d)",
                static_cast<void*>(image.data), image.cols, image.rows, texts);
  return line;
}

// The bridge drives the scene handler; the 320x180 camera image fills
// 640x360 of the 640x480 window, rows 60 to 420.
class RendererBridgeTest : public testing::RecordingScene {
 protected:
  bool Init() {
    return bridge::InitFromSurface(
        [this] {
          ANativeWindow_acquire(window_);
          return window_;
        },
        320, 180);
  }
  void Render(HostFrame& frame, const cv::Mat* image = nullptr) {
    bridge::RenderOneFrame(
        image, frame.texts.size(), [&frame](std::size_t i) { return frame.texts[i]; },
        frame.Arrays());
  }

  SceneHandler& Instance() { return *SceneHandler::Instance(); }  // not initialised by itself

  cv::Mat image_ = cv::Mat(180, 320, CV_8UC4, cv::Scalar::all(50));
};

TEST_F(RendererBridgeTest, InitBuildsTheSceneAndFitsTheBackground) {
  ocr::log::ScopedCapture log;
  ASSERT_TRUE(Init());
  std::vector<float> corners(4);
  Instance().GetBackgroundRectCorners(&corners[0], &corners[1], &corners[2], &corners[3]);
  EXPECT_EQ(corners, (std::vector<float>{-1.0f, 0.75f, 1.0f, -0.75f}));
  EXPECT_EQ(Instance().GetBackgroundWidth(), 320);
  const std::vector<std::string> expected = {
      "Vexel: Init renderer 640 480.", "Vexel: Init background 320 180.",
      "VexelJNI::InitBackground background_width = 320, background_height = 180 \r\n",
      "VexelJNI::InitBackground native_window_width = 640, native_window_height = 480 \r\n",
      "VexelJNI::InitBackground rotation = 0 \r\n"};
  EXPECT_EQ(log.Texts(), expected);
  EXPECT_EQ(log.Records()[1].priority, ocr::log::kInfo);
  EXPECT_EQ(log.Records()[2].priority, ocr::log::kDebug);

  // Again on the live window: the old renderer is shut down first.
  ASSERT_TRUE(Init());
  EXPECT_EQ(
      log.Count("Vexel: initFromSurface called with non-null s_native_window!", ocr::log::kError),
      1);
  EXPECT_EQ(log.Count("Vexel: shutDown renderer.", ocr::log::kInfo), 1);
  EXPECT_EQ(LiveCount("Renderer"), 1);
}

// A window that is missing or has no pixels is logged and builds nothing, yet
// answers true: the host learns of it only from the log (the message says
// "negative" for a zero size too). Only a failure while building is false.
TEST_F(RendererBridgeTest, NoWindowOrAnEmptyOneIsOnlyLoggedAndAFailedBuildIsFalse) {
  ocr::log::ScopedCapture log;
  EXPECT_TRUE(bridge::InitFromSurface([] { return nullptr; }, 4, 4));
  EXPECT_EQ(log.Count("Vexel: Init failed, s_native_window is null!", ocr::log::kError), 1);
  EXPECT_FALSE(Instance().HasRenderer());
  ANativeWindow* empty = platform::desktop::CreateOffscreenWindow(0, 10);
  EXPECT_TRUE(bridge::InitFromSurface([empty] { return empty; }, 4, 4));  // takes our reference
  EXPECT_EQ(log.Count("Vexel: Init renderer 0 10.", ocr::log::kInfo), 1);
  EXPECT_EQ(log.Count("Vexel: The size of the window is negative", ocr::log::kError), 1);
  EXPECT_FALSE(Instance().HasRenderer());
  bridge::ShutDown();
  vexel_recording::Failures() = {"Renderer"};
  EXPECT_FALSE(Init());
  EXPECT_TRUE(log.Contains("Vexel: initFromSurface() ERROR: recording kit: Renderer fails as asked",
                           ocr::log::kError));
  EXPECT_FALSE(Instance().HasRenderer());
}

TEST_F(RendererBridgeTest, AFrameDrawsEachTextAtItsMappedPlaceInItsCorrectedColour) {
  ASSERT_TRUE(Init());
  HostFrame frame;
  frame.Add("Exit", {80, 45, 40, 10, 0}, 7, 0xFF0A1464u).Add("Ausgang", {160, 90, 60, 12, -30}, 8);
  frame.scales = {2.0, 20.0, 0.5, 1.0, 1.0, 1.0};
  frame.shifts = {10.0, 0.0, -20.0, 0.0, 0.0, 0.0};
  ocr::log::ScopedCapture log;
  Render(frame, &image_);
  EXPECT_EQ(log.Count(FrameLine(image_, 2), ocr::log::kInfo), 1);
  EXPECT_TRUE(bridge::GetRenderTranslate());
  EXPECT_EQ(CountEntries("Texture.setImage RenderTexture 320 180 8"), 1);
  EXPECT_EQ(CountEntries("Kit.drawAll"), 1);

  const InpaintedTextObject& exit = Current("Exit");
  const Vexel::Object& patch = *exit.patch.object;
  // Image (80, 45) -> window (160, 150) -> camera (-160, 90); sides x2, the
  // patch 5% wider.
  EXPECT_NEAR(patch.getPosition().x, -160.0f, 1e-3f);
  EXPECT_NEAR(patch.getPosition().y, 90.0f, 1e-3f);
  EXPECT_NEAR(patch.getScale().x, 84.0f, 1e-3f);
  EXPECT_NEAR(patch.getScale().y, 20.0f, 1e-3f);
  EXPECT_EQ(exit.patch.id, 7);
  // Channels (100, 20, 10) from the lowest byte up, scaled, shifted, clamped.
  EXPECT_EQ(exit.text->getColor(), Vexel::Color::fromBytes(210, 255, 0));
  EXPECT_EQ(vexel_recording::UniformsOf(*patch.getMaterial(0)).at("colorScale"),
            Vexel::Vector3(2.0f, 20.0f, 0.5f));
  EXPECT_NEAR(Current("Ausgang").patch.object->getRotation().valueDegrees(), 30.0f, 1e-4f);
}

TEST_F(RendererBridgeTest, AnEmptyFrameKeepsTheTextsForReuseAndStillDrawsTheBackground) {
  ASSERT_TRUE(Init());
  HostFrame frame, empty;
  Render(frame.Add("Exit"));
  Journal().clear();
  Render(empty, &image_);
  EXPECT_FALSE(bridge::GetRenderTranslate());
  EXPECT_EQ(Journal(), (std::vector<std::string>{"Texture.setImage RenderTexture 320 180 8",
                                                 "Node.removeChild", "Kit.drawAll"}));
  EXPECT_EQ(Cached("Exit"), 1u);
}

TEST_F(RendererBridgeTest, AnUnreadableTextStillTakesItsSlotEmptyBlackAndUncorrected) {
  ASSERT_TRUE(Init());
  HostFrame frame;
  frame.Add(std::nullopt, {80, 45, 40, 10, 0}, 7, 0x7F00FF00u).Add("zwei");
  ocr::log::ScopedCapture log;
  Render(frame);
  EXPECT_EQ(log.Texts(), (std::vector<std::string>{FrameLine(cv::Mat(), 2),
                                                   "Vexel: GetStringUTFChars failed."}));
  const InpaintedTextObject& empty = Current("");
  EXPECT_EQ(empty.slot_index, 0u);
  EXPECT_EQ(empty.patch.id, -1);
  EXPECT_EQ(empty.text->getColor(), Vexel::Color(0, 0, 0, 1));
  EXPECT_EQ(empty.patch.object->getScale().x, 0.0f);
  const auto& uniforms = vexel_recording::UniformsOf(*empty.patch.object->getMaterial(0));
  EXPECT_EQ(uniforms.at("colorScale"), Vexel::Vector3(1, 1, 1));
  EXPECT_EQ(uniforms.at("colorShift"), Vexel::Vector3(0, 0, 0));
  EXPECT_EQ(Current("zwei").slot_index, 1u);
}

TEST_F(RendererBridgeTest, EachFailingCallIsLoggedAndTheFrameGoesOn) {
  ASSERT_TRUE(Init());
  HostFrame two, one, none;
  two.Add("eins").Add("zwei");
  ocr::log::ScopedCapture log;
  vexel_recording::Failures() = {"Texture.setImage", "Kit.drawAll", "Text"};
  Render(two, &image_);
  EXPECT_EQ(log.Count("Vexel: Caught exception in SceneHandler::UpdateBackgroundImage.",
                      ocr::log::kError),
            1);
  EXPECT_EQ(log.Count("Vexel: Caught exception creating text object.", ocr::log::kError), 2);
  EXPECT_EQ(log.Count("Vexel: Caught exception in SceneHandler::RenderOneFrame.", ocr::log::kError),
            1);

  vexel_recording::Failures().clear();
  Render(two);
  // Slot 1 must leave the scene when only one text comes.
  vexel_recording::Failures() = {"Node.removeChild"};
  Render(one.Add("eins"));
  Render(none);
  // ClearAllTextObjects catches by itself; ClearTextObjects does not.
  EXPECT_EQ(log.Count("Vexel: Caught exception clearing remaining text objects.", ocr::log::kError),
            1);
  EXPECT_EQ(log.Count("SceneHandler: caught exception in ClearAllTextObjects.", ocr::log::kError),
            1);
}

TEST_F(RendererBridgeTest, ShortRectangleArraysAreReportedAndDrawnEmpty) {
  ASSERT_TRUE(Init());
  HostFrame frame;
  frame.Add("eins").Add("zwei").text_rects.resize(5);
  ocr::log::ScopedCapture log;
  Render(frame);
  EXPECT_EQ(log.Count("Vexel: renderOneFrame needs 5 values per text in patchRects and "
                      "textRects; missing rectangles are drawn empty.",
                      ocr::log::kError),
            1);
  EXPECT_EQ(Current("zwei").text->getScale().x, 0.0f);
}

TEST_F(RendererBridgeTest, LanguageAndOrientationCallsAreLoggedAndGuarded) {
  ASSERT_TRUE(Init());
  ocr::log::ScopedCapture log;
  vexel_recording::Failures() = {"Font"};
  bridge::SetTranslationLanguage("zh-CHS");
  EXPECT_TRUE(log.Contains("Vexel: set translation language: zh-CHS", ocr::log::kInfo));
  EXPECT_TRUE(log.Contains("Vexel: caught exception from SceneHandler::SetTranslationLanguage.",
                           ocr::log::kError));
  bridge::SetTranslationLanguageFont("de", "/system/fonts/Roboto.ttf");
  EXPECT_TRUE(log.Contains(
      "Vexel: set translation language de to use font: /system/fonts/Roboto.ttf", ocr::log::kInfo));
  EXPECT_EQ(Instance().GetLanguageFonts().at("de"), "/system/fonts/Roboto.ttf");
  bridge::SetTranslationLanguageFont("de", nullptr);
  EXPECT_TRUE(log.Contains("Vexel: set translation language de to use font: ", ocr::log::kInfo));
  EXPECT_TRUE(Instance().GetLanguageFonts().empty());

  // A new orientation rebuilds the background with the host's frames
  // standing the other way round.
  vexel_recording::Failures() = {"Mesh"};
  bridge::SetOrientation(90);
  EXPECT_TRUE(
      log.Contains("Vexel: caught unexpected exception in ResetBackground.", ocr::log::kError));
  vexel_recording::Failures().clear();
  bridge::SetOrientation(90);
  EXPECT_TRUE(log.Contains("VexelJNI::InitBackground rotation = 90 \r\n", ocr::log::kDebug));
  EXPECT_EQ(Instance().GetBackgroundWidth(), 180);
  EXPECT_EQ(Instance().GetBackgroundHeight(), 320);
  bridge::SetOrientation(0);  // the orientation outlives the renderer
}

}  // namespace
}  // namespace ocr_ar
