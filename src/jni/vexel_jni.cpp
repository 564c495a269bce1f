// Bridge of org.vexel.android.VexelJNI: the overlay renderer's entry points.
// Glue only; the work is in renderer/renderer_bridge, which catches and logs
// whatever a scene call throws. What is left (running out of memory while
// copying the host's strings and records) reaches the host as a Java
// exception rather than ending its process.
#include <android/asset_manager_jni.h>
#include <android/native_window_jni.h>
#include <jni.h>

#include <cstdint>
#include <optional>
#include <string>

#include "common/log.h"
#include "common/modified_utf8.h"
#include "jni/host_mat.h"
#include "jni/java_exceptions.h"
#include "jni/jni_arrays.h"
#include "renderer/renderer_bridge.h"

namespace {

using ocr::jni::ArrayElements;
using ocr::jni::CallPassingExceptionsToJava;
using ocr::jni::OnRelease;
using ocr::jni::UtfChars;

template <typename Element, typename ArrayT>
ocr_ar::HostArray<Element> View(const ArrayElements<ArrayT>& elements) {
  static_assert(sizeof(Element) == sizeof(typename ArrayElements<ArrayT>::Element));
  return {reinterpret_cast<const Element*>(elements.data()), elements.size()};
}

std::optional<std::string> ReadText(JNIEnv* env, jobjectArray texts, std::size_t index) {
  auto text = static_cast<jstring>(env->GetObjectArrayElement(texts, static_cast<jsize>(index)));
  std::optional<std::string> copy;
  {
    UtfChars chars(env, text);
    if (chars)
      copy = ocr::ModifiedUtf8ToUtf8(chars.c_str());
  }
  if (text != nullptr)
    env->DeleteLocalRef(text);
  return copy;
}

}  // namespace

extern "C" {

JNIEXPORT void JNICALL Java_org_vexel_android_VexelJNI_setAssetManager(JNIEnv* env, jclass,
                                                                       jobject assetManager) {
  ocr_ar::bridge::SetAssetManager(AAssetManager_fromJava(env, assetManager));
}

JNIEXPORT jboolean JNICALL Java_org_vexel_android_VexelJNI_initFromSurface(JNIEnv* env, jclass,
                                                                           jobject surface,
                                                                           jint backgroundWidth,
                                                                           jint backgroundHeight) {
  const bool ok = ocr_ar::bridge::InitFromSurface(
      [env, surface] { return ANativeWindow_fromSurface(env, surface); }, backgroundWidth,
      backgroundHeight);
  return ok ? JNI_TRUE : JNI_FALSE;
}

JNIEXPORT void JNICALL Java_org_vexel_android_VexelJNI_shutDown(JNIEnv*, jclass) {
  ocr_ar::bridge::ShutDown();
}

JNIEXPORT void JNICALL Java_org_vexel_android_VexelJNI_setOrientation(JNIEnv*, jclass,
                                                                      jint orientation) {
  ocr_ar::bridge::SetOrientation(orientation);
}

JNIEXPORT void JNICALL Java_org_vexel_android_VexelJNI_setTranslationLanguage(JNIEnv* env, jclass,
                                                                              jstring language) {
  UtfChars chars(env, language);
  if (!chars) {
    OCR_LOGE("Vexel: set translation language failed to GetStringUTFChars.");
    return;
  }
  CallPassingExceptionsToJava(env, [&] { ocr_ar::bridge::SetTranslationLanguage(chars.c_str()); });
}

JNIEXPORT void JNICALL Java_org_vexel_android_VexelJNI_setTranslationLanguageFont(
    JNIEnv* env, jclass, jstring language, jstring fontPath) {
  UtfChars language_chars(env, language);
  if (!language_chars) {
    OCR_LOGE("Vexel: set translation language font failed to GetStringUTFChars.");
    return;
  }
  UtfChars path_chars(env, fontPath);
  CallPassingExceptionsToJava(env, [&] {
    ocr_ar::bridge::SetTranslationLanguageFont(language_chars.c_str(), path_chars.c_str());
  });
}

JNIEXPORT void JNICALL Java_org_vexel_android_VexelJNI_renderOneFrame(
    JNIEnv* env, jclass, jlong imageMatAddr, jobjectArray texts, jdoubleArray patchRects,
    jdoubleArray textRects, jlongArray ids, jlongArray patchMatAddrs, jdoubleArray colorScales,
    jdoubleArray colorShifts, jintArray colors) {
  const cv::Mat* image = ocr::jni::HostMatOrNull(imageMatAddr);
  const std::size_t text_count =
      texts != nullptr ? static_cast<std::size_t>(env->GetArrayLength(texts)) : 0;
  // Pinned for the call and only read: released without copying back, so a
  // VM that copied them has nothing to write into the host's arrays.
  const ArrayElements<jdoubleArray> patch_rects(env, patchRects, OnRelease::kDiscard);
  const ArrayElements<jdoubleArray> text_rects(env, textRects, OnRelease::kDiscard);
  const ArrayElements<jlongArray> id_values(env, ids, OnRelease::kDiscard);
  const ArrayElements<jlongArray> patch_addresses(env, patchMatAddrs, OnRelease::kDiscard);
  const ArrayElements<jdoubleArray> scales(env, colorScales, OnRelease::kDiscard);
  const ArrayElements<jdoubleArray> shifts(env, colorShifts, OnRelease::kDiscard);
  const ArrayElements<jintArray> colour_values(env, colors, OnRelease::kDiscard);

  ocr_ar::FrameArrays arrays;
  arrays.patch_rects = View<double>(patch_rects);
  arrays.text_rects = View<double>(text_rects);
  arrays.ids = View<std::int64_t>(id_values);
  arrays.patch_mat_addrs = View<std::int64_t>(patch_addresses);
  arrays.color_scales = View<double>(scales);
  arrays.color_shifts = View<double>(shifts);
  arrays.colors = View<std::int32_t>(colour_values);
  CallPassingExceptionsToJava(env, [&] {
    ocr_ar::bridge::RenderOneFrame(
        image, text_count, [env, texts](std::size_t i) { return ReadText(env, texts, i); }, arrays);
  });
}

JNIEXPORT jobject JNICALL Java_org_vexel_android_VexelJNI_GetMatByteBuffer(JNIEnv* env, jclass,
                                                                           jlong matAddr) {
  OCR_LOGI("Vexel: GetMatByteBuffer");
  if (matAddr == 0)
    return nullptr;
  cv::Mat& mat = ocr::jni::HostMat(matAddr);
  return env->NewDirectByteBuffer(mat.data,
                                  static_cast<jlong>(ocr_ar::bridge::MatByteBufferCapacity(mat)));
}

JNIEXPORT jboolean JNICALL Java_org_vexel_android_VexelJNI_getRenderTranslate(JNIEnv*, jclass) {
  return ocr_ar::bridge::GetRenderTranslate() ? JNI_TRUE : JNI_FALSE;
}

}  // extern "C"
