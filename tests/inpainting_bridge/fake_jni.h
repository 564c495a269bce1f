#pragma once

#include <jni.h>

#include <memory>
#include <vector>

// A JNIEnv that serves primitive arrays from C++ vectors and records how the
// bridge pins and releases them. Only the functions the inpainting bridge
// uses are present; any other call crashes the test.
namespace ocr_testing {

struct FakeArray {
  std::vector<double> doubles;
  std::vector<jlong> longs;
  std::vector<jint> ints;
  bool null = false;
  // Whether Get*ArrayElements hands out a copy (as HotSpot does) or the
  // array in place; and whether it fails altogether.
  bool hand_out_copy = true;
  bool fail_elements = false;
  int gets = 0;
  std::vector<jint> release_modes;
  int region_writes = 0;
};

class FakeJni {
 public:
  FakeJni();
  FakeJni(const FakeJni&) = delete;
  FakeJni& operator=(const FakeJni&) = delete;

  JNIEnv* env() { return &env_.env; }

  FakeArray& Doubles(std::vector<double> values);
  FakeArray& Longs(std::vector<jlong> values);
  FakeArray& Ints(std::vector<jint> values);

  static jdoubleArray AsDoubleArray(FakeArray& a) { return HandleOf<jdoubleArray>(a); }
  static jlongArray AsLongArray(FakeArray& a) { return HandleOf<jlongArray>(a); }
  static jintArray AsIntArray(FakeArray& a) { return HandleOf<jintArray>(a); }

  // Every array taken was released exactly once.
  bool Balanced() const;

 private:
  template <typename ArrayHandle>
  static ArrayHandle HandleOf(FakeArray& a) {
    return a.null ? nullptr : reinterpret_cast<ArrayHandle>(&a);
  }

  struct Env {
    JNIEnv env;
    FakeJni* owner;
  };
  JNINativeInterface_ functions_{};
  Env env_{};
  std::vector<std::unique_ptr<FakeArray>> arrays_;
};

}  // namespace ocr_testing
