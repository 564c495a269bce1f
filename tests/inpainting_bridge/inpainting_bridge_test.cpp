// The inpainting bridge against a scripted JNIEnv, for what a real VM does
// not do on demand: hand out an array in place, or fail to provide its
// elements; and to count how the bridge pins and releases arrays. Validation
// order and messages are tested through the JVM (InpaintingJNITest).
#include <gtest/gtest.h>
#include <jni.h>

#include <algorithm>
#include <deque>
#include <utility>
#include <vector>

#include <opencv2/core.hpp>

#include "common/log.h"

extern "C" {
jint Java_com_quenda_tessel_inpainting_InpaintingJNI_InpaintingRotRectImg(JNIEnv*, jclass, jlong,
                                                                          jlongArray, jdoubleArray,
                                                                          jintArray);
jint Java_com_quenda_tessel_inpainting_InpaintingJNI_CalculateMeansStdDevs(JNIEnv*, jclass, jlong,
                                                                           jdoubleArray,
                                                                           jdoubleArray,
                                                                           jdoubleArray);
}

namespace {

// A primitive array as the scripted environment serves it: reported as a
// copy (as HotSpot does) unless `in_place`, or not at all when `unreadable`.
// The elements are the vector's own either way; nothing here depends on
// a copy being written back.
struct FakeArray {
  std::vector<double> doubles;
  std::vector<jlong> longs;
  std::vector<jint> ints;
  bool in_place = false;
  bool unreadable = false;
  int gets = 0;
  std::vector<jint> release_modes;
  int region_writes = 0;
};

FakeArray& ArrayOf(jarray array) {
  return *reinterpret_cast<FakeArray*>(array);
}

template <typename T>
T* GetElements(std::vector<T>& values, jarray array, jboolean* is_copy) {
  static T no_elements;  // an empty array still has an element pointer
  FakeArray& a = ArrayOf(array);
  ++a.gets;
  if (is_copy != nullptr)
    *is_copy = a.in_place ? JNI_FALSE : JNI_TRUE;
  return a.unreadable ? nullptr : values.empty() ? &no_elements : values.data();
}

// Only the functions the bridge uses are present; any other call crashes.
JNINativeInterface_ MakeFunctions() {
  JNINativeInterface_ f{};
  f.GetArrayLength = [](JNIEnv*, jarray array) -> jsize {
    const FakeArray& a = ArrayOf(array);
    return static_cast<jsize>(a.doubles.size() + a.longs.size() + a.ints.size());
  };
  f.GetDoubleArrayElements = [](JNIEnv*, jdoubleArray array, jboolean* is_copy) {
    return GetElements(ArrayOf(array).doubles, array, is_copy);
  };
  f.GetLongArrayElements = [](JNIEnv*, jlongArray array, jboolean* is_copy) {
    return GetElements(ArrayOf(array).longs, array, is_copy);
  };
  f.ReleaseDoubleArrayElements = [](JNIEnv*, jdoubleArray array, jdouble*, jint mode) {
    ArrayOf(array).release_modes.push_back(mode);
  };
  f.ReleaseLongArrayElements = [](JNIEnv*, jlongArray array, jlong*, jint mode) {
    ArrayOf(array).release_modes.push_back(mode);
  };
  f.SetIntArrayRegion = [](JNIEnv*, jintArray array, jsize start, jsize length,
                           const jint* values) {
    ++ArrayOf(array).region_writes;
    std::copy(values, values + length, ArrayOf(array).ints.begin() + start);
  };
  f.ExceptionCheck = [](JNIEnv*) -> jboolean { return JNI_FALSE; };
  // No VM behind this environment: the image writer stays uninitialised.
  f.GetJavaVM = [](JNIEnv*, JavaVM** vm) -> jint {
    *vm = nullptr;
    return JNI_ERR;
  };
  return f;
}

// A VM whose application classes cannot be found: the image writer's lookup
// leaves a NoClassDefFoundError pending, and any JNI call after that is
// counted (a real VM's behaviour is undefined then).
struct ClasslessVm {
  bool pending = false;
  int calls_while_pending = 0;
};
ClasslessVm* g_classless = nullptr;

JNINativeInterface_ MakeClasslessFunctions() {
  JNINativeInterface_ f = MakeFunctions();
  f.GetJavaVM = [](JNIEnv*, JavaVM** vm) -> jint {
    *vm = reinterpret_cast<JavaVM*>(g_classless);  // never used as a VM
    return JNI_OK;
  };
  f.FindClass = [](JNIEnv*, const char*) -> jclass {
    g_classless->pending = true;
    return nullptr;
  };
  f.ExceptionCheck = [](JNIEnv*) -> jboolean {
    return g_classless->pending ? JNI_TRUE : JNI_FALSE;
  };
  f.SetIntArrayRegion = [](JNIEnv*, jintArray array, jsize, jsize, const jint*) {
    g_classless->calls_while_pending += g_classless->pending ? 1 : 0;
    ++ArrayOf(array).region_writes;
  };
  return f;
}

class InpaintingBridgeTest : public testing::Test {
 protected:
  InpaintingBridgeTest() { env_.functions = &functions_; }

  FakeArray& Array(std::vector<double> doubles = {}) {
    arrays_.emplace_back().doubles = std::move(doubles);
    return arrays_.back();
  }

  // A request with `colours` colour slots and `outputs` output matrices.
  jint Inpaint(FakeArray& rects, size_t colours, size_t outputs, bool addresses_in_place = false) {
    colours_ = &Array();
    colours_->ints.assign(colours, 7);
    addresses_ = &Array();
    addresses_->in_place = addresses_in_place;
    for (size_t i = 0; i < outputs; ++i)
      addresses_->longs.push_back(reinterpret_cast<jlong>(&outputs_[i]));
    return Java_com_quenda_tessel_inpainting_InpaintingJNI_InpaintingRotRectImg(
        &env_, nullptr, reinterpret_cast<jlong>(&frame_), Handle<jlongArray>(*addresses_),
        Handle<jdoubleArray>(rects), Handle<jintArray>(*colours_));
  }

  jint Statistics(FakeArray& rects, FakeArray& means, FakeArray& deviations) {
    return Java_com_quenda_tessel_inpainting_InpaintingJNI_CalculateMeansStdDevs(
        &env_, nullptr, reinterpret_cast<jlong>(&frame_), Handle<jdoubleArray>(rects),
        Handle<jdoubleArray>(means), Handle<jdoubleArray>(deviations));
  }

  template <typename ArrayHandle>
  static ArrayHandle Handle(FakeArray& a) {
    return reinterpret_cast<ArrayHandle>(&a);
  }

  // Every array whose elements were handed out was released exactly once.
  bool Balanced() const {
    return std::all_of(arrays_.begin(), arrays_.end(), [](const FakeArray& a) {
      return static_cast<int>(a.release_modes.size()) == (a.unreadable ? 0 : a.gets);
    });
  }

  // The last request was refused with `error`, wrote nothing and left no
  // array pinned.
  void ExpectRefused(const char* error) {
    EXPECT_EQ(capture_.Count(error, ocr::log::kError), 1) << error;
    EXPECT_EQ(colours_->region_writes, 0) << error;
    for (const cv::Mat& output : outputs_)
      EXPECT_TRUE(output.size() == cv::Size(2, 2) && output.at<uchar>(0, 0) == 42) << error;
    EXPECT_TRUE(Balanced()) << error;
    capture_.Clear();
  }

  JNINativeInterface_ functions_ = MakeFunctions();
  JNIEnv env_{};
  ocr::log::ScopedCapture capture_;
  std::deque<FakeArray> arrays_;
  FakeArray* colours_ = nullptr;
  FakeArray* addresses_ = nullptr;
  cv::Mat frame_ = cv::Mat(120, 200, CV_8UC3, cv::Scalar(10, 20, 30));
  cv::Mat outputs_[2] = {cv::Mat(2, 2, CV_8UC1, cv::Scalar(42)),
                         cv::Mat(2, 2, CV_8UC1, cv::Scalar(42))};
  const std::vector<double> one_rect_ = {100, 60, 130, 40, 0};
};

TEST_F(InpaintingBridgeTest, AnswersIntoTheHostsMatsAndReleasesEveryArray) {
  FakeArray& rects = Array(one_rect_);
  ASSERT_EQ(Inpaint(rects, 1, 1), 0);
  EXPECT_EQ(outputs_[0].type(), CV_8UC4);
  EXPECT_EQ(outputs_[0].size(), cv::Size(130, 40));
  EXPECT_EQ(colours_->region_writes, 1);
  EXPECT_EQ(static_cast<uint32_t>(colours_->ints[0]) >> 24, 0xFFu);
  // Both arrays are only read: released without copying back.
  EXPECT_EQ(rects.release_modes, std::vector<jint>{JNI_ABORT});
  EXPECT_EQ(addresses_->release_modes, std::vector<jint>{JNI_ABORT});
  EXPECT_TRUE(Balanced());
}

TEST_F(InpaintingBridgeTest, AJavaExceptionFromBindingTheImageWriterEndsTheRequestThere) {
  ClasslessVm vm;
  g_classless = &vm;
  functions_ = MakeClasslessFunctions();
  FakeArray& rects = Array(one_rect_);
  EXPECT_EQ(Inpaint(rects, 1, 1), -1);
  EXPECT_TRUE(vm.pending);  // the host receives the VM's own exception
  EXPECT_EQ(vm.calls_while_pending, 0);
  EXPECT_EQ(colours_->region_writes, 0);
  EXPECT_TRUE(capture_.Contains("ImageWriter: Exception getting ClassLoader", ocr::log::kError));
  EXPECT_TRUE(Balanced());
  g_classless = nullptr;
}

TEST_F(InpaintingBridgeTest, InsistsOnCopiesAndReleasesWhatItTookOnEveryRefusal) {
  FakeArray& in_place = Array(one_rect_);
  in_place.in_place = true;
  EXPECT_EQ(Inpaint(in_place, 1, 1), -1);
  ExpectRefused(" Inpainting_Process: Error in copy rectangles in Java call");
  EXPECT_EQ(addresses_->gets, 0);

  FakeArray& unreadable = Array(one_rect_);
  unreadable.unreadable = true;
  EXPECT_EQ(Inpaint(unreadable, 1, 1), -1);
  ExpectRefused(" Inpainting_Process: Error in copy rectangles in Java call");
  EXPECT_TRUE(unreadable.release_modes.empty());

  // The rectangles are copied and released before the addresses are read.
  FakeArray& rects = Array(one_rect_);
  EXPECT_EQ(Inpaint(rects, 1, 1, /*addresses_in_place=*/true), -1);
  ExpectRefused(" Inpainting_Process: Error in copy output matrix addresses in Java call");
  EXPECT_EQ(rects.release_modes, std::vector<jint>{JNI_ABORT});

  // The colour count is checked before the addresses are taken.
  EXPECT_EQ(Inpaint(Array(one_rect_), 2, 1), -1);
  ExpectRefused(
      " Inpainting_Process: number of rectangles doesn't match number of font color values");
  EXPECT_EQ(addresses_->gets, 0);

  // A VM that copies even an empty array (HotSpot does not) lets an empty
  // request through to the strategies, which refuse it.
  EXPECT_EQ(Inpaint(Array(), 0, 0), -1);
  EXPECT_TRUE(capture_.Contains(" Inpainting_Process: Error in rotate_recs.size 0"));
  ExpectRefused("Error in Java call of Inpainting");
}

TEST_F(InpaintingBridgeTest, ColourStatisticsNeedNoCopiesAndDropUnusedArrays) {
  FakeArray& rects = Array({100, 100, 40, 20, 0});
  FakeArray& means = Array({-1, -1, -1});
  FakeArray& deviations = Array({-1, -1, -1});
  rects.in_place = means.in_place = deviations.in_place = true;
  EXPECT_EQ(Statistics(rects, means, deviations), 0);
  EXPECT_EQ(means.doubles, (std::vector<double>{10, 20, 30}));
  EXPECT_EQ(deviations.doubles, (std::vector<double>{0, 0, 0}));

  // A length mismatch writes nothing, and still releases every array.
  FakeArray& four_means = Array({-1, -1, -1, -1});
  FakeArray& four_deviations = Array({-1, -1, -1, -1});
  EXPECT_EQ(Statistics(rects, four_means, four_deviations), -1);
  EXPECT_EQ(four_means.doubles, std::vector<double>(4, -1));
  EXPECT_TRUE(Balanced());

  FakeArray& unreadable = Array({-1, -1, -1});
  unreadable.unreadable = true;
  EXPECT_EQ(Statistics(rects, unreadable, unreadable), -1);
  EXPECT_TRUE(capture_.Contains("Color_Adjustment: Error in copy arrays in Java call"));
}

}  // namespace
