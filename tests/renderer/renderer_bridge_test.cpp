#include "renderer/renderer_bridge.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <opencv2/core.hpp>
#include <optional>
#include <string>
#include <vector>

#include "common/log.h"
#include "recording_scene.h"

namespace ocr_ar {
namespace {

using testing::CountEntries;
using testing::Journal;
using testing::LiveCount;

// One frame's host data. Each text gets the same patch and text rectangle,
// an 8x4 RGBA patch and no colour correction (scale 1, shift 0).
struct HostFrame {
  std::vector<std::optional<std::string>> texts;
  std::vector<double> patch_rects, text_rects, scales, shifts;
  std::vector<std::int64_t> ids, addresses;
  std::vector<cv::Mat> patches;
  std::vector<std::int32_t> colors;

  HostFrame& Add(const std::optional<std::string>& text,
                 std::vector<double> rect = {80, 45, 40, 10, 0}, std::int64_t id = 1,
                 std::uint32_t color = 0xFF000000u) {
    texts.push_back(text);
    patch_rects.insert(patch_rects.end(), rect.begin(), rect.end());
    text_rects.insert(text_rects.end(), rect.begin(), rect.end());
    ids.push_back(id);
    patches.emplace_back(4, 8, CV_8UC4, cv::Scalar::all(100));
    colors.push_back(static_cast<std::int32_t>(color));
    scales.insert(scales.end(), {1.0, 1.0, 1.0});
    shifts.insert(shifts.end(), {0.0, 0.0, 0.0});
    return *this;
  }

  FrameArrays Arrays() {
    addresses.clear();
    for (const cv::Mat& patch : patches)
      addresses.push_back(reinterpret_cast<std::int64_t>(&patch));
    return {{patch_rects.data(), patch_rects.size()},
            {text_rects.data(), text_rects.size()},
            {ids.data(), ids.size()},
            {addresses.data(), addresses.size()},
            {scales.data(), scales.size()},
            {shifts.data(), shifts.size()},
            {colors.data(), colors.size()}};
  }
};

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

TEST_F(RendererBridgeTest, CallsBeforeInitialisationOnlyLog) {
  ocr::log::ScopedCapture log;
  HostFrame frame;
  Render(frame.Add("Exit"), &image_);
  bridge::SetOrientation(90);
  bridge::ShutDown();
  EXPECT_TRUE(Journal().empty());
  EXPECT_EQ(log.Texts(),
            (std::vector<std::string>{FrameLine(image_, 1), "Vexel: Set renderer orientation 90.",
                                      "Vexel: shutDown renderer."}));
}

TEST_F(RendererBridgeTest, InitBuildsTheSceneAndFitsTheBackground) {
  ocr::log::ScopedCapture log;
  ASSERT_TRUE(Init());
  ASSERT_TRUE(Instance().HasRenderer());
  std::vector<float> corners(4);
  Instance().GetBackgroundRectCorners(&corners[0], &corners[1], &corners[2], &corners[3]);
  EXPECT_EQ(corners, (std::vector<float>{-1.0f, 0.75f, 1.0f, -0.75f}));
  EXPECT_EQ(Instance().GetBackgroundWidth(), 320);
  EXPECT_EQ(Instance().GetBackgroundHeight(), 180);
  const std::vector<std::string> expected = {
      "Vexel: Init renderer 640 480.", "Vexel: Init background 320 180.",
      "VexelJNI::InitBackground background_width = 320, background_height = 180 \r\n",
      "VexelJNI::InitBackground native_window_width = 640, native_window_height = 480 \r\n",
      "VexelJNI::InitBackground rotation = 0 \r\n"};
  EXPECT_EQ(log.Texts(), expected);
  EXPECT_EQ(log.Records()[1].priority, ocr::log::kInfo);
  EXPECT_EQ(log.Records()[2].priority, ocr::log::kDebug);
}

TEST_F(RendererBridgeTest, InitOnALiveWindowShutsTheOldRendererDownFirst) {
  ASSERT_TRUE(Init());
  ocr::log::ScopedCapture log;
  ASSERT_TRUE(Init());
  EXPECT_TRUE(log.Contains("Vexel: initFromSurface called with non-null s_native_window!",
                           ocr::log::kError));
  EXPECT_TRUE(log.Contains("Vexel: shutDown renderer."));
  EXPECT_EQ(LiveCount("Kit"), 1);
  EXPECT_EQ(LiveCount("Renderer"), 1);
}

TEST_F(RendererBridgeTest, InitWithoutAWindowOrWithAnEmptyOneReportsAndReturnsTrue) {
  ocr::log::ScopedCapture log;
  EXPECT_TRUE(bridge::InitFromSurface([] { return nullptr; }, 4, 4));
  EXPECT_TRUE(log.Contains("Vexel: Init failed, s_native_window is null!", ocr::log::kError));
  ANativeWindow* empty = platform::desktop::CreateOffscreenWindow(0, 10);
  EXPECT_TRUE(bridge::InitFromSurface([empty] { return empty; }, 4, 4));  // takes our reference
  EXPECT_TRUE(log.Contains("Vexel: The size of the window is negative", ocr::log::kError));
  EXPECT_FALSE(Instance().HasRenderer());
}

TEST_F(RendererBridgeTest, InitFailureIsLoggedWithItsReasonAndReturnsFalse) {
  ocr::log::ScopedCapture log;
  vexel_recording::Failures() = {"Renderer"};
  EXPECT_FALSE(Init());
  EXPECT_TRUE(log.Contains("Vexel: initFromSurface() ERROR: recording kit: Renderer fails as asked",
                           ocr::log::kError));
  Journal().clear();
  HostFrame frame;
  Render(frame.Add("Exit"), &image_);  // does nothing
  EXPECT_TRUE(Journal().empty());
}

TEST_F(RendererBridgeTest, FrameDrawsEachTextAtItsMappedPlaceInItsCorrectedColour) {
  ASSERT_TRUE(Init());
  HostFrame frame;
  frame.Add("Exit", {80, 45, 40, 10, 0}, 7, 0xFF0A1464u).Add("Ausgang", {160, 90, 60, 12, -30}, 8);
  frame.scales = {2.0, 20.0, 0.5, 1.0, 1.0, 1.0};
  frame.shifts = {10.0, 0.0, -20.0, 0.0, 0.0, 0.0};
  ocr::log::ScopedCapture log;
  Render(frame, &image_);
  EXPECT_EQ(log.Count(FrameLine(image_, 2), ocr::log::kInfo), 1);
  EXPECT_TRUE(bridge::GetRenderTranslate());

  const InpaintedTextObject& exit = Current("Exit");
  const Vexel::Object& patch = *exit.patch.object;
  // Image (80, 45) -> window (160, 150) -> camera (-160, 90); sides x2, the
  // patch 5% wider.
  EXPECT_NEAR(patch.getPosition().x, -160.0f, 1e-3f);
  EXPECT_NEAR(patch.getPosition().y, 90.0f, 1e-3f);
  EXPECT_NEAR(patch.getScale().x, 84.0f, 1e-3f);
  EXPECT_NEAR(patch.getScale().y, 20.0f, 1e-3f);
  EXPECT_EQ(exit.patch.id, 7);
  EXPECT_EQ(exit.slot_index, 0u);
  // Channels (100, 20, 10) from the lowest byte up, scaled, shifted, clamped.
  EXPECT_EQ(exit.text->getColor(), Vexel::Color::fromBytes(210, 255, 0));
  EXPECT_EQ(vexel_recording::UniformsOf(*patch.getMaterial(0)).at("colorScale"),
            Vexel::Vector3(2.0f, 20.0f, 0.5f));

  const InpaintedTextObject& ausgang = Current("Ausgang");
  EXPECT_EQ(ausgang.slot_index, 1u);
  EXPECT_NEAR(ausgang.patch.object->getRotation().valueDegrees(), 30.0f, 1e-4f);
  EXPECT_NEAR(ausgang.patch.object->getPosition().x, 0.0f, 1e-3f);
  EXPECT_EQ(CountEntries("Texture.setImage RenderTexture 320 180 8"), 1);
  EXPECT_EQ(CountEntries("Kit.drawAll"), 1);
}

TEST_F(RendererBridgeTest, AnEmptyFrameClearsTheTextsButStillDrawsTheBackground) {
  ASSERT_TRUE(Init());
  HostFrame frame;
  Render(frame.Add("Exit"));
  HostFrame empty;
  Journal().clear();
  Render(empty, &image_);
  EXPECT_FALSE(bridge::GetRenderTranslate());
  EXPECT_EQ(CountEntries("Texture.setImage RenderTexture 320 180 8"), 1);
  EXPECT_EQ(CountEntries("Kit.drawAll"), 1);
  EXPECT_EQ(Instance().GetReusableTextCache().count("Exit"), 1u);  // kept for reuse
  EXPECT_EQ(Slot(0)->getParent(), nullptr);
}

TEST_F(RendererBridgeTest, AnUnreadableTextStillTakesItsSlot) {
  ASSERT_TRUE(Init());
  HostFrame frame;
  frame.Add(std::nullopt, {80, 45, 40, 10, 0}, 7, 0x7F00FF00u).Add("zwei");
  ocr::log::ScopedCapture log;
  Render(frame);
  EXPECT_TRUE(log.Contains("Vexel: GetStringUTFChars failed.", ocr::log::kError));
  const InpaintedTextObject& empty = Current("");
  EXPECT_EQ(empty.slot_index, 0u);
  EXPECT_EQ(empty.patch.id, -1);
  EXPECT_EQ(empty.text->getColor(), Vexel::Color(0, 0, 0, 1));
  EXPECT_EQ(empty.patch.object->getScale().x, 0.0f);
  EXPECT_EQ(Current("zwei").slot_index, 1u);
}

TEST_F(RendererBridgeTest, EachFailingCallIsLoggedAndTheFrameGoesOn) {
  ASSERT_TRUE(Init());
  HostFrame two;
  two.Add("eins").Add("zwei");
  ocr::log::ScopedCapture log;
  vexel_recording::Failures() = {"Texture.setImage", "Kit.drawAll", "Text.setText"};
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
  HostFrame one;
  Render(one.Add("eins"));
  HostFrame empty;
  Render(empty);
  // ClearAllTextObjects catches by itself; ClearTextObjects does not.
  EXPECT_EQ(log.Count("Vexel: Caught exception clearing remaining text objects.", ocr::log::kError),
            1);
  EXPECT_EQ(log.Count("SceneHandler: caught exception in ClearAllTextObjects.", ocr::log::kError),
            1);
}

TEST_F(RendererBridgeTest, LanguageCallsAreLoggedAndGuarded) {
  ASSERT_TRUE(Init());
  ocr::log::ScopedCapture log;
  vexel_recording::Failures() = {"Font"};
  bridge::SetTranslationLanguage("zh-CHS");
  EXPECT_TRUE(log.Contains("Vexel: set translation language: zh-CHS", ocr::log::kInfo));
  EXPECT_TRUE(log.Contains("Vexel: caught exception from SceneHandler::SetTranslationLanguage.",
                           ocr::log::kError));
  vexel_recording::Failures().clear();

  bridge::SetTranslationLanguageFont("de", "/system/fonts/Roboto.ttf");
  EXPECT_TRUE(log.Contains(
      "Vexel: set translation language de to use font: /system/fonts/Roboto.ttf", ocr::log::kInfo));
  EXPECT_EQ(Instance().GetLanguageFonts().at("de"), "/system/fonts/Roboto.ttf");
  bridge::SetTranslationLanguageFont("de", "");
  EXPECT_TRUE(Instance().GetLanguageFonts().empty());
  bridge::SetTranslationLanguageFont("de", nullptr);
  EXPECT_TRUE(log.Contains("Vexel: set translation language de to use font: ", ocr::log::kInfo));
}

TEST_F(RendererBridgeTest, OrientationRebuildsTheBackgroundAndTurnsTheRectangles) {
  ASSERT_TRUE(Init());
  HostFrame frame;
  Render(frame.Add("Exit"));
  ocr::log::ScopedCapture log;
  bridge::SetOrientation(90);
  EXPECT_TRUE(log.Contains("Vexel: Set renderer orientation 90.", ocr::log::kInfo));
  EXPECT_TRUE(log.Contains("VexelJNI::InitBackground rotation = 90 \r\n", ocr::log::kDebug));
  // The host's frames now stand upright: 180 wide, 320 tall.
  EXPECT_EQ(Instance().GetBackgroundWidth(), 180);
  EXPECT_EQ(Instance().GetBackgroundHeight(), 320);
  EXPECT_EQ(Instance().GetReusableTextCache().count("Exit"), 1u);  // cleared, not forced

  // Upright image point (45, 240) shows at background (240, 135): window
  // (480, 330), camera (160, -90); the angle turns by -90 (camera +90).
  HostFrame turned;
  Render(turned.Add("Exit", {45, 240, 40, 10, 0}));
  const Vexel::Object& patch = *Current("Exit").patch.object;
  EXPECT_NEAR(patch.getPosition().x, 160.0f, 1e-3f);
  EXPECT_NEAR(patch.getPosition().y, -90.0f, 1e-3f);
  EXPECT_NEAR(patch.getRotation().valueDegrees(), 90.0f, 1e-4f);
  EXPECT_NEAR(patch.getScale().x, 84.0f, 1e-3f);
  EXPECT_NEAR(patch.getScale().y, 20.0f, 1e-3f);
  bridge::SetOrientation(0);  // the orientation outlives the renderer
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

}  // namespace
}  // namespace ocr_ar
