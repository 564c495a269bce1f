#pragma once

#include <memory>
#include <string>
#include <vector>

#include "log.h"
#include "vexel/Kit.h"
#include "vexel/Renderer.h"

namespace Vexel {

// What a kit instance shares with everything made on it; lives as long as
// the Kit or anything made on it, whichever is last.
class Kit::Impl {
 public:
  Impl(AAssetManager* asset_manager, const std::string& log_name)
      : assets(asset_manager), log(log_name) {}

  AAssetManager* const assets;
  internal::KitLog log;
  // Renderers made on this kit and still alive, in creation order.
  std::vector<Renderer::Impl*> renderers;
};

class ResourceManager::Impl {
 public:
  explicit Impl(std::shared_ptr<Kit::Impl> owner) : kit(std::move(owner)) {}
  const std::shared_ptr<Kit::Impl> kit;
};

namespace internal {

// The current kit's shared part; throws Vexel::Exception naming `what` when
// no kit is alive.
std::shared_ptr<Kit::Impl> CurrentKit(const char* what);

}  // namespace internal
}  // namespace Vexel
