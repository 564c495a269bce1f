#pragma once

#include <jni.h>

#include <atomic>

#include <opencv2/core/mat.hpp>

// Saves a matrix to an image file for debugging by calling back into the
// host's virtual machine, where OpenCV's Java binding
// (org.opencv.imgcodecs.Imgcodecs.imwrite_1(String, long)) writes it.
//
// Native threads that the VM did not start see only the system class loader
// through FindClass, so EnsureInit keeps the class loader of
// org.opencv.core.Mat from a call that came from Java, and WriteImage resolves
// the codec class through it. WriteImage may run on any thread: a thread that
// is not attached to the VM is attached for the call and detached afterwards;
// an attached thread stays attached. Failures are logged and otherwise
// ignored.
//
// EnsureInit takes no lock: the first initialisation must not race another.
class ImageWriter {
 public:
  static ImageWriter& getInstance();

  // True when the writer is initialised (before or by this call). Must be
  // called on a thread that came from Java so that the application's classes
  // are visible. A Java exception raised on the way is left pending.
  bool EnsureInit(JNIEnv* env);

  // Writes `image` to `path` through the host; nothing is reported back.
  void WriteImage(const char* path, const cv::Mat& image);

  // The calling thread's JNIEnv, attaching the thread when it is not attached
  // yet; `*attached` (when given) tells whether this call attached it.
  // 0 on success, the VM's error code otherwise.
  static jint GetEnv(JavaVM* vm, JNIEnv** env, bool* attached);

  ~ImageWriter();
  ImageWriter(const ImageWriter&) = delete;
  ImageWriter& operator=(const ImageWriter&) = delete;

 private:
  ImageWriter();

  // The codec class through the kept class loader, or null with an error
  // logged and no exception pending.
  jclass FindCodecsClass(JNIEnv* env);

  // Null until the first successful EnsureInit; published last, after the
  // members below are set.
  std::atomic<JavaVM*> vm_{nullptr};
  // Global reference to the class loader of org.opencv.core.Mat.
  jobject class_loader_ = nullptr;
  // java.lang.ClassLoader.findClass(String).
  jmethodID find_class_method_ = nullptr;
  // java.lang.ClassLoader.loadClass(String), for VMs whose findClass refuses
  // the codec class (see FindCodecsClass).
  jmethodID load_class_method_ = nullptr;
};
