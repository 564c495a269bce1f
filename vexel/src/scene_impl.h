#pragma once

#include <memory>

#include "vexel/Node.h"
#include "vexel/Scene.h"

namespace Vexel {

class Scene::Impl {
 public:
  EmptyNode root;
  Color background{0.0f, 0.0f, 0.0f, 1.0f};
  bool shadows = false;
};

}  // namespace Vexel
