#pragma once

#include <cstddef>
#include <functional>
#include <optional>
#include <string>

#include "renderer/frame_mapping.h"

struct AAssetManager;
struct ANativeWindow;

namespace cv {
class Mat;
}

// What the renderer's JNI entry points do, on native types: the bridge-wide
// state (asset manager, window, background size, orientation,
// render-translate flag), the background initialiser and the per-frame
// unpacking and mapping into scene handler calls. Every scene handler call
// is guarded: a failure is logged with a fixed message naming the call, and
// the bridge carries on. Render thread only.
namespace ocr_ar::bridge {

void SetAssetManager(AAssetManager* assets);

// `acquire_window` yields the surface's window with one reference held for
// the bridge (released by ShutDown), or null. Returns false only when an
// exception was caught.
bool InitFromSurface(const std::function<ANativeWindow*()>& acquire_window, int backgroundWidth,
                     int backgroundHeight);
void ShutDown();
void SetOrientation(int orientation);
void SetTranslationLanguage(const char* language);
// `fontPath` may be null; null or empty returns the language to its default
// font.
void SetTranslationLanguageFont(const char* language, const char* fontPath);

// Text `index` of the frame, or nothing when its string cannot be read.
using TextReader = std::function<std::optional<std::string>(std::size_t index)>;

// What a frame call does after bringing the scene up to date.
enum class FrameEnd {
  kDraw,  // the host's renderOneFrame: logged, then drawn
  // Neither the call's log line nor the draw: the bridge's own work alone,
  // which is what the renderer benchmark measures apart from drawing.
  kSceneOnly,
};

// One camera frame: the background image (null or empty: the background is
// kept), `textCount` texts read through `readText` with the per-text arrays.
// Without a renderer it does nothing beyond the log line.
void RenderOneFrame(const cv::Mat* image, std::size_t textCount, const TextReader& readText,
                    const FrameArrays& arrays, FrameEnd end = FrameEnd::kDraw);

bool GetRenderTranslate();

// Fits the background into the window, builds it under `rotation` and
// stores the size and orientation.
void InitBackground(ANativeWindow* window, int backgroundWidth, int backgroundHeight, int rotation);

// Capacity of the direct buffer over a matrix's pixels: rows x cols x the
// size of one channel element. The channel count is deliberately left out (a
// 4-channel 8-bit matrix yields rows x cols bytes).
std::size_t MatByteBufferCapacity(const cv::Mat& mat);

}  // namespace ocr_ar::bridge
