#include <algorithm>

#include "access.h"
#include "material_impl.h"
#include "texture_impl.h"

namespace Vexel {
namespace {

using internal::Matrix4;

void CheckStage(Material::ShaderType type) {
  if (type != Material::SHADER_VERTEX && type != Material::SHADER_FRAGMENT)
    throw Exception("Vexel: unknown shader type " + std::to_string(static_cast<int>(type)));
}

std::string NameOf(const char* name) {
  return name != nullptr ? name : "";
}

// Replaces the entry of that name, or appends one.
template <class Entry>
Entry& Named(std::vector<Entry>& entries, const std::string& name) {
  auto found = std::find_if(entries.begin(), entries.end(),
                            [&](const Entry& entry) { return entry.name == name; });
  if (found != entries.end())
    return *found;
  entries.push_back(Entry{});
  entries.back().name = name;
  return entries.back();
}

void SetUniform(const internal::Program::Uniform& uniform, const std::array<float, 4>& v) {
  switch (uniform.type) {
    case GL_FLOAT:
      glUniform1f(uniform.location, v[0]);
      break;
    case GL_FLOAT_VEC2:
      glUniform2fv(uniform.location, 1, v.data());
      break;
    case GL_FLOAT_VEC3:
      glUniform3fv(uniform.location, 1, v.data());
      break;
    case GL_FLOAT_VEC4:
      glUniform4fv(uniform.location, 1, v.data());
      break;
    default:
      break;  // not a float uniform: nothing sensible to write
  }
}

}  // namespace

const internal::Program* Material::Impl::Apply(const Matrix4& world,
                                               const internal::DrawContext& context) {
  if (!program)
    return nullptr;
  glUseProgram(program->id());
  for (const AutoBinding& binding : auto_uniforms) {
    const internal::Program::Uniform* uniform = program->uniform(binding.name);
    if (uniform == nullptr || uniform->type != GL_FLOAT_MAT4)
      continue;
    Matrix4 value;
    switch (binding.value) {
      case AUTO_UNIFORM_WORLD_MATRIX:
        value = world;
        break;
      case AUTO_UNIFORM_VIEW_PROJECTION_MATRIX:
        value = context.view_projection;
        break;
      case AUTO_UNIFORM_WORLD_VIEW_PROJECTION_MATRIX:
        value = context.view_projection * world;
        break;
    }
    glUniformMatrix4fv(uniform->location, 1, GL_FALSE, value.m.data());
  }
  for (const Uniform& value : uniforms) {
    if (const internal::Program::Uniform* uniform = program->uniform(value.name))
      SetUniform(*uniform, value.value);
  }
  GLuint unit = 0;
  for (const Sampler& sampler : samplers) {
    const internal::Program::Uniform* uniform = program->uniform(sampler.name);
    if (uniform == nullptr)
      continue;
    std::shared_ptr<Texture::Impl> texture = sampler.texture.lock();
    if (texture) {
      texture->Bind(unit);
    } else {
      glActiveTexture(GL_TEXTURE0 + unit);
      glBindTexture(GL_TEXTURE_2D, 0);
    }
    glUniform1i(uniform->location, static_cast<GLint>(unit));
    ++unit;
  }
  internal::RenderState state;
  state.blend = blend == BLEND_ALPHA      ? internal::RenderState::kAlpha
                : blend == BLEND_ADDITIVE ? internal::RenderState::kAdditive
                                          : internal::RenderState::kNone;
  state.depth_test = depth_test;
  state.depth_write = depth_write;
  internal::ApplyRenderState(state);
  return program.get();
}

Material::Material(ResourceManager& resources) : impl_(std::make_shared<Impl>()) {
  impl_->resources = internal::Access::SharedImplOf(resources);
}

Material::~Material() = default;

void Material::setShader(ShaderType type, const char* name, const char* source) {
  CheckStage(type);
  Impl& m = *impl_;
  Impl::Stage stage{NameOf(name), NameOf(source)};
  const Impl::Stage& vertex = type == SHADER_VERTEX ? stage : m.vertex;
  const Impl::Stage& fragment = type == SHADER_FRAGMENT ? stage : m.fragment;
  if (!vertex.source.empty() && !fragment.source.empty()) {
    try {
      m.program = internal::Gpu::Acquire()->GetProgram(vertex.name, vertex.source, fragment.name,
                                                       fragment.source);
    } catch (const Exception& error) {
      m.resources->kit->log.Write(internal::KitLog::kError, error.what());
      throw;
    }
  }
  (type == SHADER_VERTEX ? m.vertex : m.fragment) = std::move(stage);
}

void Material::setShaderSampler(ShaderType type, const char* name, Texture* texture) {
  CheckStage(type);
  Impl::Sampler& sampler = Named(impl_->samplers, NameOf(name));
  sampler.texture = texture != nullptr ? internal::Access::SharedImplOf(*texture)
                                       : std::weak_ptr<Texture::Impl>();
}

void Material::setShaderUniform(ShaderType type, const char* name, float value) {
  CheckStage(type);
  Named(impl_->uniforms, NameOf(name)).value = {value, 0.0f, 0.0f, 0.0f};
}

void Material::setShaderUniform(ShaderType type, const char* name, const Vector2& value) {
  CheckStage(type);
  Named(impl_->uniforms, NameOf(name)).value = {value.x, value.y, 0.0f, 0.0f};
}

void Material::setShaderUniform(ShaderType type, const char* name, const Vector3& value) {
  CheckStage(type);
  Named(impl_->uniforms, NameOf(name)).value = {value.x, value.y, value.z, 0.0f};
}

void Material::setShaderUniform(ShaderType type, const char* name, const Color& value) {
  CheckStage(type);
  Named(impl_->uniforms, NameOf(name)).value = {value.r, value.g, value.b, value.a};
}

void Material::setShaderAutoUniform(ShaderType type, const char* name, AutoUniform value) {
  CheckStage(type);
  if (value < AUTO_UNIFORM_WORLD_MATRIX || value > AUTO_UNIFORM_WORLD_VIEW_PROJECTION_MATRIX)
    throw Exception("Vexel: unknown automatic uniform " + std::to_string(static_cast<int>(value)));
  Named(impl_->auto_uniforms, NameOf(name)).value = value;
}

void Material::setBlendMode(BlendMode mode) {
  if (mode < BLEND_ALPHA || mode > BLEND_NONE)
    throw Exception("Vexel: unknown blend mode " + std::to_string(static_cast<int>(mode)));
  impl_->blend = mode;
}
Material::BlendMode Material::getBlendMode() const {
  return impl_->blend;
}
void Material::setDepthWriteEnabled(bool enabled) {
  impl_->depth_write = enabled;
}
bool Material::isDepthWriteEnabled() const {
  return impl_->depth_write;
}
void Material::setDepthTestEnabled(bool enabled) {
  impl_->depth_test = enabled;
}
bool Material::isDepthTestEnabled() const {
  return impl_->depth_test;
}

}  // namespace Vexel
