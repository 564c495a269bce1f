#include "diagnostics/image_writer.h"

#include <gtest/gtest.h>
#include <jni.h>
#include <unistd.h>

#include <tbb/parallel_for.h>
#include <tbb/task_arena.h>

#include <atomic>
#include <filesystem>
#include <future>
#include <string>
#include <thread>
#include <vector>

#include <opencv2/core.hpp>
#include <opencv2/imgcodecs.hpp>

#include "common/log.h"

// In the sanitizer build: the JVM started below frees nothing at exit, and
// LeakSanitizer would spend about a minute per test scanning its memory, so
// leak checking is off for this binary (addresses and UB are still checked).
extern "C" __attribute__((visibility("default"))) const char* __asan_default_options() {
  return "detect_leaks=0";
}

namespace {

namespace fs = std::filesystem;

// One JVM per process (a JVM cannot be created twice), started on the main
// thread with OpenCV's Java binding loaded as an application would load it.
JavaVM* SharedVm() {
  static JavaVM* vm = [] {
    std::string class_path = std::string("-Djava.class.path=") + OCR_TEST_OPENCV_JAR;
    std::string library_path = std::string("-Djava.library.path=") + OCR_TEST_OPENCV_JNI_DIR;
    std::string small_heap = "-Xmx64m";
    JavaVMOption options[] = {
        {class_path.data(), nullptr}, {library_path.data(), nullptr}, {small_heap.data(), nullptr}};
    JavaVMInitArgs args{};
    args.version = JNI_VERSION_1_8;
    args.nOptions = 3;
    args.options = options;
    args.ignoreUnrecognized = JNI_FALSE;
    JavaVM* created = nullptr;
    JNIEnv* env = nullptr;
    if (JNI_CreateJavaVM(&created, reinterpret_cast<void**>(&env), &args) != JNI_OK)
      return static_cast<JavaVM*>(nullptr);
    // OpenCV's own loader calls System.loadLibrary from a class of the
    // application's loader, so the binding's natives bind to that loader.
    jclass loader = env->FindClass("org/opencv/osgi/OpenCVNativeLoader");
    jmethodID construct = env->GetMethodID(loader, "<init>", "()V");
    jobject instance = env->NewObject(loader, construct);
    env->CallVoidMethod(instance, env->GetMethodID(loader, "init", "()V"));
    if (env->ExceptionCheck()) {
      env->ExceptionDescribe();
      return static_cast<JavaVM*>(nullptr);
    }
    return created;
  }();
  return vm;
}

bool IsAttached() {
  JNIEnv* env = nullptr;
  return SharedVm()->GetEnv(reinterpret_cast<void**>(&env), JNI_VERSION_1_6) == JNI_OK;
}

// Initialises the writer from the main thread, which the JVM knows.
bool InitFromMainThread() {
  JNIEnv* env = nullptr;
  SharedVm()->GetEnv(reinterpret_cast<void**>(&env), JNI_VERSION_1_6);
  return ImageWriter::getInstance().EnsureInit(env);
}

cv::Mat TestImage(int seed) {
  cv::Mat image(24 + seed, 40, CV_8UC3);
  cv::RNG(static_cast<uint64_t>(seed) + 1).fill(image, cv::RNG::UNIFORM, 0, 256);
  return image;
}

// ctest runs every test in a process of its own.
class ImageWriterTest : public testing::Test {
 protected:
  void SetUp() override {
    ASSERT_NE(SharedVm(), nullptr) << "the JVM did not start";
    fs::create_directories(dir_);
  }
  void TearDown() override { fs::remove_all(dir_); }

  std::string PathFor(const std::string& name) const { return (dir_ / name).string(); }

  const fs::path dir_ =
      fs::temp_directory_path() / ("image_writer_test_" + std::to_string(getpid()));
};

// Runs first when the binary runs as a whole.
TEST_F(ImageWriterTest, WritingBeforeInitialisationOnlyWarns) {
  ocr::log::ScopedCapture capture;
  ImageWriter::getInstance().WriteImage(PathFor("early.png").c_str(), TestImage(0));
  EXPECT_TRUE(capture.Contains("ImageWriter not initialized", ocr::log::kWarn));
  EXPECT_FALSE(fs::exists(PathFor("early.png")));
}

TEST_F(ImageWriterTest, WritesFromWorkerThreadsThatTheVmDidNotStart) {
  ASSERT_TRUE(InitFromMainThread());
  // A second initialisation must not touch JNI: this environment has no
  // function table, so any call would crash.
  JNIEnv unusable{};
  EXPECT_TRUE(ImageWriter::getInstance().EnsureInit(&unusable));

  const std::thread::id main_thread = std::this_thread::get_id();
  constexpr int kImages = 8;
  std::vector<cv::Mat> images;
  for (int i = 0; i < kImages; ++i)
    images.push_back(TestImage(i));
  std::atomic<int> left_attached{0};
  tbb::task_arena arena;
  arena.execute([&] {
    tbb::parallel_for(0, kImages, [&](int i) {
      const bool was_attached = IsAttached();
      ImageWriter::getInstance().WriteImage(PathFor("worker_" + std::to_string(i) + ".png").c_str(),
                                            images[i]);
      if (IsAttached() != was_attached)
        ++left_attached;
    });
  });
  // An enqueued task runs on a worker for sure (the loop above may have run
  // on the main thread alone).
  std::promise<bool> worker_wrote;
  arena.enqueue([&] {
    ImageWriter::getInstance().WriteImage(PathFor("enqueued.png").c_str(), images[0]);
    worker_wrote.set_value(std::this_thread::get_id() != main_thread && !IsAttached());
  });
  EXPECT_TRUE(worker_wrote.get_future().get()) << "the worker was left attached";
  EXPECT_EQ(left_attached.load(), 0) << "a thread changed its attachment";

  for (int i = 0; i < kImages; ++i) {
    const cv::Mat written = cv::imread(PathFor("worker_" + std::to_string(i) + ".png"));
    ASSERT_FALSE(written.empty()) << i;
    // imwrite takes the matrix as BGR; a PNG round trip is exact.
    EXPECT_EQ(cv::norm(written, images[i], cv::NORM_INF), 0.0) << i;
  }
  EXPECT_FALSE(cv::imread(PathFor("enqueued.png")).empty());
}

TEST_F(ImageWriterTest, AttachedThreadsStayAttachedAndOthersAreDetachedEvenOnFailure) {
  ASSERT_TRUE(InitFromMainThread());
  ImageWriter::getInstance().WriteImage(PathFor("main.png").c_str(), TestImage(1));
  EXPECT_TRUE(IsAttached());
  EXPECT_TRUE(fs::exists(PathFor("main.png")));

  std::thread attached([&] {
    JNIEnv* env = nullptr;
    ASSERT_EQ(SharedVm()->AttachCurrentThread(reinterpret_cast<void**>(&env), nullptr), JNI_OK);
    ImageWriter::getInstance().WriteImage(PathFor("attached.png").c_str(), TestImage(2));
    EXPECT_TRUE(IsAttached());
    SharedVm()->DetachCurrentThread();
  });
  attached.join();
  EXPECT_TRUE(fs::exists(PathFor("attached.png")));

  ocr::log::ScopedCapture capture;
  std::thread failing([&] {
    // No encoder for this extension: OpenCV's binding throws a Java exception.
    ImageWriter::getInstance().WriteImage(PathFor("image.unknown_format").c_str(), TestImage(3));
    EXPECT_FALSE(IsAttached());
  });
  failing.join();
  EXPECT_TRUE(capture.Contains("ImageWriter: Exception check failed after call to imwrite_1",
                               ocr::log::kWarn));
  EXPECT_FALSE(fs::exists(PathFor("image.unknown_format")));
}

}  // namespace
