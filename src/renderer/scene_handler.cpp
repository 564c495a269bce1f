// Scene handler: lifetime, kit setup, camera and the text object caches.
#include "renderer/scene_handler.h"

#include <iterator>
#include <stdexcept>

#include "common/log.h"

namespace ocr_ar {
namespace {

// The kit's own log, placed by the kit in the platform's log directory.
const std::string kKitLogFileName = "Vexel.log";

constexpr std::size_t kTextSlotCapacity = 100;

}  // namespace

SceneHandler* SceneHandler::instance_ = nullptr;

SceneHandler* SceneHandler::Instance() {
  if (instance_ == nullptr)
    instance_ = new SceneHandler();
  return instance_;
}

void SceneHandler::DeleteInstance() {
  if (instance_ != nullptr) {
    delete instance_;
    instance_ = nullptr;
  }
}

SceneHandler::SceneHandler() {
  text_nodes_.reserve(kTextSlotCapacity);
  current_text_cache_.max_load_factor(1.0f);
  reusable_text_cache_.max_load_factor(1.0f);
  unused_frame_counts_.max_load_factor(1.0f);
}

SceneHandler::~SceneHandler() {
  ClearAllTextObjects(true);
  for (auto& node : text_nodes_)
    node.reset();
  DeleteCamera();
}

void SceneHandler::Init(ANativeWindow* window, AAssetManager* assets, int width, int height,
                        const Vexel::Vector3& cameraPosition, const Vexel::Vector3& cameraTarget) {
  // Each assignment destroys the earlier object only after the new one took
  // its place.
  kit_ = std::make_unique<Vexel::Kit>(assets, kKitLogFileName);
  renderer_ = std::make_unique<Vexel::AndroidSurfaceRenderer>(*kit_, window,
                                                              Vexel::Renderer::ANTI_ALIASING_NONE);
  scene_ = std::make_unique<Vexel::Scene>(*kit_);
  scene_->setBackgroundColor(Vexel::Color(0.0f, 0.0f, 0.0f, 0.0f));
  scene_->setShadowEnabled(false);
  InitCamera(width, height, cameraPosition, cameraTarget);
  renderer_->setScene(scene_.get());
  // A renderer rebuilt after a surface change keeps the user's language.
  if (!translation_language_.empty())
    SetTranslationLanguage(translation_language_);
}

void SceneHandler::InitCamera(int width, int height, const Vexel::Vector3& /*cameraPosition*/,
                              const Vexel::Vector3& /*cameraTarget*/) {
  if (camera_ != nullptr && scene_ != nullptr) {
    Detach(*camera_);
    camera_.reset();
  }
  camera_ = std::make_unique<Vexel::Camera>();
  camera_->setParent(scene_ != nullptr ? scene_->getRootNode() : nullptr);
  camera_->setProjectionMode(Vexel::PROJECTION_ORTHOGRAPHIC);
  camera_->setOrthographicWindowSize(static_cast<float>(width), static_cast<float>(height));
  camera_->setAutomaticAspectRatio(false);
  camera_->setNearClipDistance(1.0f);
  camera_->setFarClipDistance(300.0f);
}

void SceneHandler::DeleteCamera() {
  if (scene_ == nullptr)
    return;
  if (camera_ != nullptr)
    Detach(*camera_);
  camera_.reset();
}

void SceneHandler::RenderOneFrame() {
  if (kit_ != nullptr)
    kit_->drawAll();
}

void SceneHandler::GetOrthoCameraWidthHeight(float* width, float* height) {
  *width = camera_ != nullptr ? camera_->getOrthographicWindowWidth() : 0.0f;
  *height = camera_ != nullptr ? camera_->getOrthographicWindowHeight() : 0.0f;
}

void SceneHandler::SetBackgroundRectCorners(float left, float top, float right, float bottom) {
  background_corners_ = {left, top, right, bottom};
}

void SceneHandler::GetBackgroundRectCorners(float* left, float* top, float* right,
                                            float* bottom) const {
  *left = background_corners_.left;
  *top = background_corners_.top;
  *right = background_corners_.right;
  *bottom = background_corners_.bottom;
}

void SceneHandler::Detach(Vexel::Node& node) {
  if (Vexel::Node* parent = node.getParent())
    parent->removeChild(&node);
}

void SceneHandler::UpdateTextObjectCache() {
  for (auto& [text, objects] : current_text_cache_) {
    auto& reusable = reusable_text_cache_[text];
    reusable.splice(reusable.end(), objects);
  }
  current_text_cache_.clear();
}

void SceneHandler::ClearTextObjects(unsigned int firstIndex, bool force) {
  if (scene_ == nullptr)
    return;
  for (auto entry = reusable_text_cache_.begin(); entry != reusable_text_cache_.end();) {
    auto& objects = entry->second;
    for (auto object = objects.begin(); object != objects.end();) {
      const unsigned int slot = object->slot_index;
      // A slot not drawn this frame leaves the scene.
      if (slot >= firstIndex && slot < text_nodes_.size() && text_nodes_[slot] != nullptr)
        Detach(*text_nodes_[slot]);
      const unsigned int unused = ++unused_frame_counts_[object->text.get()];
      if (slot < firstIndex || (!force && unused < unused_frame_limit_)) {
        ++object;
        continue;
      }
      RetireTextObject(*object);
      object = objects.erase(object);
    }
    entry = objects.empty() ? reusable_text_cache_.erase(entry) : std::next(entry);
  }
}

void SceneHandler::RetireTextObject(InpaintedTextObject& object) {
  unused_frame_counts_.erase(object.text.get());
  DeleteInpaintedTextObject(object);
}

void SceneHandler::ClearAllTextObjects(bool force) {
  try {
    ClearTextObjects(0, force);
    UpdateTextObjectCache();
    ClearTextObjects(0, force);
  } catch (...) {
    OCR_LOGE("SceneHandler: caught exception in ClearAllTextObjects.");
  }
}

long SceneHandler::GetUnusedFrameCount(const Vexel::Text* text) const {
  const auto found = unused_frame_counts_.find(const_cast<Vexel::Text*>(text));
  return found != unused_frame_counts_.end() ? static_cast<long>(found->second) : -1;
}

Vexel::ResourceManager& SceneHandler::Resources() {
  if (kit_ == nullptr)
    throw std::logic_error("SceneHandler: the kit is not initialised");
  return kit_->getResourceManager();
}

}  // namespace ocr_ar
