#pragma once

#include <array>
#include <memory>
#include <string>
#include <vector>

#include "draw_context.h"
#include "gpu.h"
#include "kit_impl.h"
#include "program.h"
#include "vexel/Material.h"
#include "vexel/Texture.h"

namespace Vexel {

class Material::Impl {
 public:
  // Makes the program current with this material's uniforms, samplers and
  // render state for an object with this world matrix. Null when the
  // material has no program yet.
  const internal::Program* Apply(const internal::Matrix4& world,
                                 const internal::DrawContext& context);

  struct Stage {
    std::string name;
    std::string source;
  };
  struct Sampler {
    std::string name;
    std::weak_ptr<Texture::Impl> texture;
  };
  struct Uniform {
    std::string name;
    std::array<float, 4> value;
  };
  struct AutoBinding {
    std::string name;
    AutoUniform value;
  };

  std::shared_ptr<ResourceManager::Impl> resources;
  Stage vertex;
  Stage fragment;
  std::shared_ptr<internal::Program> program;
  std::vector<Sampler> samplers;
  std::vector<Uniform> uniforms;
  std::vector<AutoBinding> auto_uniforms;
  BlendMode blend = BLEND_NONE;
  bool depth_write = true;
  bool depth_test = true;
};

}  // namespace Vexel
