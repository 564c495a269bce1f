#pragma once

#include <android/native_window.h>
#include <gtest/gtest.h>

#include <opencv2/core.hpp>
#include <optional>
#include <string>
#include <vector>

#include "platform/desktop.h"
#include "recording_kit.h"
#include "renderer/frame_mapping.h"
#include "renderer/renderer_bridge.h"
#include "renderer/scene_handler.h"

namespace ocr_ar::testing {

using vexel_recording::CountEntries;
using vexel_recording::FindEntry;
using vexel_recording::Journal;
using vexel_recording::LiveCount;

// One frame's host data: per text, one rectangle given for both its patch
// and its text, an 8x4 RGBA patch and no colour correction.
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
