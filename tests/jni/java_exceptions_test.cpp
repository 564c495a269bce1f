// Which Java exception stands for which C++ one, with which message; the
// real-VM side (the host sees a CvException and the engine carries on) is in
// the Java bridge tests.
#include <gtest/gtest.h>
#include <jni.h>

#include <new>
#include <optional>
#include <stdexcept>
#include <string>

#include <opencv2/core.hpp>

#include "jni/java_exceptions.h"

namespace {

// What the scripted VM saw: the class thrown and its message (none when the
// native side passed null).
struct Thrown {
  std::string class_name;
  std::optional<std::string> message;
};

struct ScriptedVm {
  bool pending = false;
  bool has_opencv_classes = true;
  std::optional<Thrown> thrown;
  std::string last_class;
};

ScriptedVm* g_vm = nullptr;

// Only the functions the helper uses are present; any other call crashes.
JNINativeInterface_ MakeFunctions() {
  JNINativeInterface_ f{};
  f.ExceptionCheck = [](JNIEnv*) -> jboolean { return g_vm->pending ? JNI_TRUE : JNI_FALSE; };
  f.ExceptionClear = [](JNIEnv*) { g_vm->pending = false; };
  f.FindClass = [](JNIEnv*, const char* name) -> jclass {
    if (!g_vm->has_opencv_classes && std::string(name).rfind("org/opencv/", 0) == 0) {
      g_vm->pending = true;  // NoClassDefFoundError
      return nullptr;
    }
    g_vm->last_class = name;
    return reinterpret_cast<jclass>(&g_vm->last_class);
  };
  f.ThrowNew = [](JNIEnv*, jclass type, const char* message) -> jint {
    g_vm->pending = true;
    g_vm->thrown = Thrown{*reinterpret_cast<std::string*>(type),
                          message != nullptr ? std::optional<std::string>(message) : std::nullopt};
    return 0;
  };
  f.DeleteLocalRef = [](JNIEnv*, jobject) {};
  return f;
}

class JavaExceptionsTest : public ::testing::Test {
 protected:
  JavaExceptionsTest() : functions_(MakeFunctions()) {
    env_.functions = &functions_;
    g_vm = &vm_;
  }
  ~JavaExceptionsTest() override { g_vm = nullptr; }

  template <typename Body>
  int Call(Body&& body) {
    return ocr::jni::CallPassingExceptionsToJava(&env_, -7, std::forward<Body>(body));
  }

  JNINativeInterface_ functions_;
  JNIEnv env_{};
  ScriptedVm vm_;
};

TEST_F(JavaExceptionsTest, EachKindOfExceptionBecomesItsJavaClassWithWhatAsMessage) {
  const cv::Exception opencv_error(cv::Error::StsAssert, "!_src.empty()", "cvtColor", "color.cpp",
                                   182);
  EXPECT_EQ(Call([&]() -> int { throw opencv_error; }), -7);
  ASSERT_TRUE(vm_.thrown);
  EXPECT_EQ(vm_.thrown->class_name, "org/opencv/core/CvException");
  EXPECT_EQ(vm_.thrown->message, std::string(opencv_error.what()));

  vm_ = {};
  Call([]() -> int { throw std::bad_alloc(); });
  EXPECT_EQ(vm_.thrown->class_name, "java/lang/OutOfMemoryError");
  EXPECT_EQ(vm_.thrown->message, std::string(std::bad_alloc().what()));

  vm_ = {};
  Call([]() -> int { throw std::invalid_argument("calculateBlur: no matrix at address 0"); });
  EXPECT_EQ(vm_.thrown->class_name, "java/lang/IllegalArgumentException");
  EXPECT_EQ(vm_.thrown->message, std::string("calculateBlur: no matrix at address 0"));

  vm_ = {};
  Call([]() -> int { throw std::length_error("vector too long"); });
  EXPECT_EQ(vm_.thrown->class_name, "java/lang/RuntimeException");
  EXPECT_EQ(vm_.thrown->message, std::string("vector too long"));

  vm_ = {};
  Call([]() -> int { throw 42; });
  EXPECT_EQ(vm_.thrown->class_name, "java/lang/RuntimeException");
  EXPECT_EQ(vm_.thrown->message, std::nullopt);
}

TEST_F(JavaExceptionsTest, NothingThrownWithoutAnExceptionAndAPendingOneIsKept) {
  EXPECT_EQ(Call([] { return 3; }), 3);
  EXPECT_FALSE(vm_.thrown);

  // A JNI call that failed already left its own exception for the host.
  vm_.pending = true;
  EXPECT_EQ(Call([]() -> int { throw std::runtime_error("late"); }), -7);
  EXPECT_FALSE(vm_.thrown);
}

TEST_F(JavaExceptionsTest, OpenCvErrorsStillReachAHostWithoutOpenCvsJavaClasses) {
  vm_.has_opencv_classes = false;
  Call([]() -> int { throw cv::Exception(cv::Error::StsBadArg, "bad", "f", "file.cpp", 1); });
  ASSERT_TRUE(vm_.thrown);
  EXPECT_EQ(vm_.thrown->class_name, "java/lang/RuntimeException");
  EXPECT_EQ(vm_.thrown->message.value_or("").rfind("OpenCV(", 0), 0u);
  EXPECT_TRUE(vm_.pending);
}

}  // namespace
