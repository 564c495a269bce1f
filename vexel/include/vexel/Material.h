#pragma once

#include <memory>

#include "vexel/Exception.h"
#include "vexel/Math.h"

namespace Vexel {

class ResourceManager;
class Texture;

// How an object is drawn: a GLSL ES 1.00 vertex and fragment shader, the
// textures bound to their samplers, uniform values and render state.
//
// The program is compiled and linked as soon as both shaders are set; a
// shader that fails to compile or a pair that fails to link throws
// Vexel::Exception carrying the shader's name and the device's info log, and
// the material keeps its previous program. Mesh attributes reach the program
// by the names it declares: the first vec4/vec3 attribute that is not a
// normal gets positions ("position", "vertex" or any other name), "uv0" (or
// any vec2 attribute) texture coordinates, "normal" normals.
//
// Uniforms belong to the program as a whole; the shader type names the stage
// that declares them. A name the program does not use is ignored.
class Material {
 public:
  enum ShaderType {
    SHADER_VERTEX = 0,
    SHADER_FRAGMENT = 1,
  };
  enum AutoUniform {
    AUTO_UNIFORM_WORLD_MATRIX = 0,
    AUTO_UNIFORM_VIEW_PROJECTION_MATRIX = 1,
    AUTO_UNIFORM_WORLD_VIEW_PROJECTION_MATRIX = 2,
  };
  enum BlendMode {
    BLEND_ALPHA = 0,     // source alpha, one minus source alpha
    BLEND_ADDITIVE = 1,  // source alpha, one
    BLEND_NONE = 2,      // opaque: the default
  };

  explicit Material(ResourceManager& resources);
  ~Material();
  Material(const Material&) = delete;
  Material& operator=(const Material&) = delete;

  void setShader(ShaderType type, const char* name, const char* source);
  // Binds a texture to a sampler uniform; null unbinds it. The material does
  // not own the texture: once the texture is destroyed the sampler reads an
  // unbound unit.
  void setShaderSampler(ShaderType type, const char* name, Texture* texture);
  void setShaderUniform(ShaderType type, const char* name, float value);
  void setShaderUniform(ShaderType type, const char* name, const Vector2& value);
  void setShaderUniform(ShaderType type, const char* name, const Vector3& value);
  void setShaderUniform(ShaderType type, const char* name, const Color& value);
  // A uniform the kit fills for every object drawn.
  void setShaderAutoUniform(ShaderType type, const char* name, AutoUniform value);

  void setBlendMode(BlendMode mode);
  BlendMode getBlendMode() const;
  // Defaults: depth test on (less or equal, so coplanar objects draw in scene
  // order), depth writes on.
  void setDepthWriteEnabled(bool enabled);
  bool isDepthWriteEnabled() const;
  void setDepthTestEnabled(bool enabled);
  bool isDepthTestEnabled() const;

  class Impl;

 private:
  friend struct detail::Access;
  std::shared_ptr<Impl> impl_;
};

}  // namespace Vexel
