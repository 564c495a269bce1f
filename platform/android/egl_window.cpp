// Phone graphics device: an OpenGL ES 2 context on the default EGL display
// with an RGBA8888 + depth config, and EGL window surfaces on the app's
// ANativeWindow. Without a window the context is made current on a 1x1
// pbuffer (or no surface where EGL_KHR_surfaceless_context is offered).
#include <EGL/egl.h>
#include <EGL/eglext.h>
#include <GLES2/gl2.h>
#include <android/native_window.h>

#include <cstdio>
#include <cstring>
#include <stdexcept>
#include <string>

#include "platform/gl_device.h"
#include "platform_gl_device.h"

namespace platform {
namespace {

std::string EglFailure(const char* step) {
  char code[16];
  std::snprintf(code, sizeof(code), "0x%04x", static_cast<unsigned>(eglGetError()));
  return std::string("EGL: ") + step + " failed (" + code + ")";
}

class AndroidDevice : public GlDevice {
 public:
  AndroidDevice() : display_(eglGetDisplay(EGL_DEFAULT_DISPLAY)) {
    if (display_ == EGL_NO_DISPLAY || !eglInitialize(display_, nullptr, nullptr))
      throw std::runtime_error(EglFailure("eglInitialize"));
    const EGLint config_attributes[] = {EGL_RENDERABLE_TYPE,
                                        EGL_OPENGL_ES2_BIT,
                                        EGL_SURFACE_TYPE,
                                        EGL_WINDOW_BIT | EGL_PBUFFER_BIT,
                                        EGL_RED_SIZE,
                                        8,
                                        EGL_GREEN_SIZE,
                                        8,
                                        EGL_BLUE_SIZE,
                                        8,
                                        EGL_ALPHA_SIZE,
                                        8,
                                        EGL_DEPTH_SIZE,
                                        16,
                                        EGL_NONE};
    EGLint count = 0;
    if (!eglChooseConfig(display_, config_attributes, &config_, 1, &count) || count < 1)
      throw std::runtime_error(EglFailure("eglChooseConfig"));
    const EGLint context_attributes[] = {EGL_CONTEXT_CLIENT_VERSION, 2, EGL_NONE};
    context_ = eglCreateContext(display_, config_, EGL_NO_CONTEXT, context_attributes);
    if (context_ == EGL_NO_CONTEXT)
      throw std::runtime_error(EglFailure("eglCreateContext"));
    const char* extensions = eglQueryString(display_, EGL_EXTENSIONS);
    if (extensions == nullptr ||
        std::strstr(extensions, "EGL_KHR_surfaceless_context") == nullptr) {
      const EGLint pbuffer_attributes[] = {EGL_WIDTH, 1, EGL_HEIGHT, 1, EGL_NONE};
      pbuffer_ = eglCreatePbufferSurface(display_, config_, pbuffer_attributes);
    }
  }

  // The display is shared with the rest of the app, so it is not terminated.
  ~AndroidDevice() override {
    if (eglGetCurrentContext() == context_)
      eglMakeCurrent(display_, EGL_NO_SURFACE, EGL_NO_SURFACE, EGL_NO_CONTEXT);
    if (pbuffer_ != EGL_NO_SURFACE)
      eglDestroySurface(display_, pbuffer_);
    eglDestroyContext(display_, context_);
  }

  void MakeCurrent() override {
    if (eglGetCurrentContext() == context_)
      return;
    if (!eglMakeCurrent(display_, pbuffer_, pbuffer_, context_))
      throw std::runtime_error(EglFailure("eglMakeCurrent"));
  }

  // Back to no window, before a window surface goes away.
  void LeaveSurface(EGLSurface surface) {
    if (eglGetCurrentSurface(EGL_DRAW) == surface)
      eglMakeCurrent(display_, pbuffer_, pbuffer_, context_);
  }

  std::string Description() const override {
    const_cast<AndroidDevice*>(this)->MakeCurrent();
    const auto* renderer = reinterpret_cast<const char*>(glGetString(GL_RENDERER));
    const auto* version = reinterpret_cast<const char*>(glGetString(GL_VERSION));
    return std::string("EGL default display, ") + (renderer ? renderer : "?") + ", " +
           (version ? version : "?");
  }

  EGLDisplay display() const { return display_; }
  EGLConfig config() const { return config_; }
  EGLContext context() const { return context_; }

 private:
  EGLDisplay display_;
  EGLConfig config_ = nullptr;
  EGLContext context_ = EGL_NO_CONTEXT;
  EGLSurface pbuffer_ = EGL_NO_SURFACE;
};

class AndroidWindowSurface : public WindowSurface {
 public:
  AndroidWindowSurface(std::shared_ptr<GlDevice> device, ANativeWindow* window)
      : holder_(std::move(device)),
        device_(static_cast<AndroidDevice*>(holder_.get())),
        window_(window) {
    ANativeWindow_acquire(window_);
    EGLint format = 0;
    eglGetConfigAttrib(device_->display(), device_->config(), EGL_NATIVE_VISUAL_ID, &format);
    ANativeWindow_setBuffersGeometry(window_, 0, 0, format);
    surface_ = eglCreateWindowSurface(device_->display(), device_->config(), window_, nullptr);
    if (surface_ == EGL_NO_SURFACE) {
      const std::string failure = EglFailure("eglCreateWindowSurface");
      ANativeWindow_release(window_);
      throw std::runtime_error(failure);
    }
  }

  ~AndroidWindowSurface() override {
    device_->LeaveSurface(surface_);
    eglDestroySurface(device_->display(), surface_);
    ANativeWindow_release(window_);
  }

  void MakeCurrent() override {
    if (eglGetCurrentSurface(EGL_DRAW) != surface_ ||
        eglGetCurrentContext() != device_->context()) {
      if (!eglMakeCurrent(device_->display(), surface_, surface_, device_->context()))
        throw std::runtime_error(EglFailure("eglMakeCurrent"));
    }
    glBindFramebuffer(GL_FRAMEBUFFER, 0);
  }

  int Width() const override { return Query(EGL_WIDTH); }
  int Height() const override { return Query(EGL_HEIGHT); }

  void Present() override { eglSwapBuffers(device_->display(), surface_); }

 private:
  int Query(EGLint what) const {
    EGLint value = 0;
    eglQuerySurface(device_->display(), surface_, what, &value);
    return value;
  }

  std::shared_ptr<GlDevice> holder_;
  AndroidDevice* device_;
  ANativeWindow* window_;
  EGLSurface surface_ = EGL_NO_SURFACE;
};

}  // namespace

std::shared_ptr<GlDevice> CreatePlatformGlDevice() {
  return std::make_shared<AndroidDevice>();
}

std::unique_ptr<WindowSurface> WindowSurface::Create(const std::shared_ptr<GlDevice>& device,
                                                     ANativeWindow* window) {
  return std::make_unique<AndroidWindowSurface>(device, window);
}

}  // namespace platform
