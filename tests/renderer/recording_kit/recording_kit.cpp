// The recording kit: every Vexel operation the renderer may call, without a
// graphics device. See recording_kit.h.
#include "recording_kit.h"

#include <android/native_window.h>

#include <algorithm>
#include <map>

namespace vexel_recording {
namespace {

std::vector<std::string>& JournalStorage() {
  static std::vector<std::string> journal;
  return journal;
}

std::set<std::string>& Failures() {
  static std::set<std::string> failures;
  return failures;
}

std::map<std::string, int>& LiveCounts() {
  static std::map<std::string, int> counts;
  return counts;
}

}  // namespace

std::vector<std::string>& Journal() {
  return JournalStorage();
}

void ClearJournal() {
  JournalStorage().clear();
}

int CountEntries(const std::string& entry) {
  const bool prefix = !entry.empty() && entry.back() == '*';
  const std::string stem = prefix ? entry.substr(0, entry.size() - 1) : entry;
  return static_cast<int>(
      std::count_if(JournalStorage().begin(), JournalStorage().end(), [&](const std::string& e) {
        return prefix ? e.compare(0, stem.size(), stem) == 0 : e == entry;
      }));
}

int FindEntry(const std::string& entry, int from) {
  const auto& journal = JournalStorage();
  for (int i = std::max(from, 0); i < static_cast<int>(journal.size()); ++i) {
    if (journal[i] == entry)
      return i;
  }
  return -1;
}

void FailOn(const std::string& operation) {
  Failures().insert(operation);
}

void ClearFailures() {
  Failures().clear();
}

int LiveCount(const std::string& class_name) {
  return LiveCounts()[class_name];
}

Vexel::Node::Impl& NodeState(const Vexel::Node& node) {
  return Vexel::detail::Access::ImplOf(node);
}

}  // namespace vexel_recording

namespace Vexel {
namespace {

using vexel_recording::Journal;

// Journals `entry` after throwing if its operation (the entry up to its
// first space) is listed as failing.
void Record(const std::string& entry) {
  const std::string operation = entry.substr(0, entry.find(' '));
  if (vexel_recording::Failures().count(operation) != 0)
    throw Exception("recording kit: " + operation + " fails as asked");
  Journal().push_back(entry);
}

// Throws, without journaling, if `operation` is listed as failing (for
// calls too frequent to journal).
void Check(const std::string& operation) {
  if (vexel_recording::Failures().count(operation) != 0)
    throw Exception("recording kit: " + operation + " fails as asked");
}

void Born(const std::string& class_name) {
  ++vexel_recording::LiveCounts()[class_name];
}

void Died(const std::string& class_name) {
  --vexel_recording::LiveCounts()[class_name];
}

std::set<Scene*>& AliveScenes() {
  static std::set<Scene*> scenes;
  return scenes;
}

std::vector<Kit*>& AliveKits() {
  static std::vector<Kit*> kits;
  return kits;
}

void Detach(Node::Impl& node) {
  if (node.parent == nullptr)
    return;
  auto& siblings = node.parent->children;
  siblings.erase(std::remove(siblings.begin(), siblings.end(), &node), siblings.end());
  node.parent = nullptr;
}

void DetachChildren(Node::Impl& node) {
  for (Node::Impl* child : node.children)
    child->parent = nullptr;
  node.children.clear();
}

Node::Impl& NodeOf(const Node& node) {
  return detail::Access::ImplOf(node);
}

// The made-up metrics of recording_kit.h.
Rect MeasureText(const Node::Impl& text) {
  if (text.font_name.empty() || text.text.empty())
    return Rect();
  float width = 0.0f;
  int code_points = 0;
  const std::string& s = text.text;
  for (std::size_t i = 0; i < s.size();) {
    const auto lead = static_cast<unsigned char>(s[i]);
    const std::size_t length = lead < 0x80 ? 1 : lead < 0xE0 ? 2 : lead < 0xF0 ? 3 : 4;
    std::uint32_t code_point = lead;
    if (length > 1) {
      code_point = lead & (0xFFu >> (length + 1));
      for (std::size_t k = 1; k < length && i + k < s.size(); ++k)
        code_point = (code_point << 6) | (static_cast<unsigned char>(s[i + k]) & 0x3Fu);
    }
    width += code_point >= 0x2E80 ? 1.0f : 0.5f;
    ++code_points;
    i += length;
  }
  width += text.extra_spacing * static_cast<float>(code_points - 1);
  return Rect(-width / 2.0f, 0.0f, width / 2.0f, -1.2f);
}

void LayOut(Node::Impl& text) {
  if (text.layout_dirty) {
    text.layout_dirty = false;
    ++text.layout_count;
  }
}

}  // namespace

// Kit ---------------------------------------------------------------------

ResourceManager::ResourceManager(std::shared_ptr<Impl> impl) : impl_(std::move(impl)) {}
ResourceManager::~ResourceManager() = default;

Kit::Kit(AAssetManager* assets, const std::string& logFile) : impl_(std::make_shared<Impl>()) {
  Record("Kit " + logFile);
  impl_->assets = assets;
  impl_->log_file = logFile;
  resources_.reset(new ResourceManager(std::make_shared<ResourceManager::Impl>()));
  AliveKits().push_back(this);
  Born("Kit");
}

Kit::~Kit() {
  Journal().push_back("~Kit");
  auto& kits = AliveKits();
  kits.erase(std::remove(kits.begin(), kits.end(), this), kits.end());
  Died("Kit");
}

void Kit::drawAll() {
  Record("Kit.drawAll");
  ++impl_->draw_count;
}

ResourceManager& Kit::getResourceManager() {
  return *resources_;
}

AAssetManager* Kit::getAssetManager() const {
  return impl_->assets;
}

const std::string& Kit::getLogFilePath() const {
  return impl_->log_file;
}

Kit* Kit::getCurrent() {
  return AliveKits().empty() ? nullptr : AliveKits().back();
}

std::size_t Kit::getLiveGpuObjectCount() {
  return 0;
}

// Renderer ------------------------------------------------------------------

Renderer::Renderer(std::unique_ptr<Impl> impl) : impl_(std::move(impl)) {}
Renderer::~Renderer() = default;

void Renderer::setScene(Scene* scene) {
  Record("Renderer.setScene");
  impl_->scene = scene;
}

Scene* Renderer::getScene() const {
  return AliveScenes().count(impl_->scene) != 0 ? impl_->scene : nullptr;
}

int Renderer::getWidth() const {
  return ANativeWindow_getWidth(impl_->window);
}

int Renderer::getHeight() const {
  return ANativeWindow_getHeight(impl_->window);
}

void Renderer::draw() {
  Record("Renderer.draw");
}

AndroidSurfaceRenderer::AndroidSurfaceRenderer(Kit& /*kit*/, ANativeWindow* window,
                                               AntiAliasingSamples samples)
    : Renderer(std::make_unique<Impl>()) {
  Record("Renderer " + std::to_string(static_cast<int>(samples)));
  if (window == nullptr)
    throw Exception("recording kit: a surface renderer needs a window");
  ANativeWindow_acquire(window);
  detail::Access::ImplOf(*this).window = window;
  detail::Access::ImplOf(*this).samples = samples;
  Born("Renderer");
}

AndroidSurfaceRenderer::~AndroidSurfaceRenderer() {
  Journal().push_back("~Renderer");
  ANativeWindow_release(detail::Access::ImplOf(*this).window);
  Died("Renderer");
}

// Scene ---------------------------------------------------------------------

Scene::Scene(Kit& /*kit*/) : impl_(std::make_shared<Impl>()) {
  Record("Scene");
  impl_->root = std::make_unique<EmptyNode>();
  AliveScenes().insert(this);
  Born("Scene");
}

Scene::~Scene() {
  Journal().push_back("~Scene");
  DetachChildren(NodeOf(*impl_->root));
  AliveScenes().erase(this);
  Died("Scene");
}

void Scene::setBackgroundColor(const Color& color) {
  Record("Scene.setBackgroundColor");
  impl_->background = color;
}

Color Scene::getBackgroundColor() const {
  return impl_->background;
}

void Scene::setShadowEnabled(bool enabled) {
  Record(std::string("Scene.setShadowEnabled ") + (enabled ? "true" : "false"));
  impl_->shadows = enabled;
}

bool Scene::isShadowEnabled() const {
  return impl_->shadows;
}

Node* Scene::getRootNode() {
  return impl_->root.get();
}

// Node ----------------------------------------------------------------------

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
  for (Impl* ancestor = new_parent; ancestor != nullptr; ancestor = ancestor->parent) {
    if (ancestor == impl_.get())
      throw Exception("recording kit: a node cannot be attached under itself");
  }
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
  Check("Node.removeChild");
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

void Node::setPosition(const Vector3& position) {
  impl_->position = position;
}

void Node::setPosition(float x, float y, float z) {
  impl_->position = Vector3(x, y, z);
}

Vector3 Node::getPosition() const {
  return impl_->position;
}

void Node::setScale(const Vector3& scale) {
  impl_->scale = scale;
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

void Node::setVisible(bool visible) {
  impl_->visible = visible;
}

bool Node::isVisible() const {
  return impl_->visible;
}

EmptyNode::EmptyNode() : Node(std::make_unique<Impl>(Impl::Kind::kEmpty)) {
  Born("EmptyNode");
}

EmptyNode::~EmptyNode() {
  Died("EmptyNode");
}

// Camera --------------------------------------------------------------------

Camera::Camera() : Node(std::make_unique<Impl>(Impl::Kind::kCamera)) {
  Record("Camera");
  Born("Camera");
}

Camera::~Camera() {
  Journal().push_back("~Camera");
  Died("Camera");
}

void Camera::setProjectionMode(ProjectionMode mode) {
  Record("Camera.setProjectionMode " + std::to_string(static_cast<int>(mode)));
  NodeOf(*this).projection = mode;
}

ProjectionMode Camera::getProjectionMode() const {
  return NodeOf(*this).projection;
}

void Camera::setOrthographicWindowSize(float width, float height) {
  NodeOf(*this).ortho_width = width;
  NodeOf(*this).ortho_height = height;
}

float Camera::getOrthographicWindowWidth() const {
  return NodeOf(*this).ortho_width;
}

float Camera::getOrthographicWindowHeight() const {
  return NodeOf(*this).ortho_height;
}

void Camera::setFieldOfView(const Degrees& vertical) {
  NodeOf(*this).field_of_view = vertical.valueDegrees();
}

Degrees Camera::getFieldOfView() const {
  return Degrees(NodeOf(*this).field_of_view);
}

void Camera::setAutomaticAspectRatio(bool automatic) {
  NodeOf(*this).automatic_aspect = automatic;
}

bool Camera::isAutomaticAspectRatio() const {
  return NodeOf(*this).automatic_aspect;
}

void Camera::setAspectRatio(float aspect) {
  NodeOf(*this).aspect = aspect;
}

float Camera::getAspectRatio() const {
  return NodeOf(*this).aspect;
}

void Camera::setNearClipDistance(float distance) {
  NodeOf(*this).near_clip = distance;
}

float Camera::getNearClipDistance() const {
  return NodeOf(*this).near_clip;
}

void Camera::setFarClipDistance(float distance) {
  NodeOf(*this).far_clip = distance;
}

float Camera::getFarClipDistance() const {
  return NodeOf(*this).far_clip;
}

// Texture -------------------------------------------------------------------

Texture::Texture(ResourceManager& /*resources*/, const char* name, Type /*type*/, bool /*mipmaps*/)
    : impl_(std::make_shared<Impl>()) {
  Record(std::string("Texture ") + name);
  impl_->name = name;
  Born("Texture");
}

Texture::~Texture() {
  Journal().push_back("~Texture " + impl_->name);
  Died("Texture");
}

const std::string& Texture::getName() const {
  return impl_->name;
}

void Texture::setImage(const unsigned char* data, int width, int height, PixelFormat format) {
  Record("setImage " + impl_->name + " " + std::to_string(width) + "x" + std::to_string(height));
  if (width < 0 || height < 0)
    throw Exception("recording kit: negative texture size");
  impl_->width = width;
  impl_->height = height;
  impl_->format = format;
  impl_->last_data = data;
  ++impl_->upload_count;
}

int Texture::getWidth() const {
  return impl_->width;
}

int Texture::getHeight() const {
  return impl_->height;
}

void Texture::setMinFilterMode(FilterMode mode) {
  impl_->min_filter = mode;
}

void Texture::setMagFilterMode(FilterMode mode) {
  impl_->mag_filter = mode;
}

void Texture::setUWrapMode(WrapMode mode) {
  impl_->u_wrap = mode;
}

void Texture::setVWrapMode(WrapMode mode) {
  impl_->v_wrap = mode;
}

Texture::FilterMode Texture::getMinFilterMode() const {
  return impl_->min_filter;
}

Texture::FilterMode Texture::getMagFilterMode() const {
  return impl_->mag_filter;
}

Texture::WrapMode Texture::getUWrapMode() const {
  return impl_->u_wrap;
}

Texture::WrapMode Texture::getVWrapMode() const {
  return impl_->v_wrap;
}

// Material ------------------------------------------------------------------

Material::Material(ResourceManager& /*resources*/) : impl_(std::make_shared<Impl>()) {
  Record("Material");
  Born("Material");
}

Material::~Material() {
  Journal().push_back("~Material");
  Died("Material");
}

void Material::setShader(ShaderType type, const char* name, const char* source) {
  Record(std::string("Material.setShader ") + name);
  impl_->shaders[type] = {name, source};
}

void Material::setShaderSampler(ShaderType type, const char* name, Texture* texture) {
  impl_->samplers[name] = {type, texture};
}

void Material::setShaderUniform(ShaderType /*type*/, const char* /*name*/, float /*value*/) {}

void Material::setShaderUniform(ShaderType /*type*/, const char* /*name*/,
                                const Vector2& /*value*/) {}

void Material::setShaderUniform(ShaderType type, const char* name, const Vector3& value) {
  impl_->vector_uniforms[name] = {type, value};
}

void Material::setShaderUniform(ShaderType /*type*/, const char* /*name*/, const Color& /*value*/) {
}

void Material::setShaderAutoUniform(ShaderType type, const char* name, AutoUniform value) {
  impl_->auto_uniforms[name] = {type, value};
}

void Material::setBlendMode(BlendMode mode) {
  impl_->blend = mode;
}

Material::BlendMode Material::getBlendMode() const {
  return impl_->blend;
}

void Material::setDepthWriteEnabled(bool enabled) {
  impl_->depth_write = enabled;
}

bool Material::isDepthWriteEnabled() const {
  return impl_->depth_write;
}

void Material::setDepthTestEnabled(bool enabled) {
  impl_->depth_test = enabled;
}

bool Material::isDepthTestEnabled() const {
  return impl_->depth_test;
}

// Mesh ----------------------------------------------------------------------

Mesh::Mesh(const char* name) : impl_(std::make_shared<Impl>()) {
  Record(std::string("Mesh ") + name);
  impl_->name = name;
  Born("Mesh");
}

Mesh::~Mesh() {
  Journal().push_back("~Mesh " + impl_->name);
  Died("Mesh");
}

const std::string& Mesh::getName() const {
  return impl_->name;
}

void Mesh::begin(unsigned int vertexCount, unsigned int indexCount, RenderType type) {
  *impl_ = Impl{impl_->name, vertexCount, indexCount, type, {}, {}, {}, {}, false, false};
}

void Mesh::position(float x, float y, float z) {
  impl_->positions.emplace_back(x, y, z);
}

void Mesh::position(const Vector3& value) {
  impl_->positions.push_back(value);
}

void Mesh::textureCoord(float u, float v) {
  impl_->uvs.emplace_back(u, v);
}

void Mesh::textureCoord(const Vector2& value) {
  impl_->uvs.push_back(value);
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
  if (impl_->positions.size() != impl_->vertex_count ||
      impl_->indices.size() != impl_->index_count) {
    throw Exception("recording kit: mesh counts differ from begin()");
  }
  impl_->ended = true;
}

void Mesh::finalize() {
  impl_->finalized = true;
}

unsigned int Mesh::getVertexCount() const {
  return impl_->vertex_count;
}

unsigned int Mesh::getIndexCount() const {
  return impl_->index_count;
}

// Object --------------------------------------------------------------------

Object::Object(const Mesh& mesh) : Node(std::make_unique<Impl>(Impl::Kind::kObject)) {
  Record("Object " + mesh.getName());
  NodeOf(*this).mesh_name = mesh.getName();
  NodeOf(*this).mesh = detail::Access::SharedImplOf(mesh);
  Born("Object");
}

Object::~Object() {
  Journal().push_back("~Object");
  Died("Object");
}

void Object::setMaterial(unsigned int index, Material* material) {
  auto& materials = NodeOf(*this).materials;
  if (materials.size() <= index)
    materials.resize(index + 1, nullptr);
  materials[index] = material;
}

Material* Object::getMaterial(unsigned int index) const {
  const auto& materials = NodeOf(*this).materials;
  return index < materials.size() ? materials[index] : nullptr;
}

// Font ----------------------------------------------------------------------

Font::Font(const std::string& name, FileType fileType, bool antialiased)
    : impl_(std::make_shared<Impl>()) {
  Record("Font " + name + " " + std::to_string(static_cast<int>(fileType)));
  impl_->name = name;
  impl_->file_type = fileType;
  impl_->antialiased = antialiased;
  Born("Font");
}

Font::~Font() {
  Journal().push_back("~Font " + impl_->name);
  Died("Font");
}

const std::string& Font::getName() const {
  return impl_->name;
}

Font::FileType Font::getFileType() const {
  return impl_->file_type;
}

bool Font::isAntialiased() const {
  return impl_->antialiased;
}

void Font::setReferenceCharacter(std::uint32_t codepoint) {
  impl_->reference_character = codepoint;
}

std::uint32_t Font::getReferenceCharacter() const {
  return impl_->reference_character;
}

// Text ----------------------------------------------------------------------

Text::Text() : Node(std::make_unique<Impl>(Impl::Kind::kText)) {
  Record("Text");
  Born("Text");
}

Text::~Text() {
  Journal().push_back("~Text " + NodeOf(*this).text);
  Died("Text");
}

void Text::setFont(const Font& font) {
  NodeOf(*this).font_name = font.getName();
  NodeOf(*this).font_reference_character = font.getReferenceCharacter();
  NodeOf(*this).layout_dirty = true;
}

void Text::setText(const std::string& utf8) {
  Record("Text.setText " + utf8);
  NodeOf(*this).text = utf8;
  NodeOf(*this).layout_dirty = true;
}

const std::string& Text::getText() const {
  return NodeOf(*this).text;
}

void Text::normalizeText() {
  Record("Text.normalizeText");
  NodeOf(*this).normalized = true;
}

void Text::setContainerRect(const Rect& rect) {
  NodeOf(*this).container = rect;
  NodeOf(*this).layout_dirty = true;
}

Rect Text::getContainerRect() const {
  return NodeOf(*this).container;
}

void Text::setHorizontalAlignment(HorizontalAlignment alignment) {
  NodeOf(*this).alignment = alignment;
  NodeOf(*this).layout_dirty = true;
}

Text::HorizontalAlignment Text::getHorizontalAlignment() const {
  return static_cast<HorizontalAlignment>(NodeOf(*this).alignment);
}

void Text::setExtraSpaceBetweenChars(float textUnits) {
  NodeOf(*this).extra_spacing = textUnits;
  NodeOf(*this).layout_dirty = true;
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

void Text::initialize() {
  Record("Text.initialize");
  NodeOf(*this).initialized = true;
  LayOut(NodeOf(*this));
}

Rect Text::getBoundingBox() const {
  LayOut(NodeOf(*this));
  return MeasureText(NodeOf(*this));
}

std::size_t Text::getLineCount() const {
  return NodeOf(*this).text.empty() ? 0 : 1;
}

}  // namespace Vexel
