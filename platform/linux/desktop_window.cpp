// The desktop ANativeWindow: a reference-counted RGBA frame of a fixed size
// that a renderer presents into and a test or host reads back.
#include <android/native_window.h>

#include <atomic>
#include <cstring>
#include <mutex>
#include <stdexcept>

#include "platform/desktop.h"

struct ANativeWindow {
  ANativeWindow(int w, int h)
      : width(w), height(h), frame(static_cast<std::size_t>(w) * h * 4, 0) {}

  const int width;
  const int height;
  std::atomic<int> references{1};
  std::mutex mutex;
  std::vector<std::uint8_t> frame;  // RGBA, top row first
  std::uint64_t presented = 0;
};

extern "C" {

void ANativeWindow_acquire(ANativeWindow* window) {
  if (window != nullptr)
    window->references.fetch_add(1);
}

void ANativeWindow_release(ANativeWindow* window) {
  if (window != nullptr && window->references.fetch_sub(1) == 1)
    delete window;
}

int32_t ANativeWindow_getWidth(ANativeWindow* window) {
  return window != nullptr ? window->width : -22;  // -EINVAL, as the NDK answers
}

int32_t ANativeWindow_getHeight(ANativeWindow* window) {
  return window != nullptr ? window->height : -22;
}

}  // extern "C"

namespace platform::desktop {

ANativeWindow* CreateOffscreenWindow(int width, int height) {
  if (width < 0 || height < 0)
    throw std::invalid_argument("offscreen window size must not be negative");
  return new ANativeWindow(width, height);
}

void PresentFrame(ANativeWindow* window, const std::uint8_t* bottom_up_rgba) {
  const std::size_t row_bytes = static_cast<std::size_t>(window->width) * 4;
  std::lock_guard<std::mutex> lock(window->mutex);
  for (int row = 0; row < window->height; ++row) {
    const std::uint8_t* source = bottom_up_rgba + (window->height - 1 - row) * row_bytes;
    std::memcpy(window->frame.data() + row * row_bytes, source, row_bytes);
  }
  ++window->presented;
}

std::vector<std::uint8_t> ReadFrame(ANativeWindow* window) {
  std::lock_guard<std::mutex> lock(window->mutex);
  return window->frame;
}

std::uint64_t PresentedFrameCount(ANativeWindow* window) {
  std::lock_guard<std::mutex> lock(window->mutex);
  return window->presented;
}

}  // namespace platform::desktop
