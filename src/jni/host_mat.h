#pragma once

#include <jni.h>

#include <opencv2/core/mat.hpp>

namespace ocr::jni {

// The host owns its matrices and passes them by native address (what
// org.opencv.core.Mat#getNativeObjAddr returns); the engine reads from them
// and assigns into them but never frees them.
inline cv::Mat& HostMat(jlong address) {
  return *reinterpret_cast<cv::Mat*>(address);
}

// The same for an input the callee checks itself: null for address 0.
inline const cv::Mat* HostMatOrNull(jlong address) {
  return reinterpret_cast<const cv::Mat*>(address);
}

}  // namespace ocr::jni
