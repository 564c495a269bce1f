// JNI side of the desktop stand-ins: the natives of
// org.vexel.desktop.OffscreenSurface and DirectoryAssetManager, and the two
// NDK calls that turn those Java objects into the native ones.
#include <android/asset_manager_jni.h>
#include <android/native_window_jni.h>
#include <jni.h>

#include <exception>
#include <string>
#include <vector>

#include "platform/desktop.h"

#define DESKTOP_JNI extern "C" JNIEXPORT

namespace {

// The native handle in a long field of `object`; 0 when it has none.
jlong HandleField(JNIEnv* env, jobject object, const char* field) {
  if (env == nullptr || object == nullptr)
    return 0;
  jclass type = env->GetObjectClass(object);
  jfieldID id = env->GetFieldID(type, field, "J");
  env->DeleteLocalRef(type);
  if (id == nullptr) {
    env->ExceptionClear();  // not one of our desktop objects
    return 0;
  }
  return env->GetLongField(object, id);
}

void ThrowJava(JNIEnv* env, const char* type, const char* message) {
  jclass exception = env->FindClass(type);
  if (exception != nullptr)
    env->ThrowNew(exception, message);
}

std::string ToString(JNIEnv* env, jstring text) {
  const char* chars = env->GetStringUTFChars(text, nullptr);
  if (chars == nullptr)
    return {};
  std::string copy(chars);
  env->ReleaseStringUTFChars(text, chars);
  return copy;
}

jbyteArray ToByteArray(JNIEnv* env, const std::vector<std::uint8_t>& bytes) {
  jbyteArray array = env->NewByteArray(static_cast<jsize>(bytes.size()));
  if (array != nullptr) {
    env->SetByteArrayRegion(array, 0, static_cast<jsize>(bytes.size()),
                            reinterpret_cast<const jbyte*>(bytes.data()));
  }
  return array;
}

ANativeWindow* Window(jlong handle) {
  return reinterpret_cast<ANativeWindow*>(handle);
}

AAssetManager* Assets(jlong handle) {
  return reinterpret_cast<AAssetManager*>(handle);
}

}  // namespace

extern "C" {

ANativeWindow* ANativeWindow_fromSurface(JNIEnv* env, jobject surface) {
  ANativeWindow* window = Window(HandleField(env, surface, "nativeWindow"));
  ANativeWindow_acquire(window);
  return window;
}

AAssetManager* AAssetManager_fromJava(JNIEnv* env, jobject assetManager) {
  return Assets(HandleField(env, assetManager, "nativeAssetManager"));
}

}  // extern "C"

DESKTOP_JNI jlong JNICALL Java_org_vexel_desktop_OffscreenSurface_nativeCreate(JNIEnv* env, jclass,
                                                                               jint width,
                                                                               jint height) {
  try {
    return reinterpret_cast<jlong>(platform::desktop::CreateOffscreenWindow(width, height));
  } catch (const std::exception& error) {
    ThrowJava(env, "java/lang/IllegalArgumentException", error.what());
    return 0;
  }
}

DESKTOP_JNI void JNICALL Java_org_vexel_desktop_OffscreenSurface_nativeRelease(JNIEnv*, jclass,
                                                                               jlong window) {
  ANativeWindow_release(Window(window));
}

DESKTOP_JNI jbyteArray JNICALL
Java_org_vexel_desktop_OffscreenSurface_nativeReadPixels(JNIEnv* env, jclass, jlong window) {
  return ToByteArray(env, platform::desktop::ReadFrame(Window(window)));
}

DESKTOP_JNI jlong JNICALL Java_org_vexel_desktop_OffscreenSurface_nativeFrameCount(JNIEnv*, jclass,
                                                                                   jlong window) {
  return static_cast<jlong>(platform::desktop::PresentedFrameCount(Window(window)));
}

DESKTOP_JNI jlong JNICALL
Java_org_vexel_desktop_DirectoryAssetManager_nativeCreate(JNIEnv* env, jclass, jstring directory) {
  return reinterpret_cast<jlong>(
      platform::desktop::CreateDirectoryAssetManager(ToString(env, directory)));
}

DESKTOP_JNI void JNICALL Java_org_vexel_desktop_DirectoryAssetManager_nativeDestroy(JNIEnv*, jclass,
                                                                                    jlong manager) {
  platform::desktop::DestroyDirectoryAssetManager(Assets(manager));
}

DESKTOP_JNI jbyteArray JNICALL Java_org_vexel_desktop_DirectoryAssetManager_nativeRead(
    JNIEnv* env, jclass, jlong manager, jstring name) {
  const std::string file = ToString(env, name);
  AAsset* asset = AAssetManager_open(Assets(manager), file.c_str(), AASSET_MODE_BUFFER);
  if (asset == nullptr)
    return nullptr;
  const auto* data = static_cast<const std::uint8_t*>(AAsset_getBuffer(asset));
  std::vector<std::uint8_t> bytes(data, data + AAsset_getLength64(asset));
  AAsset_close(asset);
  return ToByteArray(env, bytes);
}
