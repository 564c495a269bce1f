#pragma once

#include <android/native_window.h>
#include <gtest/gtest.h>

#include <string>

#include "platform/desktop.h"
#include "recording_kit.h"
#include "renderer/scene_handler.h"

namespace ocr_ar::testing {

// A scene handler initialised on a 640x480 offscreen window over the
// recording kit, torn down after each test.
class RecordingScene : public ::testing::Test {
 protected:
  static constexpr int kWidth = 640;
  static constexpr int kHeight = 480;

  void SetUp() override {
    vexel_recording::ClearJournal();
    vexel_recording::ClearFailures();
    window_ = platform::desktop::CreateOffscreenWindow(kWidth, kHeight);
  }
  void TearDown() override {
    vexel_recording::ClearFailures();
    SceneHandler::DeleteInstance();
    ANativeWindow_release(window_);
  }

  SceneHandler& Handler() {
    SceneHandler& handler = *SceneHandler::Instance();
    if (!handler.HasRenderer())
      handler.Init(window_, nullptr, kWidth, kHeight, {}, {});
    return handler;
  }

  // Draws `text` in slot `index` with a patch of `id` (null pixels unless
  // given) at a fixed place.
  void Draw(unsigned int index, const std::string& text, long id = -1, const void* patch = nullptr,
            int patch_width = 0, int patch_height = 0) {
    PositionScaleAngle text_place{10.0f, 20.0f, 200.0f, 40.0f, 0.0f};
    PositionScaleAngle patch_place{10.0f, 20.0f, 210.0f, 40.0f, 0.0f};
    Handler().DrawTextObject(index, text, text_place, Color::FromPacked(kDefaultTextColor), id,
                             patch, nullptr, nullptr, patch_width, patch_height, patch_place);
  }

  // Size of the cache's list under `text` (0 when the key is absent).
  static std::size_t CachedCount(const TextObjectCache& cache, const std::string& text) {
    const auto found = cache.find(text);
    return found != cache.end() ? found->second.size() : 0;
  }

  static Vexel::Node* Root(SceneHandler& handler) { return handler.GetScene()->getRootNode(); }

  ANativeWindow* window_ = nullptr;
};

}  // namespace ocr_ar::testing
