#pragma once

// Linux counterpart of the NDK's <android/native_window.h>: the subset the
// engine and the scene kit call. On Linux a window is an offscreen RGBA
// surface (see platform/desktop.h).
#include <android/api.h>

#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

typedef struct ANativeWindow ANativeWindow;

ANDROID_DESKTOP_API void ANativeWindow_acquire(ANativeWindow* window);
ANDROID_DESKTOP_API void ANativeWindow_release(ANativeWindow* window);
ANDROID_DESKTOP_API int32_t ANativeWindow_getWidth(ANativeWindow* window);
ANDROID_DESKTOP_API int32_t ANativeWindow_getHeight(ANativeWindow* window);

#ifdef __cplusplus
}
#endif
