// renderOneFrame as the host calls it, headless with the real kit: a
// 1280x720 RGBA camera frame and 20 translated texts, each with a 240x40
// RGBA patch. Split into the bridge's own work (unpacking, mapping, cache
// bookkeeping, text fitting, the camera-frame upload) and the draw.
//
// Steady: the same texts and patch ids every frame, as while the camera
// rests on a sign (cached texts, no patch upload). New texts: every frame
// brings 20 texts never seen before (layout and patch upload each time).
#include <android/asset_manager.h>
#include <android/native_window.h>
#include <benchmark/benchmark.h>

#include <cstdlib>
#include <opencv2/core.hpp>
#include <string>
#include <vector>

#include "platform/desktop.h"
#include "renderer/renderer_bridge.h"
#include "renderer/scene_handler.h"

namespace {

constexpr int kWidth = 1280;
constexpr int kHeight = 720;
constexpr int kTexts = 20;

// A frame as the host hands it over: image, texts and the per-text arrays.
class HostFrame {
 public:
  HostFrame() : image_(kHeight, kWidth, CV_8UC4) {
    cv::RNG rng(7);
    rng.fill(image_, cv::RNG::UNIFORM, 0, 256);
    for (int i = 0; i < kTexts; ++i) {
      const double x = 330.0 + 620.0 * (i % 2);
      const double y = 30.0 + 34.0 * i;
      const double angle = -4.0 + (i % 5) * 2.0;
      for (double v : {x, y, 560.0, 30.0, angle})
        patch_rects_.push_back(v);
      for (double v : {x, y, 533.0, 28.0, angle})
        text_rects_.push_back(v);
      ids_.push_back(i);
      patches_.emplace_back(40, 240, CV_8UC4);
      rng.fill(patches_.back(), cv::RNG::UNIFORM, 0, 256);
      colors_.push_back(static_cast<std::int32_t>(0xFF202020u));
      scales_.insert(scales_.end(), {1.05, 0.98, 1.0});
      shifts_.insert(shifts_.end(), {-3.0, 2.0, 0.0});
    }
    for (const cv::Mat& patch : patches_)
      addresses_.push_back(reinterpret_cast<std::int64_t>(&patch));
    SetTexts(0);
  }

  // Texts of generation `generation`: the same generation, the same texts.
  void SetTexts(long generation) {
    texts_.clear();
    for (int i = 0; i < kTexts; ++i) {
      texts_.push_back("Ausgang " + std::to_string(generation) + " Gleis " + std::to_string(i) +
                       " Richtung Hauptbahnhof");
      ids_[static_cast<std::size_t>(i)] = generation * kTexts + i;
    }
  }

  ocr_ar::FrameArrays Arrays() const {
    ocr_ar::FrameArrays a;
    a.patch_rects = {patch_rects_.data(), patch_rects_.size()};
    a.text_rects = {text_rects_.data(), text_rects_.size()};
    a.ids = {ids_.data(), ids_.size()};
    a.patch_mat_addrs = {addresses_.data(), addresses_.size()};
    a.color_scales = {scales_.data(), scales_.size()};
    a.color_shifts = {shifts_.data(), shifts_.size()};
    a.colors = {colors_.data(), colors_.size()};
    return a;
  }
  ocr_ar::bridge::TextReader Reader() const {
    return [this](std::size_t i) { return std::optional<std::string>(texts_[i]); };
  }
  const cv::Mat& image() const { return image_; }

 private:
  cv::Mat image_;
  std::vector<std::string> texts_;
  std::vector<double> patch_rects_;
  std::vector<double> text_rects_;
  std::vector<std::int64_t> ids_;
  std::vector<cv::Mat> patches_;
  std::vector<std::int64_t> addresses_;
  std::vector<double> scales_;
  std::vector<double> shifts_;
  std::vector<std::int32_t> colors_;
};

// The renderer initialised on a headless 1280x720 window.
class Renderer {
 public:
  Renderer()
      : window_(platform::desktop::CreateOffscreenWindow(kWidth, kHeight)),
        assets_(platform::desktop::CreateDirectoryAssetManager(OCR_ASSET_DIR)) {
    setenv("OCRAR_LOG_LEVEL", "6", 1);
    ocr_ar::bridge::SetAssetManager(assets_);
    ANativeWindow_acquire(window_);
    ocr_ar::bridge::InitFromSurface([this] { return window_; }, kWidth, kHeight);
    ocr_ar::bridge::SetTranslationLanguage("de");
  }
  ~Renderer() {
    ocr_ar::bridge::ShutDown();
    platform::desktop::DestroyDirectoryAssetManager(assets_);
    ANativeWindow_release(window_);
  }

 private:
  ANativeWindow* window_;
  AAssetManager* assets_;
};

void Render(const HostFrame& frame, bool with_image) {
  ocr_ar::bridge::RenderOneFrame(with_image ? &frame.image() : nullptr, kTexts, frame.Reader(),
                                 frame.Arrays());
}

void Update(const HostFrame& frame, bool with_image) {
  ocr_ar::bridge::RenderOneFrame(with_image ? &frame.image() : nullptr, kTexts, frame.Reader(),
                                 frame.Arrays(), ocr_ar::bridge::FrameEnd::kSceneOnly);
}

// The whole call: update and draw.
void BM_RenderOneFrame_Steady(benchmark::State& state) {
  Renderer renderer;
  HostFrame frame;
  Render(frame, true);
  for (auto _ : state)
    Render(frame, true);
}
BENCHMARK(BM_RenderOneFrame_Steady)->Unit(benchmark::kMillisecond)->UseRealTime();

// The bridge's work without the draw, camera-frame upload included.
void BM_BridgeWork_Steady(benchmark::State& state) {
  Renderer renderer;
  HostFrame frame;
  Render(frame, true);
  for (auto _ : state)
    Update(frame, true);
}
BENCHMARK(BM_BridgeWork_Steady)->Unit(benchmark::kMillisecond)->UseRealTime();

// The bridge's work without the draw and without a camera frame: unpacking,
// mapping, cache bookkeeping and text fitting alone.
void BM_BridgeWork_Steady_NoImage(benchmark::State& state) {
  Renderer renderer;
  HostFrame frame;
  Render(frame, true);
  for (auto _ : state)
    Update(frame, false);
}
BENCHMARK(BM_BridgeWork_Steady_NoImage)->Unit(benchmark::kMicrosecond)->UseRealTime();

// The draw alone (Kit::drawAll through the scene handler).
void BM_Draw(benchmark::State& state) {
  Renderer renderer;
  HostFrame frame;
  Render(frame, true);
  for (auto _ : state)
    ocr_ar::SceneHandler::Instance()->RenderOneFrame();
}
BENCHMARK(BM_Draw)->Unit(benchmark::kMillisecond)->UseRealTime();

// Every frame 20 new texts: built, laid out and their patches uploaded.
void BM_RenderOneFrame_NewTexts(benchmark::State& state) {
  Renderer renderer;
  HostFrame frame;
  long generation = 0;
  for (auto _ : state) {
    frame.SetTexts(++generation);
    Render(frame, true);
  }
}
BENCHMARK(BM_RenderOneFrame_NewTexts)->Unit(benchmark::kMillisecond)->UseRealTime();

void BM_BridgeWork_NewTexts(benchmark::State& state) {
  Renderer renderer;
  HostFrame frame;
  long generation = 0;
  for (auto _ : state) {
    frame.SetTexts(++generation);
    Update(frame, true);
  }
}
BENCHMARK(BM_BridgeWork_NewTexts)->Unit(benchmark::kMillisecond)->UseRealTime();

}  // namespace
