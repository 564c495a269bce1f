#include "jni/java_exceptions.h"

#include <exception>
#include <new>
#include <stdexcept>

#include <opencv2/core.hpp>

namespace ocr::jni {
namespace {

// Throws a new `class_name` with `message` (none when null). Returns false
// when the class cannot be found, with nothing pending.
bool ThrowNew(JNIEnv* env, const char* class_name, const char* message) {
  jclass type = env->FindClass(class_name);
  if (type == nullptr) {
    env->ExceptionClear();
    return false;
  }
  env->ThrowNew(type, message);
  env->DeleteLocalRef(type);
  return true;
}

}  // namespace

void ThrowCurrentExceptionToJava(JNIEnv* env) noexcept {
  if (env->ExceptionCheck())
    return;
  try {
    throw;
  } catch (const cv::Exception& error) {
    // A host without OpenCV's Java classes on its class path still gets the
    // message, as a RuntimeException.
    if (!ThrowNew(env, "org/opencv/core/CvException", error.what()))
      ThrowNew(env, "java/lang/RuntimeException", error.what());
  } catch (const std::bad_alloc& error) {
    ThrowNew(env, "java/lang/OutOfMemoryError", error.what());
  } catch (const std::invalid_argument& error) {
    ThrowNew(env, "java/lang/IllegalArgumentException", error.what());
  } catch (const std::exception& error) {
    ThrowNew(env, "java/lang/RuntimeException", error.what());
  } catch (...) {
    ThrowNew(env, "java/lang/RuntimeException", nullptr);
  }
}

}  // namespace ocr::jni
