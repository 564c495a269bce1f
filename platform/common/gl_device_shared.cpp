// The parts of the graphics device that both platforms share: one device per
// process, made on demand, and the count of live graphics objects.
#include <atomic>
#include <mutex>

#include "platform/gl_device.h"
#include "platform_gl_device.h"

namespace platform {
namespace {

std::atomic<long> live_gl_objects{0};

}  // namespace

std::shared_ptr<GlDevice> GlDevice::Acquire() {
  static std::mutex mutex;
  static std::weak_ptr<GlDevice> shared;
  std::lock_guard<std::mutex> lock(mutex);
  std::shared_ptr<GlDevice> device = shared.lock();
  if (!device) {
    device = CreatePlatformGlDevice();
    shared = device;
  }
  return device;
}

void CountGlObjects(long delta) {
  live_gl_objects.fetch_add(delta);
}

std::size_t LiveGlObjects() {
  const long live = live_gl_objects.load();
  return live > 0 ? static_cast<std::size_t>(live) : 0;
}

}  // namespace platform
