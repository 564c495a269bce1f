#pragma once

#include <android/asset_manager.h>
#include <android/native_window.h>

#include <cstdint>
#include <string>
#include <vector>

// Desktop-only operations of the stand-in system library: making the two
// Android objects without a Java side, and reading back what was drawn.
namespace platform::desktop {

// An offscreen window of the given size (0 allowed, negative throws
// std::invalid_argument) with one reference held by the caller.
ANDROID_DESKTOP_API ANativeWindow* CreateOffscreenWindow(int width, int height);

// Replaces the window's frame. `bottom_up_rgba` holds width x height RGBA
// pixels, the bottom row first (as a GL framebuffer is read); the window
// keeps them top row first.
ANDROID_DESKTOP_API void PresentFrame(ANativeWindow* window, const std::uint8_t* bottom_up_rgba);

// The last presented frame, RGBA, top row first; all zero before the first.
ANDROID_DESKTOP_API std::vector<std::uint8_t> ReadFrame(ANativeWindow* window);
ANDROID_DESKTOP_API std::uint64_t PresentedFrameCount(ANativeWindow* window);

// An asset manager over the files under `directory`.
ANDROID_DESKTOP_API AAssetManager* CreateDirectoryAssetManager(const std::string& directory);
ANDROID_DESKTOP_API void DestroyDirectoryAssetManager(AAssetManager* manager);

}  // namespace platform::desktop
