// JNI side of the desktop stand-ins: the natives of
// org.vexel.desktop.OffscreenSurface and DirectoryAssetManager, and the two
// NDK calls that turn those Java objects into the native ones.
#include <android/asset_manager_jni.h>
#include <android/native_window_jni.h>
#include <jni.h>

#include <exception>
#include <memory>
#include <new>
#include <stdexcept>
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

void ThrowJava(JNIEnv* env, const char* type, const char* message) noexcept {
  jclass exception = env->FindClass(type);
  if (exception != nullptr)
    env->ThrowNew(exception, message);
}

// Thrown for a null argument that Java would answer with a
// NullPointerException naming it.
struct NullArgument {
  const char* name;
};

// Runs one native method's body; a C++ exception out of it would end the
// JVM, so it becomes the caller's Java exception (unless a failed JNI call
// left one already) and the method returns `neutral`: a null argument a
// NullPointerException, a refused one an IllegalArgumentException, no memory
// an OutOfMemoryError, anything else a RuntimeException, each with what() as
// its message.
template <typename Result, typename Body>
Result Guarded(JNIEnv* env, Result neutral, Body&& body) noexcept {
  try {
    return body();
  } catch (const NullArgument& null) {
    if (!env->ExceptionCheck())
      ThrowJava(env, "java/lang/NullPointerException", null.name);
  } catch (const std::invalid_argument& error) {
    if (!env->ExceptionCheck())
      ThrowJava(env, "java/lang/IllegalArgumentException", error.what());
  } catch (const std::bad_alloc& error) {
    if (!env->ExceptionCheck())
      ThrowJava(env, "java/lang/OutOfMemoryError", error.what());
  } catch (const std::exception& error) {
    if (!env->ExceptionCheck())
      ThrowJava(env, "java/lang/RuntimeException", error.what());
  } catch (...) {
    if (!env->ExceptionCheck())
      ThrowJava(env, "java/lang/RuntimeException", "unknown native error");
  }
  return neutral;
}

// The string's characters; throws NullArgument for null and std::bad_alloc
// when the VM has no memory for them (its OutOfMemoryError is then pending).
std::string ToString(JNIEnv* env, jstring text, const char* name) {
  if (text == nullptr)
    throw NullArgument{name};
  const char* chars = env->GetStringUTFChars(text, nullptr);
  if (chars == nullptr)
    throw std::bad_alloc();
  std::string copy(chars);
  env->ReleaseStringUTFChars(text, chars);
  return copy;
}

// Null (with the VM's OutOfMemoryError pending) when the array cannot be made.
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
  return Guarded(env, jlong{0}, [&] {
    return reinterpret_cast<jlong>(platform::desktop::CreateOffscreenWindow(width, height));
  });
}

DESKTOP_JNI void JNICALL Java_org_vexel_desktop_OffscreenSurface_nativeRelease(JNIEnv*, jclass,
                                                                               jlong window) {
  ANativeWindow_release(Window(window));
}

DESKTOP_JNI jbyteArray JNICALL
Java_org_vexel_desktop_OffscreenSurface_nativeReadPixels(JNIEnv* env, jclass, jlong window) {
  // The copy of a large frame can find no memory.
  return Guarded(env, jbyteArray{nullptr},
                 [&] { return ToByteArray(env, platform::desktop::ReadFrame(Window(window))); });
}

DESKTOP_JNI jlong JNICALL Java_org_vexel_desktop_OffscreenSurface_nativeFrameCount(JNIEnv*, jclass,
                                                                                   jlong window) {
  return static_cast<jlong>(platform::desktop::PresentedFrameCount(Window(window)));
}

DESKTOP_JNI jlong JNICALL
Java_org_vexel_desktop_DirectoryAssetManager_nativeCreate(JNIEnv* env, jclass, jstring directory) {
  return Guarded(env, jlong{0}, [&] {
    return reinterpret_cast<jlong>(
        platform::desktop::CreateDirectoryAssetManager(ToString(env, directory, "directory")));
  });
}

DESKTOP_JNI void JNICALL Java_org_vexel_desktop_DirectoryAssetManager_nativeDestroy(JNIEnv*, jclass,
                                                                                    jlong manager) {
  platform::desktop::DestroyDirectoryAssetManager(Assets(manager));
}

DESKTOP_JNI jbyteArray JNICALL Java_org_vexel_desktop_DirectoryAssetManager_nativeRead(
    JNIEnv* env, jclass, jlong manager, jstring name) {
  return Guarded(env, jbyteArray{nullptr}, [&]() -> jbyteArray {
    const std::string file = ToString(env, name, "name");
    const std::unique_ptr<AAsset, decltype(&AAsset_close)> asset(
        AAssetManager_open(Assets(manager), file.c_str(), AASSET_MODE_BUFFER), &AAsset_close);
    if (asset == nullptr)
      return nullptr;
    const auto* data = static_cast<const std::uint8_t*>(AAsset_getBuffer(asset.get()));
    const std::vector<std::uint8_t> bytes(data, data + AAsset_getLength64(asset.get()));
    return ToByteArray(env, bytes);
  });
}
