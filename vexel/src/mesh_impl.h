#pragma once

#include <GLES2/gl2.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "gpu.h"
#include "vexel/Mesh.h"

namespace Vexel {

namespace internal {
class Program;
}

class Mesh::Impl {
 public:
  explicit Impl(std::string mesh_name) : name(std::move(mesh_name)) {}

  // Binds the mesh's streams to the program's attributes and draws it.
  void Draw(const internal::Program& program);

  std::string name;

  // The definition being built between begin() and end().
  bool defining = false;
  unsigned int expected_vertices = 0;
  unsigned int expected_indices = 0;
  RenderType type = RENDER_TRIANGLES;
  std::vector<Vector3> positions;
  std::vector<Vector2> texture_coords;
  std::vector<Vector3> normals;
  std::vector<std::uint32_t> indices;

  // The last complete definition: position, texture coordinate and normal
  // interleaved, 8 floats a vertex.
  static constexpr int kFloatsPerVertex = 8;
  bool defined = false;
  std::vector<float> vertices;
  std::vector<std::uint16_t> vertex_indices;
  unsigned int vertex_count = 0;
  GLenum mode = GL_TRIANGLES;

  // On the device after finalize().
  std::shared_ptr<internal::GlObject> vertex_buffer;
  std::shared_ptr<internal::GlObject> index_buffer;
  GLsizei drawn_vertices = 0;
  GLsizei drawn_indices = 0;
  GLenum drawn_mode = GL_TRIANGLES;
};

}  // namespace Vexel
