// Bridge of com.quenda.tessel.tracking.TrackingJNI: one rotated-rectangle
// tracker per handle, the frame accuracy and the blur measure. Glue only; an
// OpenCV error is not handled by the engine but leaves the native call as a
// Java exception.
#include <jni.h>

#include <cmath>
#include <cstdint>
#include <memory>
#include <vector>

#include <opencv2/core.hpp>

#include "common/log.h"
#include "jni/host_mat.h"
#include "jni/java_exceptions.h"
#include "jni/jni_arrays.h"
#include "quality/blur_measure.h"
#include "tracking/frame_accuracy.h"
#include "tracking/ocr_tracker_rot_rect.h"
#include "tracking/tracker_release.h"

namespace {

using ocr::jni::CallPassingExceptionsToJava;

// Centre x, centre y, width, height, angle (degrees) per rectangle.
constexpr jsize kValsPerRect = 5;

zeph::OcrTrackerRotRect* TrackerFromHandle(jlong handle) {
  return reinterpret_cast<zeph::OcrTrackerRotRect*>(static_cast<uintptr_t>(handle));
}

jlong HandleOf(zeph::OcrTrackerRotRect* tracker) {
  return static_cast<jlong>(reinterpret_cast<uintptr_t>(tracker));
}

// A trailing partial rectangle is ignored; width and height are truncated
// toward zero, as the host's OCR boxes have always been read.
std::vector<cv::RotatedRect> ReadRects(JNIEnv* env, jdoubleArray array) {
  std::vector<cv::RotatedRect> rects;
  // Only read: released without copying back.
  ocr::jni::ArrayElements<jdoubleArray> values(env, array, ocr::jni::OnRelease::kDiscard);
  const size_t count = values.size() / kValsPerRect;
  rects.reserve(count);
  if (values.size() >= static_cast<size_t>(kValsPerRect)) {
    for (size_t i = 0; i < count; ++i) {
      const jdouble* v = &values[i * kValsPerRect];
      rects.emplace_back(
          cv::Point2f(static_cast<float>(v[0]), static_cast<float>(v[1])),
          cv::Size2f(static_cast<float>(std::trunc(v[2])), static_cast<float>(std::trunc(v[3]))),
          static_cast<float>(v[4]));
    }
  }
  return rects;
}

jdoubleArray WriteRects(JNIEnv* env, const std::vector<cv::RotatedRect>& rects) {
  jdoubleArray array = env->NewDoubleArray(static_cast<jsize>(rects.size()) * kValsPerRect);
  if (array == nullptr) {
    OCR_LOGE("Failed to create jdoublearray");
    return nullptr;
  }
  ocr::jni::ArrayElements<jdoubleArray> values(env, array, ocr::jni::OnRelease::kCopyBack);
  if (!values) {
    // The zero-filled array still goes back to the host.
    OCR_LOGE("Failed to get access to jdoublearray elements");
    return array;
  }
  for (size_t i = 0; i < rects.size(); ++i) {
    jdouble* v = &values[i * kValsPerRect];
    v[0] = rects[i].center.x;
    v[1] = rects[i].center.y;
    v[2] = rects[i].size.width;
    v[3] = rects[i].size.height;
    v[4] = rects[i].angle;
  }
  return array;
}

}  // namespace

extern "C" {

JNIEXPORT jlong JNICALL Java_com_quenda_tessel_tracking_TrackingJNI_initializeTracker(
    JNIEnv* env, jclass, jlong mat_addr, jdoubleArray rects) {
  if (mat_addr == 0)
    return 0;
  return CallPassingExceptionsToJava(env, jlong{0}, [&] {
    const std::vector<cv::RotatedRect> start_rects = ReadRects(env, rects);
    // The host gets a handle only once the tracker has started.
    auto tracker = std::make_unique<zeph::OcrTrackerRotRect>();
    tracker->StartTracker(ocr::jni::HostMat(mat_addr), start_rects);
    return HandleOf(tracker.release());
  });
}

JNIEXPORT jdoubleArray JNICALL Java_com_quenda_tessel_tracking_TrackingJNI_updateTracker(
    JNIEnv* env, jclass, jlong handle, jlong mat_addr) {
  if (handle == 0 || mat_addr == 0)
    return nullptr;
  return CallPassingExceptionsToJava(env, jdoubleArray{nullptr}, [&] {
    std::vector<cv::RotatedRect> rects;
    TrackerFromHandle(handle)->UpdateTracker(ocr::jni::HostMat(mat_addr), &rects);
    return WriteRects(env, rects);
  });
}

JNIEXPORT jdouble JNICALL
Java_com_quenda_tessel_tracking_TrackingJNI_getCoverageLeft(JNIEnv*, jclass, jlong handle) {
  // Both 0 and -1 (all bits set) stand for "no tracker".
  if (handle == 0 || handle == -1)
    return 0.0;
  return TrackerFromHandle(handle)->GetCoverageLeft();
}

JNIEXPORT void JNICALL Java_com_quenda_tessel_tracking_TrackingJNI_releaseTracker(JNIEnv*, jclass,
                                                                                  jlong handle) {
  if (handle == 0)
    return;
  zeph::ReleaseTracker(TrackerFromHandle(handle));
}

JNIEXPORT jdouble JNICALL Java_com_quenda_tessel_tracking_TrackingJNI_calculateFrameAccuracy(
    JNIEnv* env, jclass, jlong first_addr, jlong second_addr) {
  return CallPassingExceptionsToJava(env, jdouble{0.0}, [&] {
    return zeph::CalculateFrameAccuracy(
        ocr::jni::RequiredHostMat(first_addr, "calculateFrameAccuracy"),
        ocr::jni::RequiredHostMat(second_addr, "calculateFrameAccuracy"));
  });
}

JNIEXPORT jdouble JNICALL
Java_com_quenda_tessel_tracking_TrackingJNI_calculateBlur(JNIEnv* env, jclass, jlong mat_addr) {
  return CallPassingExceptionsToJava(env, jdouble{0.0}, [&] {
    return image_quality::CalculateBlur(ocr::jni::RequiredHostMat(mat_addr, "calculateBlur"));
  });
}

}  // extern "C"
