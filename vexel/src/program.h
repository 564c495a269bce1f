#pragma once

#include <GLES2/gl2.h>

#include <memory>
#include <string>
#include <unordered_map>

#include "gpu.h"

namespace Vexel::internal {

// A linked GLSL ES program with what it declares: where the mesh streams go
// (by the attribute names and types the source uses) and its uniforms.
class Program {
 public:
  // Throws Vexel::Exception with the info log on a compile or link failure.
  Program(std::shared_ptr<Gpu> gpu, const std::string& vertex_name,
          const std::string& vertex_source, const std::string& fragment_name,
          const std::string& fragment_source);

  GLuint id() const { return program_->id(); }
  Gpu& gpu() const { return program_->gpu(); }

  // Attribute locations of the mesh streams; -1 when the program has none.
  GLint position_attribute() const { return position_; }
  GLint texture_coord_attribute() const { return texture_coord_; }
  GLint normal_attribute() const { return normal_; }
  // Any attribute location by name, -1 when absent.
  GLint attribute(const std::string& name) const;

  struct Uniform {
    GLint location;
    GLenum type;
  };
  // Null when the program has no active uniform of that name.
  const Uniform* uniform(const std::string& name) const;

 private:
  std::shared_ptr<GlObject> Compile(GLenum type, const std::string& name,
                                    const std::string& source);
  void Introspect();

  std::shared_ptr<GlObject> program_;
  GLint position_ = -1;
  GLint texture_coord_ = -1;
  GLint normal_ = -1;
  std::unordered_map<std::string, GLint> attributes_;
  std::unordered_map<std::string, Uniform> uniforms_;
};

}  // namespace Vexel::internal
