#pragma once

// Linux counterpart of the NDK's <android/native_window_jni.h>.
#include <android/native_window.h>
#include <jni.h>

#ifdef __cplusplus
extern "C" {
#endif

// The window behind a Java surface, with one reference acquired for the
// caller (release it with ANativeWindow_release); null when `surface` is not
// an open org.vexel.desktop.OffscreenSurface.
ANDROID_DESKTOP_API ANativeWindow* ANativeWindow_fromSurface(JNIEnv* env, jobject surface);

#ifdef __cplusplus
}
#endif
