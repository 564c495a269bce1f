// The image writer used from many threads at once against a scripted VM, so
// that the ThreadSanitizer build can follow every access (it cannot follow a
// real VM's generated code): the writer's VM and class loader are published
// by one thread and read by all, and each worker attaches and detaches on its
// own. The real VM's side is in image_writer_test.cpp.
#include <gtest/gtest.h>
#include <jni.h>
#include <tbb/parallel_for.h>

#include <atomic>
#include <cstdarg>
#include <thread>
#include <vector>

#include <opencv2/core.hpp>

#include "diagnostics/image_writer.h"

namespace {

// Every call succeeds. The objects handed out are the address of a dummy and
// never dereferenced; the thread that initialises the writer counts as a Java
// thread, any other is attached only between Attach and DetachCurrentThread.
int g_dummy = 0;
std::atomic<int> g_writes{0};
std::atomic<int> g_attaches{0};
std::atomic<int> g_detaches{0};
thread_local bool t_has_env = false;

JavaVM* Vm();
JNIEnv* Env();

jobject Dummy() {
  return reinterpret_cast<jobject>(&g_dummy);
}

JNINativeInterface_ EnvFunctions() {
  JNINativeInterface_ f{};
  f.FindClass = [](JNIEnv*, const char*) { return static_cast<jclass>(Dummy()); };
  f.GetObjectClass = [](JNIEnv*, jobject) { return static_cast<jclass>(Dummy()); };
  f.GetMethodID = [](JNIEnv*, jclass, const char*, const char*) {
    return reinterpret_cast<jmethodID>(&g_dummy);
  };
  f.GetStaticMethodID = f.GetMethodID;
  f.CallObjectMethodV = [](JNIEnv*, jobject, jmethodID, va_list) { return Dummy(); };
  f.CallStaticBooleanMethodV = [](JNIEnv*, jclass, jmethodID, va_list) -> jboolean {
    g_writes.fetch_add(1);
    return JNI_TRUE;
  };
  f.ExceptionCheck = [](JNIEnv*) -> jboolean { return JNI_FALSE; };
  f.ExceptionClear = [](JNIEnv*) {};
  f.NewStringUTF = [](JNIEnv*, const char*) { return static_cast<jstring>(Dummy()); };
  f.NewGlobalRef = [](JNIEnv*, jobject object) { return object; };
  f.DeleteGlobalRef = [](JNIEnv*, jobject) {};
  f.DeleteLocalRef = [](JNIEnv*, jobject) {};
  f.GetJavaVM = [](JNIEnv*, JavaVM** vm) -> jint {
    *vm = Vm();
    return JNI_OK;
  };
  return f;
}

JNIInvokeInterface_ VmFunctions() {
  JNIInvokeInterface_ f{};
  f.GetEnv = [](JavaVM*, void** env, jint) -> jint {
    *env = t_has_env ? Env() : nullptr;
    return t_has_env ? JNI_OK : JNI_EDETACHED;
  };
  f.AttachCurrentThread = [](JavaVM*, void** env, void*) -> jint {
    t_has_env = true;
    g_attaches.fetch_add(1);
    *env = Env();
    return JNI_OK;
  };
  f.DetachCurrentThread = [](JavaVM*) -> jint {
    t_has_env = false;
    g_detaches.fetch_add(1);
    return JNI_OK;
  };
  return f;
}

const JNINativeInterface_ kEnvFunctions = EnvFunctions();
const JNIInvokeInterface_ kVmFunctions = VmFunctions();
JNIEnv g_env{&kEnvFunctions};
JavaVM g_vm{&kVmFunctions};

JavaVM* Vm() {
  return &g_vm;
}

JNIEnv* Env() {
  return &g_env;
}

TEST(ImageWriterThreads, WorkersAndPlainThreadsWriteAtOnceEachAttachingForItsCall) {
  t_has_env = true;  // the test's thread came from Java
  ASSERT_TRUE(ImageWriter::getInstance().EnsureInit(Env()));

  const cv::Mat image(4, 4, CV_8UC3, cv::Scalar(1, 2, 3));
  constexpr int kWorkerWrites = 200;
  constexpr int kThreads = 4;
  constexpr int kThreadWrites = 50;
  std::vector<std::thread> threads;
  for (int t = 0; t < kThreads; ++t) {
    threads.emplace_back([&image] {
      for (int i = 0; i < kThreadWrites; ++i)
        ImageWriter::getInstance().WriteImage("plain.png", image);
    });
  }
  tbb::parallel_for(0, kWorkerWrites,
                    [&image](int) { ImageWriter::getInstance().WriteImage("worker.png", image); });
  for (std::thread& thread : threads)
    thread.join();

  EXPECT_EQ(g_writes.load(), kWorkerWrites + kThreads * kThreadWrites);
  // This thread stays attached; every other call attached and detached.
  EXPECT_EQ(g_attaches.load(), g_detaches.load());
  EXPECT_LE(g_attaches.load(), kWorkerWrites + kThreads * kThreadWrites);
  EXPECT_GE(g_attaches.load(), kThreads * kThreadWrites);
}

}  // namespace
