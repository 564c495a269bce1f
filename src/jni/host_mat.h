#pragma once

#include <jni.h>

#include <stdexcept>
#include <string>

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

// The same for an input the call cannot do without: address 0 is a host's
// bug, reported to it as std::invalid_argument (an IllegalArgumentException
// once it has crossed the bridge) naming the call, instead of a crash.
inline const cv::Mat& RequiredHostMat(jlong address, const char* call) {
  if (address == 0)
    throw std::invalid_argument(std::string(call) + ": no matrix at address 0");
  return HostMat(address);
}

}  // namespace ocr::jni
