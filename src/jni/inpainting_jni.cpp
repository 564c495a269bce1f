// Bridge of com.quenda.tessel.inpainting.InpaintingJNI: validates and copies
// the host's arrays; the request itself is answered by the inpainting
// subsystem.
//
// InpaintingRotRectImg in step order: here the rectangles, colour array and
// output addresses are checked and copied (each refusal logged and -1) and
// the image writer is bound; AnswerInpaintingRequest
// (inpainting/driver/inpainting_request.cpp) runs the pipeline, checks its
// answer, assigns the overlays and packs the colours; back here the packed
// colours are written into the host's array. An OpenCV error in the pipeline
// is not handled by the engine; it leaves the native call as a Java
// exception.
#include <jni.h>

#include <cstdint>
#include <vector>

#include <opencv2/core/mat.hpp>

#include "common/log.h"
#include "diagnostics/image_writer.h"
#include "inpainting/driver/color_statistics.h"
#include "inpainting/driver/inpainting_request.h"
#include "jni/host_mat.h"
#include "jni/java_exceptions.h"
#include "jni/jni_arrays.h"

namespace {

using ocr::jni::ArrayElements;
using ocr::jni::CallPassingExceptionsToJava;
using ocr::jni::OnRelease;

// The host's input image; an address of 0 reads as an empty matrix, which
// the pipeline refuses.
const cv::Mat& InputImage(jlong address) {
  static const cv::Mat kEmpty;
  const cv::Mat* image = ocr::jni::HostMatOrNull(address);
  return image != nullptr ? *image : kEmpty;
}

size_t LengthOf(JNIEnv* env, jarray array) {
  return array != nullptr ? static_cast<size_t>(env->GetArrayLength(array)) : 0;
}

jint InpaintingRotRectImg(JNIEnv* env, jlong image_address, jlongArray output_addresses,
                          jdoubleArray rects, jintArray font_colors) {
  OCR_LOGI("Inpainting_Process: Start JNI");
  if (rects == nullptr) {
    OCR_LOGE(" Inpainting_Process: No rectangles passed for inpainting in Java call");
    return -1;
  }
  // The entry insists on a copy of the rectangles; a VM that hands out the
  // array in place is treated as an error. Only read, so never copied back.
  ArrayElements<jdoubleArray> rect_elements(env, rects, OnRelease::kDiscard);
  if (!rect_elements || !rect_elements.is_copy()) {
    OCR_LOGE(" Inpainting_Process: Error in copy rectangles in Java call");
    return -1;
  }
  const size_t length = rect_elements.size();
  const int count = ocr_inpainting::RequestRectCount(length);
  if (font_colors == nullptr || LengthOf(env, font_colors) != static_cast<size_t>(count)) {
    OCR_LOGE(" Inpainting_Process: number of rectangles doesn't match number of font color values");
    return -1;
  }
  const std::vector<double> rect_values(rect_elements.data(), rect_elements.data() + length);
  rect_elements.Release();

  if (output_addresses == nullptr ||
      LengthOf(env, output_addresses) != static_cast<size_t>(count)) {
    OCR_LOGE(
        " Inpainting_Process: output matrices array is null or the number of output matrices "
        "doesn't match the number of rectangles");
    return -1;
  }
  ArrayElements<jlongArray> address_elements(env, output_addresses, OnRelease::kDiscard);
  if (!address_elements || !address_elements.is_copy()) {
    OCR_LOGE(" Inpainting_Process: Error in copy output matrix addresses in Java call");
    return -1;
  }
  std::vector<cv::Mat*> outputs(static_cast<size_t>(count));
  for (size_t i = 0; i < outputs.size(); ++i) {
    if (address_elements[i] == 0) {
      OCR_LOGE(" Inpainting_Process: output matrix %d has no native address", static_cast<int>(i));
      return -1;
    }
    outputs[i] = &ocr::jni::HostMat(address_elements[i]);
  }
  address_elements.Release();

  OCR_LOGI("Inpainting_Process: Start vector images, call inpaintRotImg");
  // Binds the debug image writer to the host's class loader, so that the
  // pipeline's worker threads can dump images. A Java exception it leaves
  // pending (the host's classes could not be looked up) is the host's answer:
  // no further JNI call may follow it, so the request stops here.
  if (!ImageWriter::getInstance().EnsureInit(env) && env->ExceptionCheck())
    return -1;

  std::vector<int32_t> packed_colors;
  const int status = ocr_inpainting::AnswerInpaintingRequest(InputImage(image_address), rect_values,
                                                             outputs, packed_colors);
  if (status != 0)
    return status;
  env->SetIntArrayRegion(font_colors, 0, count, packed_colors.data());
  return 0;
}

jint CalculateMeansStdDevs(JNIEnv* env, jlong image_address, jdoubleArray rects, jdoubleArray means,
                           jdoubleArray std_devs) {
  // The rectangles are only read; the means and deviations go back to the
  // host unless the call fails.
  ArrayElements<jdoubleArray> rect_values(env, rects, OnRelease::kDiscard);
  ArrayElements<jdoubleArray> mean_values(env, means, OnRelease::kCopyBack);
  ArrayElements<jdoubleArray> std_dev_values(env, std_devs, OnRelease::kCopyBack);
  if ((rects != nullptr && !rect_values) || (means != nullptr && !mean_values) ||
      (std_devs != nullptr && !std_dev_values)) {
    OCR_LOGE("Color_Adjustment: Error in copy arrays in Java call");
    return -1;
  }
  const int status = ocr_inpainting::CalculateRectMeansStdDevs(
      InputImage(image_address), rect_values.data(), rect_values.size(), mean_values.data(),
      mean_values.size(), std_dev_values.data(), std_dev_values.size());
  if (status != 0) {
    // Nothing was written; the host's arrays stay as they were.
    mean_values.Discard();
    std_dev_values.Discard();
  }
  return status;
}

}  // namespace

extern "C" {

JNIEXPORT jint JNICALL Java_com_quenda_tessel_inpainting_InpaintingJNI_InpaintingRotRectImg(
    JNIEnv* env, jclass, jlong image_address, jlongArray output_addresses, jdoubleArray rects,
    jintArray font_colors) {
  return CallPassingExceptionsToJava(env, jint{0}, [&] {
    return InpaintingRotRectImg(env, image_address, output_addresses, rects, font_colors);
  });
}

JNIEXPORT jint JNICALL Java_com_quenda_tessel_inpainting_InpaintingJNI_CalculateMeansStdDevs(
    JNIEnv* env, jclass, jlong image_address, jdoubleArray rects, jdoubleArray means,
    jdoubleArray std_devs) {
  return CallPassingExceptionsToJava(env, jint{0}, [&] {
    return CalculateMeansStdDevs(env, image_address, rects, means, std_devs);
  });
}

}  // extern "C"
