#include "program.h"

#include <vector>

#include "vexel/Exception.h"

namespace Vexel::internal {
namespace {

std::string InfoLog(GLuint object, bool is_program) {
  GLint length = 0;
  if (is_program)
    glGetProgramiv(object, GL_INFO_LOG_LENGTH, &length);
  else
    glGetShaderiv(object, GL_INFO_LOG_LENGTH, &length);
  if (length <= 1)
    return "(no info log)";
  std::vector<char> text(static_cast<std::size_t>(length));
  if (is_program)
    glGetProgramInfoLog(object, length, nullptr, text.data());
  else
    glGetShaderInfoLog(object, length, nullptr, text.data());
  std::string log(text.data());
  while (!log.empty() && (log.back() == '\n' || log.back() == ' '))
    log.pop_back();
  return log;
}

}  // namespace

Program::Program(std::shared_ptr<Gpu> gpu, const std::string& vertex_name,
                 const std::string& vertex_source, const std::string& fragment_name,
                 const std::string& fragment_source) {
  program_ = std::make_shared<GlObject>(gpu, GlObject::kProgram);
  auto vertex = Compile(GL_VERTEX_SHADER, vertex_name, vertex_source);
  auto fragment = Compile(GL_FRAGMENT_SHADER, fragment_name, fragment_source);
  glAttachShader(program_->id(), vertex->id());
  glAttachShader(program_->id(), fragment->id());
  glLinkProgram(program_->id());
  GLint linked = GL_FALSE;
  glGetProgramiv(program_->id(), GL_LINK_STATUS, &linked);
  if (linked != GL_TRUE) {
    throw Exception("Vexel: shaders \"" + vertex_name + "\" and \"" + fragment_name +
                    "\" failed to link: " + InfoLog(program_->id(), true));
  }
  // The linked program keeps what it needs; the shader objects can go.
  glDetachShader(program_->id(), vertex->id());
  glDetachShader(program_->id(), fragment->id());
  Introspect();
}

std::shared_ptr<GlObject> Program::Compile(GLenum type, const std::string& name,
                                           const std::string& source) {
  auto shader =
      std::make_shared<GlObject>(program_->gpu().shared_from_this(), GlObject::kShader, type);
  const char* text = source.c_str();
  glShaderSource(shader->id(), 1, &text, nullptr);
  glCompileShader(shader->id());
  GLint compiled = GL_FALSE;
  glGetShaderiv(shader->id(), GL_COMPILE_STATUS, &compiled);
  if (compiled != GL_TRUE) {
    const char* stage = type == GL_VERTEX_SHADER ? "vertex" : "fragment";
    throw Exception("Vexel: " + std::string(stage) + " shader \"" + name +
                    "\" failed to compile: " + InfoLog(shader->id(), false));
  }
  return shader;
}

void Program::Introspect() {
  const GLuint id = program_->id();
  GLint count = 0;
  GLint longest = 0;
  glGetProgramiv(id, GL_ACTIVE_ATTRIBUTES, &count);
  glGetProgramiv(id, GL_ACTIVE_ATTRIBUTE_MAX_LENGTH, &longest);
  std::vector<char> name(static_cast<std::size_t>(longest > 0 ? longest : 1) + 1);
  for (GLint i = 0; i < count; ++i) {
    GLint size = 0;
    GLenum type = 0;
    glGetActiveAttrib(id, static_cast<GLuint>(i), static_cast<GLsizei>(name.size()), nullptr, &size,
                      &type, name.data());
    const std::string attribute(name.data());
    const GLint location = glGetAttribLocation(id, name.data());
    attributes_[attribute] = location;
    // Streams go by the names the source declares: "uv0" (or any vec2) takes
    // texture coordinates, "normal" normals, and the first other vector the
    // positions, whatever the shader calls it.
    if (attribute == "normal") {
      normal_ = location;
    } else if (attribute == "uv0") {
      texture_coord_ = location;
    } else if (type == GL_FLOAT_VEC2) {
      if (texture_coord_ < 0)
        texture_coord_ = location;
    } else if ((type == GL_FLOAT_VEC3 || type == GL_FLOAT_VEC4) && position_ < 0) {
      position_ = location;
    }
  }
  glGetProgramiv(id, GL_ACTIVE_UNIFORMS, &count);
  glGetProgramiv(id, GL_ACTIVE_UNIFORM_MAX_LENGTH, &longest);
  name.assign(static_cast<std::size_t>(longest > 0 ? longest : 1) + 1, '\0');
  for (GLint i = 0; i < count; ++i) {
    GLint size = 0;
    GLenum type = 0;
    glGetActiveUniform(id, static_cast<GLuint>(i), static_cast<GLsizei>(name.size()), nullptr,
                       &size, &type, name.data());
    std::string uniform(name.data());
    if (uniform.size() > 3 && uniform.compare(uniform.size() - 3, 3, "[0]") == 0)
      uniform.resize(uniform.size() - 3);
    uniforms_[uniform] = Uniform{glGetUniformLocation(id, uniform.c_str()), type};
  }
}

GLint Program::attribute(const std::string& name) const {
  auto found = attributes_.find(name);
  return found != attributes_.end() ? found->second : -1;
}

const Program::Uniform* Program::uniform(const std::string& name) const {
  auto found = uniforms_.find(name);
  return found != uniforms_.end() ? &found->second : nullptr;
}

}  // namespace Vexel::internal
