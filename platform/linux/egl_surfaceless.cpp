// Linux graphics device: an OpenGL ES 2 context on Mesa's surfaceless EGL
// platform (the llvmpipe software rasteriser without a GPU or display), and
// window surfaces that are offscreen framebuffers of the window's size. At
// Present the frame is read back and copied into the desktop window.
#include <EGL/egl.h>
#include <EGL/eglext.h>
#include <GLES2/gl2.h>
#include <android/native_window.h>

#include <stdexcept>
#include <string>
#include <vector>

#include "platform/desktop.h"
#include "platform/gl_device.h"
#include "platform_gl_device.h"

namespace platform {
namespace {

std::string EglFailure(const char* step) {
  char code[16];
  std::snprintf(code, sizeof(code), "0x%04x", static_cast<unsigned>(eglGetError()));
  return std::string("EGL: ") + step + " failed (" + code + ")";
}

EGLDisplay SurfacelessDisplay() {
  auto get_platform_display = reinterpret_cast<PFNEGLGETPLATFORMDISPLAYEXTPROC>(
      eglGetProcAddress("eglGetPlatformDisplayEXT"));
  if (get_platform_display == nullptr)
    throw std::runtime_error("EGL: eglGetPlatformDisplayEXT is not available");
  EGLDisplay display =
      get_platform_display(EGL_PLATFORM_SURFACELESS_MESA, EGL_DEFAULT_DISPLAY, nullptr);
  if (display == EGL_NO_DISPLAY)
    throw std::runtime_error(EglFailure("surfaceless display"));
  return display;
}

class SurfacelessDevice : public GlDevice {
 public:
  SurfacelessDevice() : display_(SurfacelessDisplay()) {
    if (!eglInitialize(display_, nullptr, nullptr))
      throw std::runtime_error(EglFailure("eglInitialize"));
    if (!eglBindAPI(EGL_OPENGL_ES_API))
      throw std::runtime_error(EglFailure("eglBindAPI"));
    // A context without a config: it draws only into framebuffer objects.
    const EGLint attributes[] = {EGL_CONTEXT_CLIENT_VERSION, 2, EGL_NONE};
    context_ = eglCreateContext(display_, EGL_NO_CONFIG_KHR, EGL_NO_CONTEXT, attributes);
    if (context_ == EGL_NO_CONTEXT)
      throw std::runtime_error(EglFailure("eglCreateContext"));
  }

  // The display stays initialised for the rest of the process: the next
  // device gets it back at no cost, and Mesa keeps its driver loaded (so
  // that what the driver allocates stays attributable to it).
  ~SurfacelessDevice() override {
    if (eglGetCurrentContext() == context_)
      eglMakeCurrent(display_, EGL_NO_SURFACE, EGL_NO_SURFACE, EGL_NO_CONTEXT);
    eglDestroyContext(display_, context_);
    eglReleaseThread();
  }

  void MakeCurrent() override {
    if (eglGetCurrentContext() == context_)
      return;
    if (!eglMakeCurrent(display_, EGL_NO_SURFACE, EGL_NO_SURFACE, context_))
      throw std::runtime_error(EglFailure("eglMakeCurrent"));
  }

  std::string Description() const override {
    auto text = [](GLenum name) {
      const auto* value = reinterpret_cast<const char*>(glGetString(name));
      return std::string(value != nullptr ? value : "?");
    };
    const_cast<SurfacelessDevice*>(this)->MakeCurrent();
    return "EGL surfaceless (Mesa), " + text(GL_RENDERER) + ", " + text(GL_VERSION);
  }

 private:
  EGLDisplay display_;
  EGLContext context_ = EGL_NO_CONTEXT;
};

// Colour texture plus depth renderbuffer of the window's size; a window of
// zero width or height gets no framebuffer and presents nothing.
class OffscreenWindowSurface : public WindowSurface {
 public:
  OffscreenWindowSurface(std::shared_ptr<GlDevice> device, ANativeWindow* window)
      : device_(std::move(device)),
        window_(window),
        width_(ANativeWindow_getWidth(window)),
        height_(ANativeWindow_getHeight(window)) {
    ANativeWindow_acquire(window_);
    if (width_ <= 0 || height_ <= 0)
      return;
    device_->MakeCurrent();
    glGenTextures(1, &color_);
    glBindTexture(GL_TEXTURE_2D, color_);
    glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA, width_, height_, 0, GL_RGBA, GL_UNSIGNED_BYTE, nullptr);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_NEAREST);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER, GL_NEAREST);
    glBindTexture(GL_TEXTURE_2D, 0);
    glGenRenderbuffers(1, &depth_);
    glBindRenderbuffer(GL_RENDERBUFFER, depth_);
    glRenderbufferStorage(GL_RENDERBUFFER, GL_DEPTH_COMPONENT16, width_, height_);
    glBindRenderbuffer(GL_RENDERBUFFER, 0);
    glGenFramebuffers(1, &framebuffer_);
    glBindFramebuffer(GL_FRAMEBUFFER, framebuffer_);
    glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, color_, 0);
    glFramebufferRenderbuffer(GL_FRAMEBUFFER, GL_DEPTH_ATTACHMENT, GL_RENDERBUFFER, depth_);
    CountGlObjects(3);
    const GLenum status = glCheckFramebufferStatus(GL_FRAMEBUFFER);
    if (status != GL_FRAMEBUFFER_COMPLETE) {
      Release();
      throw std::runtime_error("offscreen framebuffer " + std::to_string(width_) + "x" +
                               std::to_string(height_) + " is incomplete");
    }
    pixels_.resize(static_cast<std::size_t>(width_) * height_ * 4);
  }

  ~OffscreenWindowSurface() override { Release(); }

  void MakeCurrent() override {
    device_->MakeCurrent();
    glBindFramebuffer(GL_FRAMEBUFFER, framebuffer_);
  }

  int Width() const override { return width_; }
  int Height() const override { return height_; }

  void Present() override {
    if (framebuffer_ == 0)
      return;
    MakeCurrent();
    glPixelStorei(GL_PACK_ALIGNMENT, 1);
    glReadPixels(0, 0, width_, height_, GL_RGBA, GL_UNSIGNED_BYTE, pixels_.data());
    desktop::PresentFrame(window_, pixels_.data());
  }

 private:
  void Release() {
    if (framebuffer_ != 0) {
      device_->MakeCurrent();
      glBindFramebuffer(GL_FRAMEBUFFER, 0);
      glDeleteFramebuffers(1, &framebuffer_);
      glDeleteRenderbuffers(1, &depth_);
      glDeleteTextures(1, &color_);
      CountGlObjects(-3);
      framebuffer_ = depth_ = color_ = 0;
    }
    if (window_ != nullptr) {
      ANativeWindow_release(window_);
      window_ = nullptr;
    }
  }

  std::shared_ptr<GlDevice> device_;
  ANativeWindow* window_;
  const int width_;
  const int height_;
  GLuint framebuffer_ = 0;
  GLuint color_ = 0;
  GLuint depth_ = 0;
  std::vector<std::uint8_t> pixels_;
};

}  // namespace

std::shared_ptr<GlDevice> CreatePlatformGlDevice() {
  return std::make_shared<SurfacelessDevice>();
}

std::unique_ptr<WindowSurface> WindowSurface::Create(const std::shared_ptr<GlDevice>& device,
                                                     ANativeWindow* window) {
  return std::make_unique<OffscreenWindowSurface>(device, window);
}

}  // namespace platform
