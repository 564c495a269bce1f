#pragma once

#include <android/native_window.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "platform/desktop.h"
#include "recording_kit.h"
#include "renderer/renderer_bridge.h"
#include "renderer/scene_handler.h"

namespace ocr_ar::testing {

using vexel_recording::CountEntries;
using vexel_recording::FindEntry;
using vexel_recording::Journal;
using vexel_recording::LiveCount;

// The scene handler over the recording kit with a 640x480 offscreen window;
// shut down after each test like the host does.
class RecordingScene : public ::testing::Test {
 protected:
  void SetUp() override { Journal().clear(); }
  void TearDown() override {
    vexel_recording::Failures().clear();
    bridge::ShutDown();
    ANativeWindow_release(window_);
  }

  // The handler, initialised directly (without the bridge) on first use.
  SceneHandler& Handler() {
    SceneHandler& handler = *SceneHandler::Instance();
    if (!handler.HasRenderer())
      handler.Init(window_, nullptr, 640, 480, {}, {});
    return handler;
  }

  // Draws `text` in slot `index` at a fixed place, over a patch of `id`
  // that has 8x6 pixels when `with_pixels`.
  void Draw(unsigned int index, const std::string& text, long id = -1, bool with_pixels = false) {
    const PositionScaleAngle place{10.0f, 20.0f, 200.0f, 40.0f, 0.0f};
    Handler().DrawTextObject(index, text, place, Color(), id,
                             with_pixels ? pixels_.data() : nullptr, nullptr, nullptr,
                             with_pixels ? 8 : 0, with_pixels ? 6 : 0, place);
  }

  const InpaintedTextObject& Current(const std::string& text) {
    return Handler().GetCurrentTextCache().at(text).front();
  }
  std::size_t Cached(const std::string& text) {
    const auto found = Handler().GetReusableTextCache().find(text);
    return found != Handler().GetReusableTextCache().end() ? found->second.size() : 0;
  }
  Vexel::Node* Root() { return Handler().GetScene()->getRootNode(); }
  Vexel::Node* Slot(std::size_t index) { return Handler().GetTextNodes().at(index).get(); }

  ANativeWindow* window_ = platform::desktop::CreateOffscreenWindow(640, 480);
  std::vector<unsigned char> pixels_ = std::vector<unsigned char>(8 * 6 * 4, 128);
};

}  // namespace ocr_ar::testing
