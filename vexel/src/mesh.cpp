#include "mesh_impl.h"

#include "program.h"

namespace Vexel {
namespace {

GLenum ModeOf(Mesh::RenderType type) {
  switch (type) {
    case Mesh::RENDER_POINTS:
      return GL_POINTS;
    case Mesh::RENDER_LINES:
      return GL_LINES;
    case Mesh::RENDER_LINE_STRIP:
      return GL_LINE_STRIP;
    case Mesh::RENDER_TRIANGLES:
      return GL_TRIANGLES;
    case Mesh::RENDER_TRIANGLE_STRIP:
      return GL_TRIANGLE_STRIP;
    case Mesh::RENDER_TRIANGLE_FAN:
      return GL_TRIANGLE_FAN;
  }
  throw Exception("Vexel: unknown mesh render type " + std::to_string(static_cast<int>(type)));
}

void BindStream(GLint location, GLint components, int offset_floats) {
  if (location < 0)
    return;
  glEnableVertexAttribArray(static_cast<GLuint>(location));
  glVertexAttribPointer(static_cast<GLuint>(location), components, GL_FLOAT, GL_FALSE,
                        Mesh::Impl::kFloatsPerVertex * sizeof(float),
                        reinterpret_cast<const void*>(offset_floats * sizeof(float)));
}

void UnbindStream(GLint location) {
  if (location >= 0)
    glDisableVertexAttribArray(static_cast<GLuint>(location));
}

}  // namespace

void Mesh::Impl::Draw(const internal::Program& program) {
  if (!vertex_buffer || drawn_vertices == 0)
    return;
  glBindBuffer(GL_ARRAY_BUFFER, vertex_buffer->id());
  BindStream(program.position_attribute(), 3, 0);
  BindStream(program.texture_coord_attribute(), 2, 3);
  BindStream(program.normal_attribute(), 3, 5);
  if (index_buffer) {
    glBindBuffer(GL_ELEMENT_ARRAY_BUFFER, index_buffer->id());
    glDrawElements(drawn_mode, drawn_indices, GL_UNSIGNED_SHORT, nullptr);
    glBindBuffer(GL_ELEMENT_ARRAY_BUFFER, 0);
  } else {
    glDrawArrays(drawn_mode, 0, drawn_vertices);
  }
  UnbindStream(program.position_attribute());
  UnbindStream(program.texture_coord_attribute());
  UnbindStream(program.normal_attribute());
  glBindBuffer(GL_ARRAY_BUFFER, 0);
}

Mesh::Mesh(const char* name) : impl_(std::make_shared<Impl>(name != nullptr ? name : "")) {}
Mesh::~Mesh() = default;

const std::string& Mesh::getName() const {
  return impl_->name;
}

void Mesh::begin(unsigned int vertexCount, unsigned int indexCount, RenderType type) {
  ModeOf(type);  // rejects an unknown type before anything changes
  Impl& m = *impl_;
  m.defining = true;
  m.expected_vertices = vertexCount;
  m.expected_indices = indexCount;
  m.type = type;
  m.positions.clear();
  m.texture_coords.clear();
  m.normals.clear();
  m.indices.clear();
}

void Mesh::position(float x, float y, float z) {
  impl_->positions.emplace_back(x, y, z);
}
void Mesh::position(const Vector3& value) {
  impl_->positions.push_back(value);
}
void Mesh::textureCoord(float u, float v) {
  impl_->texture_coords.emplace_back(u, v);
}
void Mesh::textureCoord(const Vector2& value) {
  impl_->texture_coords.push_back(value);
}
void Mesh::normal(float x, float y, float z) {
  impl_->normals.emplace_back(x, y, z);
}
void Mesh::normal(const Vector3& value) {
  impl_->normals.push_back(value);
}
void Mesh::index(unsigned int vertex) {
  impl_->indices.push_back(vertex);
}

void Mesh::end() {
  Impl& m = *impl_;
  const std::string what = "Vexel: mesh \"" + m.name + "\": ";
  if (!m.defining)
    throw Exception(what + "end() without begin()");
  m.defining = false;
  m.defined = false;
  const auto n = static_cast<std::size_t>(m.expected_vertices);
  if (m.positions.size() != n)
    throw Exception(what + std::to_string(m.positions.size()) + " positions for " +
                    std::to_string(n) + " vertices");
  if (!m.texture_coords.empty() && m.texture_coords.size() != n)
    throw Exception(what + std::to_string(m.texture_coords.size()) + " texture coordinates for " +
                    std::to_string(n) + " vertices");
  if (!m.normals.empty() && m.normals.size() != n)
    throw Exception(what + std::to_string(m.normals.size()) + " normals for " + std::to_string(n) +
                    " vertices");
  if (m.indices.size() != m.expected_indices)
    throw Exception(what + std::to_string(m.indices.size()) + " indices where " +
                    std::to_string(m.expected_indices) + " were announced");
  if (n > 65536)
    throw Exception(what + "more than 65536 vertices");
  for (std::uint32_t index : m.indices) {
    if (index >= n)
      throw Exception(what + "index " + std::to_string(index) + " names no vertex");
  }
  m.vertices.assign(n * Impl::kFloatsPerVertex, 0.0f);
  for (std::size_t i = 0; i < n; ++i) {
    float* v = &m.vertices[i * Impl::kFloatsPerVertex];
    v[0] = m.positions[i].x;
    v[1] = m.positions[i].y;
    v[2] = m.positions[i].z;
    if (!m.texture_coords.empty()) {
      v[3] = m.texture_coords[i].x;
      v[4] = m.texture_coords[i].y;
    }
    if (!m.normals.empty()) {
      v[5] = m.normals[i].x;
      v[6] = m.normals[i].y;
      v[7] = m.normals[i].z;
    }
  }
  m.vertex_indices.assign(m.indices.begin(), m.indices.end());
  m.vertex_count = m.expected_vertices;
  m.mode = ModeOf(m.type);
  m.defined = true;
}

void Mesh::finalize() {
  Impl& m = *impl_;
  if (!m.defined)
    throw Exception("Vexel: mesh \"" + m.name + "\": finalize() before a complete definition");
  auto gpu = internal::Gpu::Acquire();
  if (!m.vertex_buffer)
    m.vertex_buffer = std::make_shared<internal::GlObject>(gpu, internal::GlObject::kBuffer);
  gpu->MakeCurrent();
  glBindBuffer(GL_ARRAY_BUFFER, m.vertex_buffer->id());
  glBufferData(GL_ARRAY_BUFFER, static_cast<GLsizeiptr>(m.vertices.size() * sizeof(float)),
               m.vertices.data(), GL_STATIC_DRAW);
  glBindBuffer(GL_ARRAY_BUFFER, 0);
  if (m.vertex_indices.empty()) {
    m.index_buffer.reset();
  } else {
    if (!m.index_buffer)
      m.index_buffer = std::make_shared<internal::GlObject>(gpu, internal::GlObject::kBuffer);
    glBindBuffer(GL_ELEMENT_ARRAY_BUFFER, m.index_buffer->id());
    glBufferData(GL_ELEMENT_ARRAY_BUFFER,
                 static_cast<GLsizeiptr>(m.vertex_indices.size() * sizeof(std::uint16_t)),
                 m.vertex_indices.data(), GL_STATIC_DRAW);
    glBindBuffer(GL_ELEMENT_ARRAY_BUFFER, 0);
  }
  m.drawn_vertices = static_cast<GLsizei>(m.vertex_count);
  m.drawn_indices = static_cast<GLsizei>(m.vertex_indices.size());
  m.drawn_mode = m.mode;
}

unsigned int Mesh::getVertexCount() const {
  return impl_->vertex_count;
}

unsigned int Mesh::getIndexCount() const {
  return static_cast<unsigned int>(impl_->vertex_indices.size());
}

}  // namespace Vexel
