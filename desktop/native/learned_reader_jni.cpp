// The desktop host's bridge to the text reader: com.quenda.tessel.desktop.ocr.LearnedReader.
//
// Glue only. A reader lives behind a handle (a pointer the Java object keeps until it closes it),
// images arrive as the native address of an OpenCV Mat, and lines leave as plain arrays that the
// Java side turns into its own objects. No C++ exception may cross the JNI frame (it would end
// the JVM), so every entry point hands it to Java as an exception with the same message.
#include <jni.h>

#include <cmath>
#include <cstdint>
#include <stdexcept>
#include <string>
#include <vector>

#include <textreader/text_reader.h>
#include <opencv2/core.hpp>

#include "jni/java_exceptions.h"

namespace {

constexpr char kModelException[] = "com/quenda/tessel/desktop/ocr/ModelFileException";
constexpr char kIllegalArgument[] = "java/lang/IllegalArgumentException";
constexpr char kIllegalState[] = "java/lang/IllegalStateException";
constexpr int kRectValues = 5;  // cx, cy, w, h, angle

void Throw(JNIEnv* env, const char* class_name, const std::string& message) {
  jclass cls = env->FindClass(class_name);
  if (cls != nullptr) {
    env->ThrowNew(cls, message.c_str());
  }
}

// Runs one entry point's body; the reader's own failures get the Java exception the host tells
// apart (a model to install, a bad argument), anything else what the engine's bridge gives it.
template <typename Result, typename Body>
Result Guarded(JNIEnv* env, Result neutral, Body&& body) noexcept {
  try {
    return body();
  } catch (const textreader::ModelError& e) {
    Throw(env, kModelException, e.what());
  } catch (const std::invalid_argument& e) {
    Throw(env, kIllegalArgument, e.what());
  } catch (...) {
    ocr::jni::ThrowCurrentExceptionToJava(env);
  }
  return neutral;
}

// The reader behind a handle, or null with IllegalStateException pending.
textreader::TextReader* ReaderOf(JNIEnv* env, jlong handle) {
  if (handle == 0) {
    Throw(env, kIllegalState, "the text reader is closed");
    return nullptr;
  }
  return reinterpret_cast<textreader::TextReader*>(static_cast<intptr_t>(handle));
}

// The Mat at a native address, or null with IllegalArgumentException pending.
cv::Mat* MatAt(JNIEnv* env, jlong address) {
  if (address == 0) {
    Throw(env, kIllegalArgument, "no image: the Mat's native address is 0");
    return nullptr;
  }
  return reinterpret_cast<cv::Mat*>(static_cast<intptr_t>(address));
}

// A line standing in a rectangle, its corners in reading order: top-left, top-right,
// bottom-right, bottom-left as a reader of the line sees them.
textreader::TextLine LineAt(const jdouble (&r)[kRectValues]) {
  textreader::TextLine line;
  line.rect = cv::RotatedRect(cv::Point2f(static_cast<float>(r[0]), static_cast<float>(r[1])),
                              cv::Size2f(static_cast<float>(r[2]), static_cast<float>(r[3])),
                              static_cast<float>(r[4]));
  const double t = r[4] * CV_PI / 180.0;
  const cv::Point2d along(std::cos(t) * r[2] / 2, std::sin(t) * r[2] / 2);
  const cv::Point2d down(-std::sin(t) * r[3] / 2, std::cos(t) * r[3] / 2);
  const cv::Point2d centre(r[0], r[1]);
  line.corners = {cv::Point2f(centre - along - down), cv::Point2f(centre + along - down),
                  cv::Point2f(centre + along + down), cv::Point2f(centre - along + down)};
  return line;
}

jbyteArray Utf8Bytes(JNIEnv* env, const std::string& text) {
  jbyteArray bytes = env->NewByteArray(static_cast<jsize>(text.size()));
  if (bytes != nullptr) {
    env->SetByteArrayRegion(bytes, 0, static_cast<jsize>(text.size()),
                            reinterpret_cast<const jbyte*>(text.data()));
  }
  return bytes;
}

// {double[] rects (5 per line), byte[][] texts (UTF-8), float[] confidences (0..1)}.
jobjectArray LinesToJava(JNIEnv* env, const std::vector<textreader::TextLine>& lines) {
  const auto n = static_cast<jsize>(lines.size());
  std::vector<jdouble> rects;
  std::vector<jfloat> confidences;
  for (const textreader::TextLine& line : lines) {
    rects.insert(rects.end(), {line.rect.center.x, line.rect.center.y, line.rect.size.width,
                               line.rect.size.height, line.rect.angle});
    confidences.push_back(line.confidence);
  }
  jdoubleArray rect_array = env->NewDoubleArray(n * kRectValues);
  jfloatArray confidence_array = env->NewFloatArray(n);
  jclass bytes_class = env->FindClass("[B");
  jobjectArray texts = bytes_class ? env->NewObjectArray(n, bytes_class, nullptr) : nullptr;
  jclass object_class = env->FindClass("java/lang/Object");
  jobjectArray out = object_class ? env->NewObjectArray(3, object_class, nullptr) : nullptr;
  if (rect_array == nullptr || confidence_array == nullptr || texts == nullptr || out == nullptr) {
    return nullptr;  // OutOfMemoryError pending
  }
  env->SetDoubleArrayRegion(rect_array, 0, n * kRectValues, rects.data());
  env->SetFloatArrayRegion(confidence_array, 0, n, confidences.data());
  for (jsize i = 0; i < n; ++i) {
    jbyteArray text = Utf8Bytes(env, lines[static_cast<size_t>(i)].text);
    if (text == nullptr) {
      return nullptr;
    }
    env->SetObjectArrayElement(texts, i, text);
    env->DeleteLocalRef(text);
  }
  env->SetObjectArrayElement(out, 0, rect_array);
  env->SetObjectArrayElement(out, 1, texts);
  env->SetObjectArrayElement(out, 2, confidence_array);
  return out;
}

}  // namespace

extern "C" {

JNIEXPORT jlong JNICALL Java_com_quenda_tessel_desktop_ocr_LearnedReader_open(
    JNIEnv* env, jclass, jstring model_dir, jint script, jint detection_long_side,
    jint scene_long_side, jboolean recognise, jint threads) {
  return Guarded(env, jlong{0}, [&]() -> jlong {
    if (model_dir == nullptr) {
      Throw(env, kIllegalArgument, "no model folder given");
      return 0;
    }
    const char* chars = env->GetStringUTFChars(model_dir, nullptr);
    if (chars == nullptr) {
      return 0;
    }
    textreader::ReaderOptions options;
    options.model_dir = chars;
    env->ReleaseStringUTFChars(model_dir, chars);
    options.script = script == 1 ? textreader::Script::kChinese : textreader::Script::kLatin;
    options.detection_long_side = detection_long_side;
    options.scene_long_side = scene_long_side;
    options.recognise = recognise == JNI_TRUE;
    options.threads = threads;
    auto* reader = new textreader::TextReader(options);
    return static_cast<jlong>(reinterpret_cast<intptr_t>(reader));
  });
}

JNIEXPORT jobjectArray JNICALL Java_com_quenda_tessel_desktop_ocr_LearnedReader_read(
    JNIEnv* env, jclass, jlong handle, jlong image_address) {
  return Guarded(env, jobjectArray{nullptr}, [&]() -> jobjectArray {
    const textreader::TextReader* reader = ReaderOf(env, handle);
    const cv::Mat* image = reader ? MatAt(env, image_address) : nullptr;
    if (image == nullptr) {
      return nullptr;
    }
    return LinesToJava(env, reader->Read(*image));
  });
}

JNIEXPORT void JNICALL Java_com_quenda_tessel_desktop_ocr_LearnedReader_uprightCrop(
    JNIEnv* env, jclass, jlong image_address, jdoubleArray rect, jint height, jlong out_address) {
  Guarded(env, 0, [&]() {
    const cv::Mat* image = MatAt(env, image_address);
    cv::Mat* out = image ? MatAt(env, out_address) : nullptr;
    if (out == nullptr) {
      return 0;
    }
    if (rect == nullptr || env->GetArrayLength(rect) != kRectValues) {
      Throw(env, kIllegalArgument, "a line's rectangle is 5 numbers: cx, cy, w, h, angle");
      return 0;
    }
    jdouble r[kRectValues];
    env->GetDoubleArrayRegion(rect, 0, kRectValues, r);
    *out = textreader::UprightCrop(*image, LineAt(r), height);
    return 0;
  });
}

JNIEXPORT void JNICALL Java_com_quenda_tessel_desktop_ocr_LearnedReader_close(JNIEnv*, jclass,
                                                                              jlong handle) {
  delete reinterpret_cast<textreader::TextReader*>(static_cast<intptr_t>(handle));
}

}  // extern "C"
