#include <algorithm>

#include "access.h"
#include "kit_impl.h"
#include "platform/gl_device.h"
#include "renderer_impl.h"

namespace Vexel {
namespace {

// Live kits in creation order; the last is the current kit. Render thread
// only, like the rest of the kit.
std::vector<Kit*>& LiveKits() {
  static std::vector<Kit*> kits;
  return kits;
}

}  // namespace

ResourceManager::ResourceManager(std::shared_ptr<Impl> impl) : impl_(std::move(impl)) {}
ResourceManager::~ResourceManager() = default;

Kit::Kit(AAssetManager* assets, const std::string& logFile)
    : impl_(std::make_shared<Impl>(assets, logFile)),
      resources_(new ResourceManager(std::make_shared<ResourceManager::Impl>(impl_))) {
  impl_->log.Write(internal::KitLog::kInfo,
                   std::string("Vexel: kit created") + (assets ? " with an asset manager" : ""));
  LiveKits().push_back(this);
}

Kit::~Kit() {
  auto& kits = LiveKits();
  kits.erase(std::remove(kits.begin(), kits.end(), this), kits.end());
  impl_->log.Write(internal::KitLog::kInfo, "Vexel: kit destroyed");
}

void Kit::drawAll() {
  // A copy: drawing never adds or removes renderers, but stay safe if it did.
  const std::vector<Renderer::Impl*> renderers = impl_->renderers;
  for (Renderer::Impl* renderer : renderers)
    renderer->Draw();
}

ResourceManager& Kit::getResourceManager() {
  return *resources_;
}

AAssetManager* Kit::getAssetManager() const {
  return impl_->assets;
}

const std::string& Kit::getLogFilePath() const {
  return impl_->log.path();
}

Kit* Kit::getCurrent() {
  const auto& kits = LiveKits();
  return kits.empty() ? nullptr : kits.back();
}

std::size_t Kit::getLiveGpuObjectCount() {
  return platform::LiveGlObjects();
}

namespace internal {

std::shared_ptr<Kit::Impl> CurrentKit(const char* what) {
  Kit* kit = Kit::getCurrent();
  if (kit == nullptr)
    throw Exception(std::string("Vexel: ") + what + " needs a live Vexel::Kit");
  return Access::SharedImplOf(*kit);
}

}  // namespace internal
}  // namespace Vexel
