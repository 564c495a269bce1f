#include "scene_impl.h"

namespace Vexel {

// Renderers hold the scene's shared part weakly, so destroying the scene
// detaches it from them; destroying the root detaches what hangs on it.
Scene::Scene(Kit& /*kit*/) : impl_(std::make_shared<Impl>()) {}
Scene::~Scene() = default;

void Scene::setBackgroundColor(const Color& color) {
  impl_->background = color;
}
Color Scene::getBackgroundColor() const {
  return impl_->background;
}
void Scene::setShadowEnabled(bool enabled) {
  impl_->shadows = enabled;
}
bool Scene::isShadowEnabled() const {
  return impl_->shadows;
}
Node* Scene::getRootNode() {
  return &impl_->root;
}

}  // namespace Vexel
