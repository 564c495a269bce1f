// Bridge of com.quenda.tessel.utils.ResolutionJNI.
#include <jni.h>

#include <opencv2/core/mat.hpp>

#include "jni/host_mat.h"
#include "jni/java_exceptions.h"
#include "quality/resolution/resolution_estimator.h"

extern "C" {

// A null address reaches the estimator's own check instead of being
// dereferenced.
JNIEXPORT jdouble JNICALL
Java_com_quenda_tessel_utils_ResolutionJNI_ImgResEstimate(JNIEnv* env, jclass, jlong mat_address) {
  return ocr::jni::CallPassingExceptionsToJava(env, jdouble{0.0}, [&] {
    return image_resolution::EstimateResolution(ocr::jni::HostMatOrNull(mat_address));
  });
}

}  // extern "C"
