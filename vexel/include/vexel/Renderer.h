#pragma once

#include <memory>

#include "vexel/Exception.h"

struct ANativeWindow;

namespace Vexel {

class Kit;
class Scene;

// Draws one scene into one drawing surface.
class Renderer {
 public:
  enum AntiAliasingSamples {
    ANTI_ALIASING_NONE = 0,
    ANTI_ALIASING_2X = 2,
    ANTI_ALIASING_4X = 4,
  };

  virtual ~Renderer();
  Renderer(const Renderer&) = delete;
  Renderer& operator=(const Renderer&) = delete;

  // Attaches the scene this renderer draws (replacing any earlier one); null
  // detaches it, and a renderer without a scene clears to transparent black.
  void setScene(Scene* scene);
  Scene* getScene() const;

  // Size of the drawing surface in pixels.
  int getWidth() const;
  int getHeight() const;

  // Draws the attached scene and presents the frame (Kit::drawAll does this
  // for every renderer of the kit).
  void draw();

  class Impl;

 protected:
  explicit Renderer(std::unique_ptr<Impl> impl);

 private:
  friend struct detail::Access;
  std::unique_ptr<Impl> impl_;
};

// A renderer bound to an ANativeWindow: on a phone its EGL window surface; on
// Linux an offscreen framebuffer of the window's size whose frame is copied
// into the desktop window at presentation. Holds a reference to the window
// while it lives. A null window throws Vexel::Exception. The anti-aliasing
// samples are accepted for compatibility; surfaces are not multisampled.
class AndroidSurfaceRenderer : public Renderer {
 public:
  AndroidSurfaceRenderer(Kit& kit, ANativeWindow* window, AntiAliasingSamples samples);
  ~AndroidSurfaceRenderer() override;
};

}  // namespace Vexel
