#pragma once

#include <cstddef>
#include <memory>
#include <string>

struct ANativeWindow;

// Where the graphics device differs between a phone and Linux: how the
// OpenGL ES 2 context is made and what a window's drawing surface is.
namespace platform {

// The process's one OpenGL ES 2 context, shared by every renderer and
// resource so that textures, meshes and programs can be made before any
// window exists and outlive the renderer that drew them. Held through
// shared pointers; it goes away with its last holder.
class GlDevice {
 public:
  // The live device, or a new one. Throws std::runtime_error naming the
  // failed step when no context can be made.
  static std::shared_ptr<GlDevice> Acquire();

  virtual ~GlDevice() = default;
  // Makes the context current on the calling thread, without a window: for
  // uploads and deletions.
  virtual void MakeCurrent() = 0;
  // Renderer, version and platform, for the log.
  virtual std::string Description() const = 0;
};

// The drawing surface of one window. On a phone the EGL window surface; on
// Linux an offscreen framebuffer of the window's size whose frame is copied
// into the desktop window at Present.
class WindowSurface {
 public:
  // Holds a reference to the window while it lives. Throws std::runtime_error
  // when the surface cannot be made.
  static std::unique_ptr<WindowSurface> Create(const std::shared_ptr<GlDevice>& device,
                                               ANativeWindow* window);

  virtual ~WindowSurface() = default;
  // Makes the context current with this surface as the bound framebuffer.
  virtual void MakeCurrent() = 0;
  virtual int Width() const = 0;
  virtual int Height() const = 0;
  // Shows what was drawn since the last Present.
  virtual void Present() = 0;
};

// Live graphics objects made through the kit and this layer (textures,
// buffers, shaders, programs, framebuffers, renderbuffers).
void CountGlObjects(long delta);
std::size_t LiveGlObjects();

}  // namespace platform
