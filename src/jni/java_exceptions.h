#pragma once

#include <jni.h>

#include <utility>

namespace ocr::jni {

// Makes the C++ exception being handled the host's pending Java exception:
// cv::Exception becomes org.opencv.core.CvException (what OpenCV's own Java
// binding throws), std::bad_alloc java.lang.OutOfMemoryError,
// std::invalid_argument (a host's call the engine refuses, such as address 0
// for a required matrix) java.lang.IllegalArgumentException, anything else
// java.lang.RuntimeException; the message is what() where there is one. A
// Java exception already pending (from a failed JNI call) is left as it is.
// Call only from inside a catch block.
void ThrowCurrentExceptionToJava(JNIEnv* env) noexcept;

// Runs one bridge function's body. An exception out of it cannot cross the
// JNI frame (it would end the host's process), so it is handed to the host
// as a Java exception instead and the call returns `neutral`. Nothing is
// logged and nothing undone: the engine does not handle the error, the host
// does.
template <typename Result, typename Body>
Result CallPassingExceptionsToJava(JNIEnv* env, Result neutral, Body&& body) noexcept {
  try {
    return std::forward<Body>(body)();
  } catch (...) {
    ThrowCurrentExceptionToJava(env);
    return neutral;
  }
}

template <typename Body>
void CallPassingExceptionsToJava(JNIEnv* env, Body&& body) noexcept {
  try {
    std::forward<Body>(body)();
  } catch (...) {
    ThrowCurrentExceptionToJava(env);
  }
}

}  // namespace ocr::jni
