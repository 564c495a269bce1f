#pragma once

#include <memory>

#include "platform/gl_device.h"

namespace platform {

// Made once per process by GlDevice::Acquire; defined per platform.
std::shared_ptr<GlDevice> CreatePlatformGlDevice();

}  // namespace platform
