#include "renderer/renderer_bridge.h"

#include <android/native_window.h>
#include <gtest/gtest.h>

#include <opencv2/core.hpp>
#include <optional>
#include <string>
#include <vector>

#include "common/log.h"
#include "platform/desktop.h"
#include "recording_kit.h"
#include "renderer/scene_handler.h"

namespace ocr_ar {
namespace {

using vexel_recording::CountEntries;
using vexel_recording::LiveCount;
using vexel_recording::NodeState;
using vexel_recording::StateOf;

// One frame's host data: texts and the per-text arrays.
struct HostFrame {
  std::vector<std::optional<std::string>> texts;
  std::vector<double> patch_rects;
  std::vector<double> text_rects;
  std::vector<std::int64_t> ids;
  std::vector<cv::Mat> patches;
  std::vector<std::int64_t> patch_addresses;
  std::vector<double> scales;
  std::vector<double> shifts;
  std::vector<std::int32_t> colors;

  void Add(const std::optional<std::string>& text, std::vector<double> rect, std::int64_t id,
           std::int32_t color = static_cast<std::int32_t>(0xFF000000u)) {
    texts.push_back(text);
    patch_rects.insert(patch_rects.end(), rect.begin(), rect.end());
    text_rects.insert(text_rects.end(), rect.begin(), rect.end());
    ids.push_back(id);
    patches.emplace_back(4, 8, CV_8UC4, cv::Scalar::all(100));
    colors.push_back(color);
    scales.insert(scales.end(), {1.0, 1.0, 1.0});
    shifts.insert(shifts.end(), {0.0, 0.0, 0.0});
  }

  FrameArrays Arrays() {
    patch_addresses.clear();
    for (const cv::Mat& patch : patches)
      patch_addresses.push_back(reinterpret_cast<std::int64_t>(&patch));
    FrameArrays a;
    a.patch_rects = {patch_rects.data(), patch_rects.size()};
    a.text_rects = {text_rects.data(), text_rects.size()};
    a.ids = {ids.data(), ids.size()};
    a.patch_mat_addrs = {patch_addresses.data(), patch_addresses.size()};
    a.color_scales = {scales.data(), scales.size()};
    a.color_shifts = {shifts.data(), shifts.size()};
    a.colors = {colors.data(), colors.size()};
    return a;
  }
};

class RendererBridgeTest : public ::testing::Test {
 protected:
  static constexpr int kWindowWidth = 640;
  static constexpr int kWindowHeight = 480;
  static constexpr int kImageWidth = 320;
  static constexpr int kImageHeight = 180;

  void SetUp() override {
    vexel_recording::ClearJournal();
    vexel_recording::ClearFailures();
    window_ = platform::desktop::CreateOffscreenWindow(kWindowWidth, kWindowHeight);
  }
  void TearDown() override {
    vexel_recording::ClearFailures();
    if (SceneHandler::Instance()->HasRenderer())
      bridge::SetOrientation(0);  // the orientation outlives the renderer
    bridge::ShutDown();
    ANativeWindow_release(window_);
  }

  bool Init(int width = kImageWidth, int height = kImageHeight) {
    return bridge::InitFromSurface(
        [this] {
          ANativeWindow_acquire(window_);
          return window_;
        },
        width, height);
  }

  void Render(HostFrame& frame, const cv::Mat* image = nullptr) {
    const FrameArrays arrays = frame.Arrays();
    bridge::RenderOneFrame(
        image, frame.texts.size(), [&frame](std::size_t i) { return frame.texts[i]; }, arrays);
  }

  SceneHandler& Handler() { return *SceneHandler::Instance(); }

  const InpaintedTextObject& Current(const std::string& text) {
    return Handler().GetCurrentTextCache().at(text).front();
  }

  ANativeWindow* window_ = nullptr;
};

TEST_F(RendererBridgeTest, CallsBeforeInitialisationOnlyLog) {
  ocr::log::ScopedCapture log;
  HostFrame frame;
  frame.Add("Exit", {10, 10, 40, 10, 0}, 1);
  const cv::Mat image(kImageHeight, kImageWidth, CV_8UC4);
  Render(frame, &image);
  bridge::SetOrientation(90);
  bridge::ShutDown();
  EXPECT_TRUE(vexel_recording::Journal().empty());
  EXPECT_FALSE(bridge::GetRenderTranslate());
  EXPECT_TRUE(log.Contains("Vexel: Set renderer orientation 90.", ocr::log::kInfo));
  EXPECT_EQ(log.Count("Vexel: shutDown renderer.", ocr::log::kInfo), 1);
  EXPECT_EQ(log.Records().size(), 3u);
}

TEST_F(RendererBridgeTest, InitBuildsTheSceneAndFitsTheBackground) {
  ocr::log::ScopedCapture log;
  ASSERT_TRUE(Init());
  ASSERT_TRUE(Handler().HasRenderer());
  float l = 0, t = 0, r = 0, b = 0;
  Handler().GetBackgroundRectCorners(&l, &t, &r, &b);
  EXPECT_FLOAT_EQ(l, -1.0f);
  EXPECT_FLOAT_EQ(t, 0.75f);
  EXPECT_FLOAT_EQ(r, 1.0f);
  EXPECT_FLOAT_EQ(b, -0.75f);
  EXPECT_EQ(Handler().GetBackgroundWidth(), kImageWidth);
  EXPECT_EQ(Handler().GetBackgroundHeight(), kImageHeight);
  const std::vector<ocr::log::Record> records = log.Records();
  const std::vector<std::string> expected = {
      "Vexel: Init renderer 640 480.", "Vexel: Init background 320 180.",
      "VexelJNI::InitBackground background_width = 320, background_height = 180 \r\n",
      "VexelJNI::InitBackground native_window_width = 640, native_window_height = 480 \r\n",
      "VexelJNI::InitBackground rotation = 0 \r\n"};
  EXPECT_EQ(log.Texts(), expected);
  EXPECT_EQ(records[0].priority, ocr::log::kInfo);
  EXPECT_EQ(records[2].priority, ocr::log::kDebug);
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

TEST_F(RendererBridgeTest, InitWithoutWindowOrWithAnEmptyOneReportsAndReturnsTrue) {
  ocr::log::ScopedCapture log;
  EXPECT_TRUE(bridge::InitFromSurface([] { return nullptr; }, 4, 4));
  EXPECT_TRUE(log.Contains("Vexel: Init failed, s_native_window is null!", ocr::log::kError));
  EXPECT_FALSE(Handler().HasRenderer());

  ANativeWindow* empty = platform::desktop::CreateOffscreenWindow(0, 10);
  EXPECT_TRUE(bridge::InitFromSurface([empty] { return empty; }, 4, 4));  // takes our reference
  EXPECT_TRUE(log.Contains("Vexel: The size of the window is negative", ocr::log::kError));
  EXPECT_FALSE(Handler().HasRenderer());
}

TEST_F(RendererBridgeTest, InitFailureIsLoggedWithItsReasonAndReturnsFalse) {
  ocr::log::ScopedCapture log;
  vexel_recording::FailOn("Renderer");
  EXPECT_FALSE(Init());
  EXPECT_TRUE(log.Contains("Vexel: initFromSurface() ERROR: recording kit: Renderer fails as asked",
                           ocr::log::kError));
  EXPECT_FALSE(Handler().HasRenderer());
  // The next frame does nothing.
  HostFrame frame;
  vexel_recording::ClearJournal();
  Render(frame);
  EXPECT_TRUE(vexel_recording::Journal().empty());
}

TEST_F(RendererBridgeTest, FrameDrawsEachTextAtItsMappedPlace) {
  ASSERT_TRUE(Init());  // 320x180 image in a 640x480 window: 640x360, rows 60..420
  HostFrame frame;
  frame.Add("Exit", {80.0, 45.0, 40.0, 10.0, 0.0}, 7, static_cast<std::int32_t>(0xFF102030u));
  frame.Add("Ausgang", {160.0, 90.0, 60.0, 12.0, -30.0}, 8);
  cv::Mat image(kImageHeight, kImageWidth, CV_8UC4, cv::Scalar::all(50));
  Render(frame, &image);
  EXPECT_TRUE(bridge::GetRenderTranslate());

  const InpaintedTextObject& exit = Current("Exit");
  const auto& patch = NodeState(*exit.patch.object);
  // Image (80, 45) -> window (160, 150) -> camera (-160, 90); sides x2.
  EXPECT_NEAR(patch.position.x, -160.0f, 1e-3f);
  EXPECT_NEAR(patch.position.y, 90.0f, 1e-3f);
  EXPECT_NEAR(patch.scale.x, 40.0f * 2.0f * 1.05f, 1e-3f);
  EXPECT_NEAR(patch.scale.y, 20.0f, 1e-3f);
  EXPECT_EQ(exit.patch.id, 7);
  EXPECT_EQ(exit.slot_index, 0u);
  EXPECT_EQ(NodeState(*exit.text).color, Vexel::Color::fromBytes(0x30, 0x20, 0x10));

  const InpaintedTextObject& ausgang = Current("Ausgang");
  EXPECT_EQ(ausgang.slot_index, 1u);
  EXPECT_NEAR(NodeState(*ausgang.patch.object).rotation, 30.0f, 1e-4f);
  EXPECT_NEAR(NodeState(*ausgang.patch.object).position.x, 0.0f, 1e-3f);
  EXPECT_EQ(StateOf(*Handler().GetBackgroundTexture()).upload_count, 1);
  EXPECT_EQ(CountEntries("Kit.drawAll"), 1);
}

TEST_F(RendererBridgeTest, TextColourIsCorrectedLikeItsPatch) {
  ASSERT_TRUE(Init());
  HostFrame frame;
  frame.Add("Exit", {80.0, 45.0, 40.0, 10.0, 0.0}, 7, static_cast<std::int32_t>(0xFF646464u));
  frame.scales = {2.0, 3.0, 0.5};
  frame.shifts = {10.0, 0.0, -20.0};
  Render(frame);
  EXPECT_EQ(NodeState(*Current("Exit").text).color, Vexel::Color::fromBytes(210, 255, 30));
  const auto& material = StateOf(*Current("Exit").patch.object->getMaterial(0));
  EXPECT_EQ(material.vector_uniforms.at("colorScale").second, Vexel::Vector3(2.0f, 3.0f, 0.5f));
}

TEST_F(RendererBridgeTest, EmptyFrameClearsTextsButStillDrawsTheBackground) {
  ASSERT_TRUE(Init());
  HostFrame frame;
  frame.Add("Exit", {80.0, 45.0, 40.0, 10.0, 0.0}, 7);
  Render(frame);
  HostFrame empty;
  cv::Mat image(kImageHeight, kImageWidth, CV_8UC4);
  vexel_recording::ClearJournal();
  Render(empty, &image);
  EXPECT_FALSE(bridge::GetRenderTranslate());
  EXPECT_EQ(CountEntries("setImage RenderTexture 320x180"), 1);
  EXPECT_EQ(CountEntries("Kit.drawAll"), 1);
  EXPECT_EQ(Handler().GetReusableTextCache().count("Exit"), 1u);  // kept for reuse
  EXPECT_EQ(Handler().GetTextNodes()[0]->getParent(), nullptr);
}

TEST_F(RendererBridgeTest, UnreadableTextStillTakesItsSlot) {
  ASSERT_TRUE(Init());
  HostFrame frame;
  frame.Add(std::nullopt, {80.0, 45.0, 40.0, 10.0, 0.0}, 7, 0x7F00FF00);
  frame.Add("zwei", {80.0, 45.0, 40.0, 10.0, 0.0}, 8);
  ocr::log::ScopedCapture log;
  Render(frame);
  EXPECT_TRUE(log.Contains("Vexel: GetStringUTFChars failed.", ocr::log::kError));
  const InpaintedTextObject& empty = Current("");
  EXPECT_EQ(empty.slot_index, 0u);
  EXPECT_EQ(empty.patch.id, -1);
  EXPECT_EQ(NodeState(*empty.text).color, Vexel::Color(0, 0, 0, 1));
  EXPECT_EQ(NodeState(*empty.patch.object).scale.x, 0.0f);
  EXPECT_EQ(Current("zwei").slot_index, 1u);
}

TEST_F(RendererBridgeTest, EachFailingCallIsLoggedAndTheFrameGoesOn) {
  ASSERT_TRUE(Init());
  HostFrame frame;
  frame.Add("eins", {80.0, 45.0, 40.0, 10.0, 0.0}, 1);
  frame.Add("zwei", {80.0, 45.0, 40.0, 10.0, 0.0}, 2);
  cv::Mat image(kImageHeight, kImageWidth, CV_8UC4);
  ocr::log::ScopedCapture log;
  vexel_recording::FailOn("setImage");
  vexel_recording::FailOn("Kit.drawAll");
  vexel_recording::FailOn("Text.setText");
  Render(frame, &image);
  EXPECT_EQ(log.Count("Vexel: Caught exception in SceneHandler::UpdateBackgroundImage.",
                      ocr::log::kError),
            1);
  EXPECT_EQ(log.Count("Vexel: Caught exception creating text object.", ocr::log::kError), 2);
  EXPECT_EQ(log.Count("Vexel: Caught exception in SceneHandler::RenderOneFrame.", ocr::log::kError),
            1);

  vexel_recording::ClearFailures();
  Render(frame);
  // Slot 1 must leave the scene when only one text comes.
  vexel_recording::FailOn("Node.removeChild");
  HostFrame one;
  one.Add("eins", {80.0, 45.0, 40.0, 10.0, 0.0}, 1);
  Render(one);
  HostFrame empty;
  Render(empty);
  // ClearAllTextObjects catches by itself; ClearTextObjects does not.
  EXPECT_EQ(log.Count("Vexel: Caught exception clearing remaining text objects.", ocr::log::kError),
            1);
  EXPECT_EQ(log.Count("SceneHandler: caught exception in ClearAllTextObjects.", ocr::log::kError),
            1);
}

TEST_F(RendererBridgeTest, LanguageCallsAreGuarded) {
  ASSERT_TRUE(Init());
  ocr::log::ScopedCapture log;
  vexel_recording::FailOn("Font");
  bridge::SetTranslationLanguage("zh-CHS");
  EXPECT_TRUE(log.Contains("Vexel: set translation language: zh-CHS", ocr::log::kInfo));
  EXPECT_TRUE(log.Contains("Vexel: caught exception from SceneHandler::SetTranslationLanguage.",
                           ocr::log::kError));
  vexel_recording::ClearFailures();

  bridge::SetTranslationLanguageFont("de", "/system/fonts/Roboto.ttf");
  EXPECT_TRUE(log.Contains(
      "Vexel: set translation language de to use font: /system/fonts/Roboto.ttf", ocr::log::kInfo));
  EXPECT_EQ(Handler().GetLanguageFonts().at("de"), "/system/fonts/Roboto.ttf");
  bridge::SetTranslationLanguageFont("de", "");
  EXPECT_TRUE(Handler().GetLanguageFonts().empty());
  bridge::SetTranslationLanguageFont("de", nullptr);
  EXPECT_TRUE(log.Contains("Vexel: set translation language de to use font: ", ocr::log::kInfo));
}

TEST_F(RendererBridgeTest, OrientationRebuildsTheBackgroundAndTurnsTheRectangles) {
  ASSERT_TRUE(Init());
  HostFrame frame;
  frame.Add("Exit", {80.0, 45.0, 40.0, 10.0, 0.0}, 7);
  Render(frame);
  ocr::log::ScopedCapture log;
  bridge::SetOrientation(90);
  EXPECT_TRUE(log.Contains("Vexel: Set renderer orientation 90.", ocr::log::kInfo));
  EXPECT_TRUE(log.Contains("VexelJNI::InitBackground rotation = 90 \r\n", ocr::log::kDebug));
  // The host's frames now stand upright: 180 wide, 320 tall.
  EXPECT_EQ(Handler().GetBackgroundWidth(), kImageHeight);
  EXPECT_EQ(Handler().GetBackgroundHeight(), kImageWidth);
  EXPECT_EQ(Handler().GetReusableTextCache().count("Exit"), 1u);  // cleared, not forced

  // Upright image point (45, 240) shows at background (240, 135): window
  // (480, 330), camera (160, -90); the angle turns by -90 (camera +90).
  HostFrame turned;
  turned.Add("Exit", {45.0, 240.0, 40.0, 10.0, 0.0}, 7);
  Render(turned);
  const auto& patch = NodeState(*Current("Exit").patch.object);
  EXPECT_NEAR(patch.position.x, 160.0f, 1e-3f);
  EXPECT_NEAR(patch.position.y, -90.0f, 1e-3f);
  EXPECT_NEAR(patch.rotation, 90.0f, 1e-4f);
  EXPECT_NEAR(patch.scale.x, 84.0f, 1e-3f);
  EXPECT_NEAR(patch.scale.y, 20.0f, 1e-3f);
}

TEST_F(RendererBridgeTest, ShortRectangleArraysAreReportedAndDrawnEmpty) {
  ASSERT_TRUE(Init());
  HostFrame frame;
  frame.Add("eins", {80.0, 45.0, 40.0, 10.0, 0.0}, 1);
  frame.Add("zwei", {80.0, 45.0, 40.0, 10.0, 0.0}, 2);
  frame.text_rects.resize(5);
  ocr::log::ScopedCapture log;
  Render(frame);
  EXPECT_EQ(log.Count("Vexel: renderOneFrame needs 5 values per text in patchRects and "
                      "textRects; missing rectangles are drawn empty.",
                      ocr::log::kError),
            1);
  EXPECT_EQ(NodeState(*Current("zwei").text).scale.x, 0.0f);
}

TEST_F(RendererBridgeTest, LogsEachFrameWithImageAndTextCount) {
  ASSERT_TRUE(Init());
  cv::Mat image(kImageHeight, kImageWidth, CV_8UC4);
  HostFrame frame;
  frame.Add("eins", {80.0, 45.0, 40.0, 10.0, 0.0}, 1);
  ocr::log::ScopedCapture log;
  Render(frame, &image);
  char expected[128];
  std::snprintf(expected, sizeof(expected), "Vexel: renderOneFrame image(%p %d %d) text(%d)",
                static_cast<void*>(image.data), kImageWidth, kImageHeight, 1);
  EXPECT_EQ(log.Count(expected, ocr::log::kInfo), 1);
}

}  // namespace
}  // namespace ocr_ar
