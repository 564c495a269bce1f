#pragma once

// Linux counterpart of the NDK's <android/asset_manager_jni.h>.
#include <android/asset_manager.h>
#include <jni.h>

#ifdef __cplusplus
extern "C" {
#endif

// The asset manager behind an org.vexel.desktop.DirectoryAssetManager; it
// stays valid while that Java object is open. Null for any other object.
ANDROID_DESKTOP_API AAssetManager* AAssetManager_fromJava(JNIEnv* env, jobject assetManager);

#ifdef __cplusplus
}
#endif
