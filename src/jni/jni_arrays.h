#pragma once

#include <jni.h>

#include <cstddef>

// RAII helpers for the bridge files: an array's elements or a string's UTF-8
// chars are released exactly once, with the mode the call needs, whatever
// path the bridge function leaves by.
namespace ocr::jni {

template <typename ArrayT>
struct ArrayTraits;

#define OCR_JNI_ARRAY_TRAITS(ArrayType, ElementType, Name)                            \
  template <>                                                                         \
  struct ArrayTraits<ArrayType> {                                                     \
    using Element = ElementType;                                                      \
    static Element* Get(JNIEnv* env, ArrayType array, jboolean* is_copy) {            \
      return env->Get##Name##ArrayElements(array, is_copy);                           \
    }                                                                                 \
    static void Release(JNIEnv* env, ArrayType array, Element* elements, jint mode) { \
      env->Release##Name##ArrayElements(array, elements, mode);                       \
    }                                                                                 \
  };

OCR_JNI_ARRAY_TRAITS(jdoubleArray, jdouble, Double)
OCR_JNI_ARRAY_TRAITS(jfloatArray, jfloat, Float)
OCR_JNI_ARRAY_TRAITS(jlongArray, jlong, Long)
OCR_JNI_ARRAY_TRAITS(jintArray, jint, Int)
OCR_JNI_ARRAY_TRAITS(jbyteArray, jbyte, Byte)
#undef OCR_JNI_ARRAY_TRAITS

// What releasing the elements does with what the engine wrote into them.
enum class OnRelease : jint {
  kCopyBack = 0,         // copy back into the Java array, then free
  kDiscard = JNI_ABORT,  // free without copying back: the array stays as it was
};

// The elements of a primitive Java array, pinned or copied by the VM. A null
// array, or one the VM could not pin or copy, gives no elements and size 0,
// so that a loop over size() never reads through a null pointer. The release mode is chosen where
// the elements are taken, so every path out of the bridge function releases them the same way;
// Release frees them early, Discard frees them early without copying back whatever the mode (a call
// that failed after writing nothing).
template <typename ArrayT>
class ArrayElements {
 public:
  using Element = typename ArrayTraits<ArrayT>::Element;

  ArrayElements(JNIEnv* env, ArrayT array, OnRelease mode) : env_(env), array_(array), mode_(mode) {
    if (array_ != nullptr) {
      elements_ = ArrayTraits<ArrayT>::Get(env_, array_, &is_copy_);
      if (elements_ != nullptr)
        length_ = static_cast<size_t>(env_->GetArrayLength(array_));
    }
  }
  ~ArrayElements() { Release(); }
  ArrayElements(const ArrayElements&) = delete;
  ArrayElements& operator=(const ArrayElements&) = delete;

  // Both release at most once; a later call, or the destructor, does nothing.
  void Release() { ReleaseWith(mode_); }
  void Discard() { ReleaseWith(OnRelease::kDiscard); }

  Element* data() const { return elements_; }
  size_t size() const { return length_; }
  bool is_copy() const { return is_copy_ == JNI_TRUE; }
  explicit operator bool() const { return elements_ != nullptr; }
  Element& operator[](size_t i) const { return elements_[i]; }

 private:
  JNIEnv* env_;
  ArrayT array_;
  Element* elements_ = nullptr;
  size_t length_ = 0;
  jboolean is_copy_ = JNI_FALSE;
  OnRelease mode_;

  void ReleaseWith(OnRelease mode) {
    if (elements_ != nullptr) {
      ArrayTraits<ArrayT>::Release(env_, array_, elements_, static_cast<jint>(mode));
      elements_ = nullptr;
    }
  }
};

// The modified UTF-8 chars of a Java string; null when the string is null or
// the VM could not provide them.
class UtfChars {
 public:
  UtfChars(JNIEnv* env, jstring string) : env_(env), string_(string) {
    if (string_ != nullptr)
      chars_ = env_->GetStringUTFChars(string_, nullptr);
  }
  ~UtfChars() { Release(); }
  UtfChars(const UtfChars&) = delete;
  UtfChars& operator=(const UtfChars&) = delete;

  void Release() {
    if (chars_ != nullptr) {
      env_->ReleaseStringUTFChars(string_, chars_);
      chars_ = nullptr;
    }
  }

  const char* c_str() const { return chars_; }
  explicit operator bool() const { return chars_ != nullptr; }

 private:
  JNIEnv* env_;
  jstring string_;
  const char* chars_ = nullptr;
};

}  // namespace ocr::jni
