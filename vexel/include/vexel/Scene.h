#pragma once

#include <memory>

#include "vexel/Math.h"
#include "vexel/Node.h"

namespace Vexel {

class Kit;

// A scene graph with its root node and the colour the frame is cleared to.
// Destroying the scene detaches everything that hangs on its root and
// detaches the scene from any renderer that draws it.
class Scene {
 public:
  explicit Scene(Kit& kit);
  ~Scene();
  Scene(const Scene&) = delete;
  Scene& operator=(const Scene&) = delete;

  void setBackgroundColor(const Color& color);
  Color getBackgroundColor() const;
  // Kept for callers that switch shadows off; this kit casts no shadows.
  void setShadowEnabled(bool enabled);
  bool isShadowEnabled() const;

  Node* getRootNode();

  class Impl;

 private:
  friend struct detail::Access;
  std::shared_ptr<Impl> impl_;
};

}  // namespace Vexel
