// The array helper against a scripted JNIEnv, for what a real VM does not do
// on demand: refuse to pin or copy an array's elements.
#include "jni/jni_arrays.h"

#include <gtest/gtest.h>
#include <jni.h>

#include <vector>

namespace {

struct ScriptedArray {
  std::vector<jdouble> values;
  bool refuse = false;
  std::vector<jint> release_modes;
};

ScriptedArray& ArrayOf(jarray array) {
  return *reinterpret_cast<ScriptedArray*>(array);
}

// Only the functions the helper uses are present; any other call crashes.
JNINativeInterface_ MakeFunctions() {
  JNINativeInterface_ f{};
  f.GetArrayLength = [](JNIEnv*, jarray array) -> jsize {
    return static_cast<jsize>(ArrayOf(array).values.size());
  };
  f.GetDoubleArrayElements = [](JNIEnv*, jdoubleArray array, jboolean* is_copy) -> jdouble* {
    if (is_copy != nullptr)
      *is_copy = JNI_TRUE;
    return ArrayOf(array).refuse ? nullptr : ArrayOf(array).values.data();
  };
  f.ReleaseDoubleArrayElements = [](JNIEnv*, jdoubleArray array, jdouble*, jint mode) {
    ArrayOf(array).release_modes.push_back(mode);
  };
  return f;
}

class ArrayElementsTest : public testing::Test {
 protected:
  ArrayElementsTest() { env_.functions = &functions_; }

  jdoubleArray Handle(ScriptedArray& array) { return reinterpret_cast<jdoubleArray>(&array); }

  JNINativeInterface_ functions_ = MakeFunctions();
  JNIEnv env_{};
};

TEST_F(ArrayElementsTest, AnArrayTheVmCannotProvideHasNoElementsToReadAndNothingToRelease) {
  ScriptedArray refused{{1, 2, 3, 4, 5}, /*refuse=*/true, {}};
  {
    ocr::jni::ArrayElements<jdoubleArray> elements(&env_, Handle(refused),
                                                   ocr::jni::OnRelease::kDiscard);
    EXPECT_FALSE(elements);
    // A reader that loops over size() reads nothing through the null pointer.
    EXPECT_EQ(elements.size(), 0u);
    EXPECT_EQ(elements.data(), nullptr);
  }
  EXPECT_TRUE(refused.release_modes.empty());

  ocr::jni::ArrayElements<jdoubleArray> none(&env_, nullptr, ocr::jni::OnRelease::kCopyBack);
  EXPECT_EQ(none.size(), 0u);
}

TEST_F(ArrayElementsTest, ReleasesOnceWithTheModeChosenWhenTaken) {
  ScriptedArray read_only{{1, 2, 3, 4, 5}, false, {}};
  ScriptedArray written{{0, 0}, false, {}};
  {
    ocr::jni::ArrayElements<jdoubleArray> input(&env_, Handle(read_only),
                                                ocr::jni::OnRelease::kDiscard);
    ocr::jni::ArrayElements<jdoubleArray> output(&env_, Handle(written),
                                                 ocr::jni::OnRelease::kCopyBack);
    ASSERT_EQ(input.size(), 5u);
    EXPECT_EQ(input[4], 5.0);
    output.Release();
    output.Release();
  }
  EXPECT_EQ(read_only.release_modes, std::vector<jint>{JNI_ABORT});
  EXPECT_EQ(written.release_modes, std::vector<jint>{0});
}

}  // namespace
