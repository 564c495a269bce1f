#pragma once

// Compile-check stand-in for the NDK's <android/native_window.h>, which
// Debian does not ship: the declarations the phone build calls, with the
// NDK's signatures. Nothing links against it.
#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

typedef struct ANativeWindow ANativeWindow;

enum ANativeWindow_LegacyFormat {
  WINDOW_FORMAT_RGBA_8888 = 1,
  WINDOW_FORMAT_RGBX_8888 = 2,
  WINDOW_FORMAT_RGB_565 = 4,
};

void ANativeWindow_acquire(ANativeWindow* window);
void ANativeWindow_release(ANativeWindow* window);
int32_t ANativeWindow_getWidth(ANativeWindow* window);
int32_t ANativeWindow_getHeight(ANativeWindow* window);
int32_t ANativeWindow_getFormat(ANativeWindow* window);
int32_t ANativeWindow_setBuffersGeometry(ANativeWindow* window, int32_t width, int32_t height,
                                         int32_t format);

#ifdef __cplusplus
}
#endif
