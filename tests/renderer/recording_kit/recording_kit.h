#pragma once

// A recording implementation of the scene kit's interface (vexel/*.h) for
// the renderer's C++ tests: no graphics device; every object keeps what it
// was told (graph links, transforms, names, uploads, shaders, uniforms, text
// settings) and notable calls go to one journal, in order. Linked in place
// of libVexelKit.
//
// Text metrics are made up but fixed: one em per CJK code point (U+2E80 and
// above), half an em per other code point, plus the extra spacing between
// neighbouring code points; the line box is 1.2 em tall with its top at y = 0
// and it is centred on x = 0.

#include <cstdint>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "vexel/Vexel.h"

struct AAssetManager;
struct ANativeWindow;

namespace Vexel {

class ResourceManager::Impl {};

class Kit::Impl {
 public:
  AAssetManager* assets = nullptr;
  std::string log_file;
  int draw_count = 0;
};

class Texture::Impl {
 public:
  std::string name;
  int width = 0;
  int height = 0;
  int upload_count = 0;
  const unsigned char* last_data = nullptr;
  PixelFormat format = PIXEL_FORMAT_RGBA8;
  FilterMode min_filter = FILTER_LINEAR;
  FilterMode mag_filter = FILTER_LINEAR;
  WrapMode u_wrap = WRAP_CLAMP;
  WrapMode v_wrap = WRAP_CLAMP;
};

class Material::Impl {
 public:
  struct Shader {
    std::string name;
    std::string source;
  };
  std::map<int, Shader> shaders;  // by shader type
  std::map<std::string, std::pair<int, Texture*>> samplers;
  std::map<std::string, std::pair<int, Vector3>> vector_uniforms;
  std::map<std::string, std::pair<int, AutoUniform>> auto_uniforms;
  BlendMode blend = BLEND_NONE;
  bool depth_write = true;
  bool depth_test = true;
};

class Mesh::Impl {
 public:
  std::string name;
  unsigned int vertex_count = 0;
  unsigned int index_count = 0;
  RenderType type = RENDER_TRIANGLES;
  std::vector<Vector3> positions;
  std::vector<Vector2> uvs;
  std::vector<Vector3> normals;
  std::vector<unsigned int> indices;
  bool ended = false;
  bool finalized = false;
};

class Font::Impl {
 public:
  std::string name;
  FileType file_type = FILE_TYPE_PATH;
  bool antialiased = false;
  std::uint32_t reference_character = 0;
};

class Node::Impl {
 public:
  enum class Kind { kEmpty, kCamera, kObject, kText };
  explicit Impl(Kind node_kind) : kind(node_kind) {}

  Kind kind;
  Node* owner = nullptr;
  Impl* parent = nullptr;
  std::vector<Impl*> children;
  Vector3 position;
  Vector3 scale{1.0f, 1.0f, 1.0f};
  float rotation = 0.0f;
  bool visible = true;

  // Camera.
  ProjectionMode projection = PROJECTION_PERSPECTIVE;
  float ortho_width = 0.0f;
  float ortho_height = 0.0f;
  bool automatic_aspect = true;
  float aspect = 1.0f;
  float near_clip = 1.0f;
  float far_clip = 1000.0f;
  float field_of_view = 45.0f;

  // Object.
  std::string mesh_name;
  std::shared_ptr<Mesh::Impl> mesh;
  std::vector<Material*> materials;

  // Text.
  std::string font_name;
  std::uint32_t font_reference_character = 0;
  std::string text;
  bool normalized = false;
  Rect container;
  int alignment = 0;
  float extra_spacing = 0.0f;
  Color color;
  bool initialized = false;
  int layout_count = 0;  // how often the text was laid out
  bool layout_dirty = true;
};

class Scene::Impl {
 public:
  Color background;
  bool shadows = true;
  std::unique_ptr<EmptyNode> root;
};

class Renderer::Impl {
 public:
  ANativeWindow* window = nullptr;
  int samples = 0;
  Scene* scene = nullptr;
};

namespace detail {
struct Access {
  template <class T>
  static auto& ImplOf(const T& object) {
    return *object.impl_;
  }
  template <class T>
  static auto SharedImplOf(const T& object) {
    return object.impl_;
  }
};
}  // namespace detail

}  // namespace Vexel

namespace vexel_recording {

// Calls in order, e.g. "Kit", "~Kit", "Renderer.setScene", "Texture InpaintedTexture0",
// "setImage InpaintedTexture0 8x6", "Font NotoSansCJK-Regular.ttc 2".
std::vector<std::string>& Journal();
void ClearJournal();
// Number of journal entries equal to `entry`, or starting with it when it
// ends with '*'.
int CountEntries(const std::string& entry);
// Index of the first entry equal to `entry` at or after `from`; -1 if none.
int FindEntry(const std::string& entry, int from = 0);

// Operations that throw Vexel::Exception while listed, named like their
// journal entries without arguments ("Text.initialize", "Font", "Kit.drawAll";
// also "Node.removeChild", which is not journaled).
void FailOn(const std::string& operation);
void ClearFailures();

// Live counts of kit objects, by class name ("Texture", "Material", "Text"...).
int LiveCount(const std::string& class_name);

template <class T>
auto& StateOf(const T& object) {
  return Vexel::detail::Access::ImplOf(object);
}
Vexel::Node::Impl& NodeState(const Vexel::Node& node);

}  // namespace vexel_recording
