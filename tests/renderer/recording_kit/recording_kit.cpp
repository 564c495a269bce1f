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

struct Renderer::Impl {};
struct Scene::Impl {
  EmptyNode root;
};
struct Texture::Impl {
  std::string name;
  int width = 0, height = 0;
};
struct Material::Impl {
  std::map<std::string, Vector3> uniforms;
};
struct Mesh::Impl : vexel_recording::MeshData {
  std::string name;
};
struct Font::Impl {
  std::string name;
  std::uint32_t reference_character = 0;
};
struct Node::Impl {
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

// Journals one call with its arguments, or throws if its operation is
// listed as failing. A first word without a '.' is a constructor ("Text")
// or, after '~', a destructor, and counts its class's live objects.
template <typename... Args>
void Record(const std::string& operation, const Args&... args) {
  if (vexel_recording::Failures().count(operation) != 0)
    throw Exception("recording kit: " + operation + " fails as asked");
  std::ostringstream entry;
  entry << std::boolalpha << operation;
  ((entry << ' ' << args), ...);
  vexel_recording::Journal().push_back(entry.str());
  if (operation[0] == '~')
    --vexel_recording::LiveCount(operation.substr(1));
  else if (operation.find('.') == std::string::npos)
    ++vexel_recording::LiveCount(operation);
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

ResourceManager::ResourceManager(std::shared_ptr<Impl> impl) : impl_(std::move(impl)) {}
ResourceManager::~ResourceManager() = default;

Kit::Kit(AAssetManager* /*assets*/, const std::string& logFile) {
  Record("Kit", logFile);
  resources_.reset(new ResourceManager(nullptr));
}
Kit::~Kit() {
  Record("~Kit");
}
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
    : Renderer(nullptr) {
  Record("Renderer", samples);
}
AndroidSurfaceRenderer::~AndroidSurfaceRenderer() {
  Record("~Renderer");
}

Scene::Scene(Kit& /*kit*/) : impl_(std::make_shared<Impl>()) {
  Record("Scene");
}
Scene::~Scene() {
  Record("~Scene");
}
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

EmptyNode::EmptyNode() : Node(std::make_unique<Impl>()) {}
EmptyNode::~EmptyNode() = default;

Camera::Camera() : Node(std::make_unique<Impl>()) {
  Record("Camera");
}
Camera::~Camera() {
  Record("~Camera");
}
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
    : impl_(std::make_shared<Impl>()) {
  Record("Texture", name);
  impl_->name = name;
}
Texture::~Texture() {
  Record("~Texture", impl_->name);
}
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

Material::Material(ResourceManager& /*resources*/) : impl_(std::make_shared<Impl>()) {
  Record("Material");
}
Material::~Material() {
  Record("~Material");
}
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

Mesh::Mesh(const char* name) : impl_(std::make_shared<Impl>()) {
  Record("Mesh", name);
  impl_->name = name;
}
Mesh::~Mesh() {
  Record("~Mesh", impl_->name);
}
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

Object::Object(const Mesh& mesh) : Node(std::make_unique<Impl>()) {
  NodeOf(*this).mesh = detail::Access::Ptr(mesh);
  Record("Object", NodeOf(*this).mesh->name);
}
Object::~Object() {
  Record("~Object");
}
void Object::setMaterial(unsigned int /*index*/, Material* material) {
  NodeOf(*this).material = material;
}
Material* Object::getMaterial(unsigned int index) const {
  return index == 0 ? NodeOf(*this).material : nullptr;
}

Font::Font(const std::string& name, FileType fileType, bool antialiased)
    : impl_(std::make_shared<Impl>()) {
  Record("Font", name, fileType, antialiased);
  impl_->name = name;
}
Font::~Font() {
  Record("~Font", impl_->name);
}
const std::string& Font::getName() const {
  return impl_->name;
}
void Font::setReferenceCharacter(std::uint32_t codepoint) {
  impl_->reference_character = codepoint;
}
std::uint32_t Font::getReferenceCharacter() const {
  return impl_->reference_character;
}

Text::Text() : Node(std::make_unique<Impl>()) {
  Record("Text");
}
Text::~Text() {
  Record("~Text", NodeOf(*this).text);
}
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

}  // namespace Vexel
