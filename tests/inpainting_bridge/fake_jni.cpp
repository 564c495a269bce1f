#include "fake_jni.h"

#include <algorithm>
#include <cstring>

namespace ocr_testing {
namespace {

FakeArray& ArrayOf(jarray array) {
  return *reinterpret_cast<FakeArray*>(array);
}

template <typename T>
T* GetElements(std::vector<T>& values, FakeArray& a, jboolean* is_copy) {
  ++a.gets;
  if (a.fail_elements)
    return nullptr;
  if (is_copy != nullptr)
    *is_copy = a.hand_out_copy ? JNI_TRUE : JNI_FALSE;
  if (!a.hand_out_copy)
    return values.data();
  T* copy = new T[values.size() + 1];
  std::copy(values.begin(), values.end(), copy);
  return copy;
}

template <typename T>
void ReleaseElements(std::vector<T>& values, FakeArray& a, T* elements, jint mode) {
  a.release_modes.push_back(mode);
  if (!a.hand_out_copy)
    return;
  if (mode != JNI_ABORT)
    std::copy(elements, elements + values.size(), values.begin());
  if (mode != JNI_COMMIT)
    delete[] elements;
}

}  // namespace

FakeJni::FakeJni() {
  functions_.GetArrayLength = [](JNIEnv*, jarray array) -> jsize {
    FakeArray& a = ArrayOf(array);
    return static_cast<jsize>(a.doubles.size() + a.longs.size() + a.ints.size());
  };
  functions_.GetDoubleArrayElements = [](JNIEnv*, jdoubleArray array, jboolean* is_copy) {
    FakeArray& a = ArrayOf(array);
    return GetElements(a.doubles, a, is_copy);
  };
  functions_.ReleaseDoubleArrayElements = [](JNIEnv*, jdoubleArray array, jdouble* elements,
                                             jint mode) {
    FakeArray& a = ArrayOf(array);
    ReleaseElements(a.doubles, a, elements, mode);
  };
  functions_.GetLongArrayElements = [](JNIEnv*, jlongArray array, jboolean* is_copy) {
    FakeArray& a = ArrayOf(array);
    return GetElements(a.longs, a, is_copy);
  };
  functions_.ReleaseLongArrayElements = [](JNIEnv*, jlongArray array, jlong* elements, jint mode) {
    FakeArray& a = ArrayOf(array);
    ReleaseElements(a.longs, a, elements, mode);
  };
  functions_.SetIntArrayRegion = [](JNIEnv*, jintArray array, jsize start, jsize length,
                                    const jint* values) {
    FakeArray& a = ArrayOf(array);
    ++a.region_writes;
    std::copy(values, values + length, a.ints.begin() + start);
  };
  // No VM behind this environment: the image writer stays uninitialised.
  functions_.GetJavaVM = [](JNIEnv*, JavaVM** vm) -> jint {
    *vm = nullptr;
    return JNI_ERR;
  };
  env_.env.functions = &functions_;
  env_.owner = this;
}

FakeArray& FakeJni::Doubles(std::vector<double> values) {
  arrays_.push_back(std::make_unique<FakeArray>());
  arrays_.back()->doubles = std::move(values);
  return *arrays_.back();
}

FakeArray& FakeJni::Longs(std::vector<jlong> values) {
  arrays_.push_back(std::make_unique<FakeArray>());
  arrays_.back()->longs = std::move(values);
  return *arrays_.back();
}

FakeArray& FakeJni::Ints(std::vector<jint> values) {
  arrays_.push_back(std::make_unique<FakeArray>());
  arrays_.back()->ints = std::move(values);
  return *arrays_.back();
}

bool FakeJni::Balanced() const {
  for (const auto& a : arrays_) {
    const int taken = a->fail_elements ? 0 : a->gets;
    if (static_cast<int>(a->release_modes.size()) != taken)
      return false;
  }
  return true;
}

}  // namespace ocr_testing
