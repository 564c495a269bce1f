#pragma once

#include <memory>
#include <string>

#include "vexel/Exception.h"
#include "vexel/Math.h"

namespace Vexel {

// Geometry shared by any number of objects. Defined between begin() and
// end(): each attribute call sets the next vertex's value of that attribute,
// so positions, texture coordinates and normals may come interleaved per
// vertex or one attribute after another. Every attribute given must be given
// for every vertex; a mesh without texture coordinates or normals gets zeros.
// finalize() hands the geometry to the graphics device; a mesh may be defined
// again with another begin().
class Mesh {
 public:
  enum RenderType {
    RENDER_POINTS = 0,
    RENDER_LINES = 1,
    RENDER_LINE_STRIP = 2,
    RENDER_TRIANGLES = 3,
    RENDER_TRIANGLE_STRIP = 4,
    RENDER_TRIANGLE_FAN = 5,
  };

  explicit Mesh(const char* name);
  ~Mesh();
  Mesh(const Mesh&) = delete;
  Mesh& operator=(const Mesh&) = delete;

  const std::string& getName() const;

  void begin(unsigned int vertexCount, unsigned int indexCount, RenderType type);
  void position(float x, float y, float z);
  void position(const Vector3& value);
  void textureCoord(float u, float v);
  void textureCoord(const Vector2& value);
  void normal(float x, float y, float z);
  void normal(const Vector3& value);
  // Vertex indices are below 65536 (16-bit index buffers).
  void index(unsigned int vertex);
  // Throws Vexel::Exception when the counts given differ from begin()'s or an
  // index names no vertex; the mesh then stays undefined.
  void end();
  void finalize();

  unsigned int getVertexCount() const;
  unsigned int getIndexCount() const;

  class Impl;

 private:
  friend struct detail::Access;
  std::shared_ptr<Impl> impl_;
};

}  // namespace Vexel
