#pragma once

#include <memory>

#include "gpu.h"
#include "kit_impl.h"
#include "platform/gl_device.h"
#include "vexel/Renderer.h"
#include "vexel/Scene.h"

namespace Vexel {

class Renderer::Impl {
 public:
  Impl(std::shared_ptr<Kit::Impl> kit, ANativeWindow* window);
  ~Impl();
  Impl(const Impl&) = delete;
  Impl& operator=(const Impl&) = delete;

  // Clears, draws the scene through its first camera, presents.
  void Draw();

  std::shared_ptr<Kit::Impl> kit;
  std::shared_ptr<internal::Gpu> gpu;
  std::unique_ptr<platform::WindowSurface> surface;
  Scene* scene = nullptr;
  std::weak_ptr<Scene::Impl> scene_alive;
  bool warned_no_camera = false;
};

}  // namespace Vexel
