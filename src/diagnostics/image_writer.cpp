// The writer's calls in the order they happen: EnsureInit on a thread that
// came from Java, then WriteImage from any thread, each reading top to
// bottom with its JNI steps in small helpers.
#include "diagnostics/image_writer.h"

#include "common/log.h"

namespace {

constexpr const char* kCodecsClassName = "org/opencv/imgcodecs/Imgcodecs";
// The same class by its binary name, as ClassLoader.loadClass expects it.
constexpr const char* kCodecsBinaryName = "org.opencv.imgcodecs.Imgcodecs";

// Android's jni.h declares AttachCurrentThread with a JNIEnv** parameter, the
// JDK's with void**; this argument converts to whichever the header wants.
struct EnvOut {
  JNIEnv** env;
  operator JNIEnv**() const { return env; }
  operator void**() const { return reinterpret_cast<void**>(env); }
};

// Drops a local reference, ignoring null.
void DeleteLocal(JNIEnv* env, jobject object) {
  if (object != nullptr)
    env->DeleteLocalRef(object);
}

// EnsureInit's steps. Each JNI call is checked, since no JNI call may follow
// a pending exception; a failure leaves the exception pending for the Java
// caller.

// The class loader that loaded OpenCV's Java binding (the application's), as
// a local reference, or null.
jobject MatClassLoader(JNIEnv* env) {
  jobject loader = nullptr;
  jclass mat_class = env->FindClass("org/opencv/core/Mat");
  jclass class_class = nullptr;
  if (!env->ExceptionCheck() && mat_class != nullptr) {
    class_class = env->GetObjectClass(mat_class);
    const jmethodID get_class_loader =
        env->GetMethodID(class_class, "getClassLoader", "()Ljava/lang/ClassLoader;");
    if (!env->ExceptionCheck() && get_class_loader != nullptr)
      loader = env->CallObjectMethod(mat_class, get_class_loader);
  }
  DeleteLocal(env, class_class);
  DeleteLocal(env, mat_class);
  if (env->ExceptionCheck()) {
    DeleteLocal(env, loader);
    return nullptr;
  }
  return loader;
}

// ClassLoader.findClass and ClassLoader.loadClass; false unless both were
// found.
bool FindLoaderMethods(JNIEnv* env, jmethodID* find_class, jmethodID* load_class) {
  jclass loader_class = env->FindClass("java/lang/ClassLoader");
  if (env->ExceptionCheck() || loader_class == nullptr)
    return false;
  *find_class =
      env->GetMethodID(loader_class, "findClass", "(Ljava/lang/String;)Ljava/lang/Class;");
  *load_class =
      env->GetMethodID(loader_class, "loadClass", "(Ljava/lang/String;)Ljava/lang/Class;");
  DeleteLocal(env, loader_class);
  return !env->ExceptionCheck() && *find_class != nullptr && *load_class != nullptr;
}

// WriteImage's step: the class `name` through `method` of `loader`, or null
// with whatever exception the lookup raised cleared (the writer's only
// place that clears one: a failed lookup is tried another way or logged).
jclass LoadClassThrough(JNIEnv* env, jobject loader, jmethodID method, const char* name) {
  jstring name_string = env->NewStringUTF(name);
  jobject found = env->CallObjectMethod(loader, method, name_string);
  DeleteLocal(env, name_string);
  if (!env->ExceptionCheck() && found != nullptr)
    return static_cast<jclass>(found);
  env->ExceptionClear();
  DeleteLocal(env, found);
  return nullptr;
}

}  // namespace

ImageWriter& ImageWriter::getInstance() {
  static ImageWriter instance;
  return instance;
}

ImageWriter::ImageWriter() {
  // Logging first makes the log's own statics outlive this instance, whose
  // destructor may still log at process exit.
  OCR_LOGD("ImageWriter: instance created");
}

bool ImageWriter::EnsureInit(JNIEnv* env) {
  if (vm_.load(std::memory_order_acquire) != nullptr)
    return true;

  JavaVM* vm = nullptr;
  const jint got_vm = env->GetJavaVM(&vm);
  if (got_vm != 0) {
    OCR_LOGE("ImageWriter: GetJavaVM returned %d", got_vm);
    return false;
  }
  jobject loader = MatClassLoader(env);
  if (loader == nullptr || !FindLoaderMethods(env, &find_class_method_, &load_class_method_)) {
    OCR_LOGE("ImageWriter: Exception getting ClassLoader");
    DeleteLocal(env, loader);
    return false;
  }
  class_loader_ = env->NewGlobalRef(loader);
  DeleteLocal(env, loader);
  vm_.store(vm, std::memory_order_release);
  return true;
}

void ImageWriter::WriteImage(const char* path, const cv::Mat& image) {
  JavaVM* vm = vm_.load(std::memory_order_acquire);
  if (vm == nullptr) {
    OCR_LOGW("ImageWriter not initialized");
    return;
  }
  if (path == nullptr) {
    OCR_LOGE("ImageWriter: no file path given");
    return;
  }
  JNIEnv* env = nullptr;
  bool attached = false;
  if (GetEnv(vm, &env, &attached) != 0)
    return;
  if (env == nullptr) {
    OCR_LOGE("Failed to GetEnv : env is null");
    return;
  }

  jstring path_string = env->NewStringUTF(path);
  jclass codecs = FindCodecsClass(env);
  if (codecs != nullptr) {
    const jmethodID imwrite = env->GetStaticMethodID(codecs, "imwrite_1", "(Ljava/lang/String;J)Z");
    // imwrite_1 takes the matrix by its native address.
    if (imwrite != nullptr)
      env->CallStaticBooleanMethod(codecs, imwrite, path_string,
                                   static_cast<jlong>(reinterpret_cast<intptr_t>(&image)));
    if (env->ExceptionCheck())
      OCR_LOGW("ImageWriter: Exception check failed after call to imwrite_1");
  }
  DeleteLocal(env, codecs);
  DeleteLocal(env, path_string);

  if (attached)
    vm->DetachCurrentThread();
}

// Android's class loaders answer findClass for a class they have loaded
// already; the JDK's define the class anew and refuse a slash-separated name.
// loadClass with the binary name returns the loaded class on both.
jclass ImageWriter::FindCodecsClass(JNIEnv* env) {
  if (jclass found = LoadClassThrough(env, class_loader_, find_class_method_, kCodecsClassName))
    return found;
  if (jclass found = LoadClassThrough(env, class_loader_, load_class_method_, kCodecsBinaryName))
    return found;
  OCR_LOGE("ImageWriter: cannot load %s through the host's class loader", kCodecsBinaryName);
  return nullptr;
}

jint ImageWriter::GetEnv(JavaVM* vm, JNIEnv** env, bool* attached) {
  if (vm->GetEnv(reinterpret_cast<void**>(env), JNI_VERSION_1_6) == JNI_OK) {
    if (attached != nullptr)
      *attached = false;
    return 0;
  }
  const jint result = vm->AttachCurrentThread(EnvOut{env}, nullptr);
  if (result != JNI_OK) {
    OCR_LOGE("ImageWriter failed to get JNIEnv - AttachCurrentThread returned %d", result);
    if (attached != nullptr)
      *attached = false;
    return result;
  }
  if (attached != nullptr)
    *attached = true;
  return 0;
}

ImageWriter::~ImageWriter() {
  JavaVM* vm = vm_.load(std::memory_order_acquire);
  if (vm != nullptr && class_loader_ != nullptr) {
    // At process exit the VM may be gone or refuse to attach; then the
    // reference is simply forgotten.
    JNIEnv* env = nullptr;
    bool attached = false;
    if (GetEnv(vm, &env, &attached) == 0 && env != nullptr) {
      env->DeleteGlobalRef(class_loader_);
      if (attached)
        vm->DetachCurrentThread();
    }
  }
  vm_.store(nullptr);
  class_loader_ = nullptr;
}
