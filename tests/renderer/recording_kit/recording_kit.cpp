// The recording kit: see recording_kit.h.
#include "recording_kit.h"

#include <algorithm>
#include <map>
#include <set>
#include <sstream>

namespace Vexel {
namespace detail {
struct Access {
  template <class T>
  static auto& Ptr(const T& object) {
    return object.impl_;
  }
};
}  // namespace detail

// Journals its object's construction ("Texture RenderTexture") and, with a
// leading '~', destruction, counting the live objects of the class named by
// the entry's first word; construction throws while that class is listed as
// failing. An empty entry (a plain group node) is not tracked.
struct Tracked {
  explicit Tracked(std::string journal_entry);
  ~Tracked();
  std::string entry;
};

struct Kit::Impl : Tracked {
  using Tracked::Tracked;
};
struct Renderer::Impl : Tracked {
  using Tracked::Tracked;
};
struct Scene::Impl : Tracked {
  using Tracked::Tracked;
  EmptyNode root;
};
struct Texture::Impl : Tracked {
  using Tracked::Tracked;
  std::string name = entry.substr(entry.find(' ') + 1);
  int width = 0, height = 0;
};
struct Material::Impl : Tracked {
  using Tracked::Tracked;
  std::map<std::string, Vector3> uniforms;
};
struct Mesh::Impl : Tracked, vexel_recording::MeshData {
  using Tracked::Tracked;
};
struct Font::Impl : Tracked {
  using Tracked::Tracked;
  std::string name;
  std::uint32_t reference_character = 0;
};
struct Node::Impl : Tracked {
  using Tracked::Tracked;
  Node* owner = nullptr;
  Impl* parent = nullptr;
  std::vector<Impl*> children;
  Vector3 position;
  Vector3 scale{1.0f, 1.0f, 1.0f};
  float rotation = 0.0f;
  float ortho_width = 0.0f, ortho_height = 0.0f;  // camera
  std::shared_ptr<Mesh::Impl> mesh;               // object
  Material* material = nullptr;
  std::string text;  // text
  float extra_spacing = 0.0f;
  Color color;
};

}  // namespace Vexel

namespace vexel_recording {

std::vector<std::string>& Journal() {
  static std::vector<std::string> journal;
  return journal;
}

int CountEntries(const std::string& entry) {
  const bool prefix = !entry.empty() && entry.back() == '*';
  const std::string stem = prefix ? entry.substr(0, entry.size() - 1) : entry;
  return static_cast<int>(std::count_if(Journal().begin(), Journal().end(), [&](const auto& e) {
    return prefix ? e.compare(0, stem.size(), stem) == 0 : e == entry;
  }));
}

int FindEntry(const std::string& entry, int from) {
  const auto found = std::find(Journal().begin() + from, Journal().end(), entry);
  return found != Journal().end() ? static_cast<int>(found - Journal().begin()) : -1;
}

std::set<std::string>& Failures() {
  static std::set<std::string> failures;
  return failures;
}

int& LiveCount(const std::string& class_name) {
  static std::map<std::string, int> live;
  return live[class_name];
}

const MeshData& MeshOf(const Vexel::Object& object) {
  return *Vexel::detail::Access::Ptr<Vexel::Node>(object)->mesh;
}

const std::map<std::string, Vexel::Vector3>& UniformsOf(const Vexel::Material& material) {
  return Vexel::detail::Access::Ptr(material)->uniforms;
}

}  // namespace vexel_recording

namespace Vexel {
namespace {

template <typename... Args>
std::string Entry(const std::string& operation, const Args&... args) {
  std::ostringstream entry;
  entry << std::boolalpha << operation;
  ((entry << ' ' << args), ...);
  return entry.str();
}

// Journals one call, or throws if its operation (the entry's first word) is
// listed as failing.
template <typename... Args>
void Record(const std::string& operation, const Args&... args) {
  std::string entry = Entry(operation, args...);
  const std::string name = entry.substr(0, entry.find(' '));
  if (vexel_recording::Failures().count(name) != 0)
    throw Exception("recording kit: " + name + " fails as asked");
  vexel_recording::Journal().push_back(std::move(entry));
}

Node::Impl& NodeOf(const Node& node) {
  return *detail::Access::Ptr(node);
}

void Detach(Node::Impl& node) {
  if (node.parent == nullptr)
    return;
  auto& siblings = node.parent->children;
  siblings.erase(std::find(siblings.begin(), siblings.end(), &node));
  node.parent = nullptr;
}

void DetachChildren(Node::Impl& node) {
  for (Node::Impl* child : node.children)
    child->parent = nullptr;
  node.children.clear();
}

}  // namespace

Tracked::Tracked(std::string journal_entry) : entry(std::move(journal_entry)) {
  if (entry.empty())
    return;
  Record(entry);
  ++vexel_recording::LiveCount(entry.substr(0, entry.find(' ')));
}
Tracked::~Tracked() {
  if (entry.empty())
    return;
  vexel_recording::Journal().push_back("~" + entry);
  --vexel_recording::LiveCount(entry.substr(0, entry.find(' ')));
}

ResourceManager::ResourceManager(std::shared_ptr<Impl> impl) : impl_(std::move(impl)) {}
ResourceManager::~ResourceManager() = default;

Kit::Kit(AAssetManager* /*assets*/, const std::string& logFile)
    : impl_(std::make_shared<Impl>("Kit " + logFile)), resources_(new ResourceManager(nullptr)) {}
Kit::~Kit() = default;
void Kit::drawAll() {
  Record("Kit.drawAll");
}
ResourceManager& Kit::getResourceManager() {
  return *resources_;
}

Renderer::Renderer(std::unique_ptr<Impl> impl) : impl_(std::move(impl)) {}
Renderer::~Renderer() = default;
void Renderer::setScene(Scene* /*scene*/) {}
AndroidSurfaceRenderer::AndroidSurfaceRenderer(Kit& /*kit*/, ANativeWindow* /*window*/,
                                               AntiAliasingSamples samples)
    : Renderer(std::make_unique<Impl>(Entry("Renderer", samples))) {}
AndroidSurfaceRenderer::~AndroidSurfaceRenderer() = default;

Scene::Scene(Kit& /*kit*/) : impl_(std::make_shared<Impl>("Scene")) {}
Scene::~Scene() = default;
void Scene::setBackgroundColor(const Color& /*color*/) {}
void Scene::setShadowEnabled(bool /*enabled*/) {}
Node* Scene::getRootNode() {
  return &impl_->root;
}

Node::Node(std::unique_ptr<Impl> impl) : impl_(std::move(impl)) {
  impl_->owner = this;
}
Node::~Node() {
  Detach(*impl_);
  DetachChildren(*impl_);
}
void Node::setParent(Node* parent) {
  Impl* new_parent = parent != nullptr ? &NodeOf(*parent) : nullptr;
  if (new_parent == impl_->parent)
    return;
  Detach(*impl_);
  if (new_parent != nullptr) {
    new_parent->children.push_back(impl_.get());
    impl_->parent = new_parent;
  }
}
void Node::addChild(Node* child) {
  if (child != nullptr)
    child->setParent(this);
}
void Node::removeChild(Node* child) {
  Record("Node.removeChild");
  if (child != nullptr && NodeOf(*child).parent == impl_.get())
    Detach(NodeOf(*child));
}
void Node::removeAllChildren() {
  DetachChildren(*impl_);
}
Node* Node::getParent() const {
  return impl_->parent != nullptr ? impl_->parent->owner : nullptr;
}
std::size_t Node::getChildCount() const {
  return impl_->children.size();
}
Node* Node::getChild(std::size_t index) const {
  return index < impl_->children.size() ? impl_->children[index]->owner : nullptr;
}
void Node::setPosition(float x, float y, float z) {
  impl_->position = Vector3(x, y, z);
}
Vector3 Node::getPosition() const {
  return impl_->position;
}
void Node::setScale(float x, float y, float z) {
  impl_->scale = Vector3(x, y, z);
}
Vector3 Node::getScale() const {
  return impl_->scale;
}
void Node::setRotation(const Degrees& angle) {
  impl_->rotation = angle.valueDegrees();
}
Degrees Node::getRotation() const {
  return Degrees(impl_->rotation);
}

EmptyNode::EmptyNode() : Node(std::make_unique<Impl>("")) {}
EmptyNode::~EmptyNode() = default;

Camera::Camera() : Node(std::make_unique<Impl>("Camera")) {}
Camera::~Camera() = default;
void Camera::setProjectionMode(ProjectionMode /*mode*/) {}
void Camera::setOrthographicWindowSize(float width, float height) {
  Record("Camera.setOrthographicWindowSize", width, height);
  NodeOf(*this).ortho_width = width;
  NodeOf(*this).ortho_height = height;
}
float Camera::getOrthographicWindowWidth() const {
  return NodeOf(*this).ortho_width;
}
float Camera::getOrthographicWindowHeight() const {
  return NodeOf(*this).ortho_height;
}
void Camera::setAutomaticAspectRatio(bool /*automatic*/) {}
void Camera::setNearClipDistance(float /*distance*/) {}
void Camera::setFarClipDistance(float /*distance*/) {}

Texture::Texture(ResourceManager& /*resources*/, const char* name, Type /*type*/, bool /*mipmaps*/)
    : impl_(std::make_shared<Impl>(Entry("Texture", name))) {}
Texture::~Texture() = default;
void Texture::setImage(const unsigned char* /*data*/, int width, int height, PixelFormat format) {
  Record("Texture.setImage", impl_->name, width, height, format);
  impl_->width = width;
  impl_->height = height;
}
const std::string& Texture::getName() const {
  return impl_->name;
}
int Texture::getWidth() const {
  return impl_->width;
}
int Texture::getHeight() const {
  return impl_->height;
}
void Texture::setMinFilterMode(FilterMode /*mode*/) {}
void Texture::setMagFilterMode(FilterMode /*mode*/) {}
void Texture::setUWrapMode(WrapMode /*mode*/) {}
void Texture::setVWrapMode(WrapMode /*mode*/) {}

Material::Material(ResourceManager& /*resources*/) : impl_(std::make_shared<Impl>("Material")) {}
Material::~Material() = default;
void Material::setShader(ShaderType type, const char* name, const char* source) {
  Record("Material.setShader", type, name, source);
}
void Material::setShaderSampler(ShaderType /*type*/, const char* /*name*/, Texture* /*texture*/) {}
void Material::setShaderUniform(ShaderType /*type*/, const char* name, const Vector3& value) {
  impl_->uniforms[name] = value;
}
void Material::setShaderAutoUniform(ShaderType /*type*/, const char* /*name*/,
                                    AutoUniform /*value*/) {}
void Material::setBlendMode(BlendMode mode) {
  Record("Material.setBlendMode", mode);
}
void Material::setDepthWriteEnabled(bool enabled) {
  Record("Material.setDepthWriteEnabled", enabled);
}

Mesh::Mesh(const char* name) : impl_(std::make_shared<Impl>(Entry("Mesh", name))) {}
Mesh::~Mesh() = default;
void Mesh::begin(unsigned int /*vertexCount*/, unsigned int /*indexCount*/, RenderType /*type*/) {}
void Mesh::position(float x, float y, float z) {
  impl_->positions.emplace_back(x, y, z);
}
void Mesh::position(const Vector3& value) {
  impl_->positions.push_back(value);
}
void Mesh::textureCoord(float u, float v) {
  impl_->uvs.emplace_back(u, v);
}
void Mesh::normal(float /*x*/, float /*y*/, float /*z*/) {}
void Mesh::index(unsigned int /*vertex*/) {}
void Mesh::end() {}
void Mesh::finalize() {}

Object::Object(const Mesh& mesh) : Node(std::make_unique<Impl>("Object")) {
  NodeOf(*this).mesh = detail::Access::Ptr(mesh);
}
Object::~Object() = default;
void Object::setMaterial(unsigned int /*index*/, Material* material) {
  NodeOf(*this).material = material;
}
Material* Object::getMaterial(unsigned int index) const {
  return index == 0 ? NodeOf(*this).material : nullptr;
}

Font::Font(const std::string& name, FileType fileType, bool antialiased)
    : impl_(std::make_shared<Impl>(Entry("Font", name, fileType, antialiased))) {
  impl_->name = name;
}
Font::~Font() = default;
const std::string& Font::getName() const {
  return impl_->name;
}
void Font::setReferenceCharacter(std::uint32_t codepoint) {
  impl_->reference_character = codepoint;
}
std::uint32_t Font::getReferenceCharacter() const {
  return impl_->reference_character;
}

Text::Text() : Node(std::make_unique<Impl>("Text")) {}
Text::~Text() = default;
void Text::setFont(const Font& /*font*/) {}
void Text::setText(const std::string& utf8) {
  NodeOf(*this).text = utf8;
}
const std::string& Text::getText() const {
  return NodeOf(*this).text;
}
void Text::normalizeText() {
  Record("Text.normalizeText");
}
void Text::setContainerRect(const Rect& /*rect*/) {}
void Text::setHorizontalAlignment(HorizontalAlignment /*alignment*/) {}
void Text::setExtraSpaceBetweenChars(float textUnits) {
  NodeOf(*this).extra_spacing = textUnits;
}
float Text::getExtraSpaceBetweenChars() const {
  return NodeOf(*this).extra_spacing;
}
void Text::setColor(const Color& color) {
  NodeOf(*this).color = color;
}
Color Text::getColor() const {
  return NodeOf(*this).color;
}
void Text::initialize() {}
Rect Text::getBoundingBox() const {
  const auto n = static_cast<float>(NodeOf(*this).text.size());
  if (n == 0.0f)
    return Rect();
  const float width = 0.5f * n + NodeOf(*this).extra_spacing * (n - 1.0f);
  return Rect(-width / 2.0f, 0.0f, width / 2.0f, -1.2f);
}
Rect Text::getInkBounds() const {
  const Rect box = getBoundingBox();
  return box.isEmpty() ? box : Rect(box.left, -0.3f, box.right, -0.9f);
}
Rect Text::getLineInkBox() const {
  const Rect box = getBoundingBox();
  return box.isEmpty() ? box : Rect(box.left, -0.2f, box.right, -1.1f);
}

}  // namespace Vexel
