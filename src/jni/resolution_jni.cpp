// Bridge of com.quenda.tessel.utils.ResolutionJNI.
#include <jni.h>

#include <opencv2/core/mat.hpp>

#include "quality/resolution/resolution_estimator.h"

extern "C" {

// The address is passed on as a pointer, not through HostMat, so that a null
// address reaches the estimator's own check instead of being dereferenced.
JNIEXPORT jdouble JNICALL
Java_com_quenda_tessel_utils_ResolutionJNI_ImgResEstimate(JNIEnv*, jclass, jlong mat_address) {
  return image_resolution::EstimateResolution(reinterpret_cast<const cv::Mat*>(mat_address));
}

}  // extern "C"
