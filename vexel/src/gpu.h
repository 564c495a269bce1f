#pragma once

#include <GLES2/gl2.h>

#include <map>
#include <memory>
#include <string>
#include <utility>

#include "platform/gl_device.h"

namespace Vexel::internal {

class Program;

// The kit's side of the process's graphics device: makes its context
// current and keeps the compiled shader programs, shared by every material
// with the same pair of sources and released with the last of them.
class Gpu : public std::enable_shared_from_this<Gpu> {
 public:
  // The live one, or a new one on a new platform device. Throws
  // Vexel::Exception when no device can be made.
  static std::shared_ptr<Gpu> Acquire();

  explicit Gpu(std::shared_ptr<platform::GlDevice> device);
  void MakeCurrent() { device_->MakeCurrent(); }
  const std::shared_ptr<platform::GlDevice>& device() const { return device_; }

  // Compiled and linked on first request; throws Vexel::Exception with the
  // info log when a shader does not compile or the pair does not link.
  std::shared_ptr<Program> GetProgram(const std::string& vertex_name,
                                      const std::string& vertex_source,
                                      const std::string& fragment_name,
                                      const std::string& fragment_source);

 private:
  std::shared_ptr<platform::GlDevice> device_;
  std::map<std::pair<std::string, std::string>, std::weak_ptr<Program>> programs_;
};

// One GL object name of a kind, deleted (with the context made current) when
// the handle goes away.
class GlObject {
 public:
  enum Kind { kTexture, kBuffer, kShader, kProgram };

  GlObject(std::shared_ptr<Gpu> gpu, Kind kind, GLenum shader_type = 0);
  ~GlObject();
  GlObject(const GlObject&) = delete;
  GlObject& operator=(const GlObject&) = delete;

  GLuint id() const { return id_; }
  Gpu& gpu() const { return *gpu_; }

 private:
  std::shared_ptr<Gpu> gpu_;
  Kind kind_;
  GLuint id_ = 0;
};

}  // namespace Vexel::internal
