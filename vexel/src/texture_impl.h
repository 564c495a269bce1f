#pragma once

#include <GLES2/gl2.h>

#include <memory>
#include <string>

#include "gpu.h"
#include "kit_impl.h"
#include "vexel/Texture.h"

namespace Vexel {

class Texture::Impl {
 public:
  // Binds the texture (or nothing, before it has an image) to a unit.
  void Bind(GLuint unit);

  std::shared_ptr<ResourceManager::Impl> resources;
  std::string name;
  bool mipmaps_wanted = false;
  bool has_mipmaps = false;
  int width = 0;
  int height = 0;
  PixelFormat format = PIXEL_FORMAT_RGBA8;
  FilterMode min_filter = FILTER_LINEAR;
  FilterMode mag_filter = FILTER_LINEAR;
  WrapMode wrap_u = WRAP_CLAMP;
  WrapMode wrap_v = WRAP_CLAMP;
  bool parameters_dirty = true;
  std::shared_ptr<internal::GlObject> texture;
};

}  // namespace Vexel
