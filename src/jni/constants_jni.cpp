// Bridge of com.quenda.tessel.Constants.
#include <jni.h>

#include "inpainting/inpainting_constants.h"

extern "C" {

JNIEXPORT jint JNICALL Java_com_quenda_tessel_Constants_getValsPerRect(JNIEnv*, jclass) {
  return ocr_inpainting::kValsPerRect;
}

JNIEXPORT jdouble JNICALL Java_com_quenda_tessel_Constants_getInpaintRectWidthRatio(JNIEnv*,
                                                                                    jclass) {
  return ocr_inpainting::kInpaintRectWidthRatio;
}

JNIEXPORT jdouble JNICALL Java_com_quenda_tessel_Constants_getInpaintRectHeightRatio(JNIEnv*,
                                                                                     jclass) {
  return ocr_inpainting::kInpaintRectHeightRatio;
}

JNIEXPORT jdouble JNICALL Java_com_quenda_tessel_Constants_getStandardOcrEnlargePercent(JNIEnv*,
                                                                                        jclass) {
  return ocr_inpainting::kStandardOcrEnlargePercent;
}

JNIEXPORT jint JNICALL Java_com_quenda_tessel_Constants_getMinInpaintSize(JNIEnv*, jclass) {
  return ocr_inpainting::kMinInpaintSize;
}

}  // extern "C"
