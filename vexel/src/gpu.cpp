#include "gpu.h"

#include <mutex>
#include <stdexcept>

#include "program.h"
#include "vexel/Exception.h"

namespace Vexel::internal {

std::shared_ptr<Gpu> Gpu::Acquire() {
  static std::mutex mutex;
  static std::weak_ptr<Gpu> shared;
  std::lock_guard<std::mutex> lock(mutex);
  std::shared_ptr<Gpu> gpu = shared.lock();
  if (!gpu) {
    try {
      gpu = std::make_shared<Gpu>(platform::GlDevice::Acquire());
    } catch (const std::runtime_error& error) {
      throw Exception(std::string("Vexel: no graphics device: ") + error.what());
    }
    shared = gpu;
  }
  return gpu;
}

Gpu::Gpu(std::shared_ptr<platform::GlDevice> device) : device_(std::move(device)) {}

std::shared_ptr<Program> Gpu::GetProgram(const std::string& vertex_name,
                                         const std::string& vertex_source,
                                         const std::string& fragment_name,
                                         const std::string& fragment_source) {
  const auto key = std::make_pair(vertex_source, fragment_source);
  auto found = programs_.find(key);
  if (found != programs_.end()) {
    if (std::shared_ptr<Program> program = found->second.lock())
      return program;
  }
  auto program = std::make_shared<Program>(shared_from_this(), vertex_name, vertex_source,
                                           fragment_name, fragment_source);
  // Forget programs no material holds any more, so the map does not grow.
  for (auto it = programs_.begin(); it != programs_.end();) {
    it = it->second.expired() ? programs_.erase(it) : std::next(it);
  }
  programs_[key] = program;
  return program;
}

GlObject::GlObject(std::shared_ptr<Gpu> gpu, Kind kind, GLenum shader_type)
    : gpu_(std::move(gpu)), kind_(kind) {
  gpu_->MakeCurrent();
  switch (kind_) {
    case kTexture:
      glGenTextures(1, &id_);
      break;
    case kBuffer:
      glGenBuffers(1, &id_);
      break;
    case kShader:
      id_ = glCreateShader(shader_type);
      break;
    case kProgram:
      id_ = glCreateProgram();
      break;
  }
  if (id_ == 0)
    throw Exception("Vexel: the graphics device could not create an object");
  platform::CountGlObjects(1);
}

GlObject::~GlObject() {
  platform::CountGlObjects(-1);
  try {
    gpu_->MakeCurrent();
  } catch (const std::exception&) {
    return;  // the context is gone, and the object with it
  }
  switch (kind_) {
    case kTexture:
      glDeleteTextures(1, &id_);
      break;
    case kBuffer:
      glDeleteBuffers(1, &id_);
      break;
    case kShader:
      glDeleteShader(id_);
      break;
    case kProgram:
      glDeleteProgram(id_);
      break;
  }
}

}  // namespace Vexel::internal
