#pragma once

#include <list>
#include <map>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "renderer/inpainted_objects.h"
#include "renderer/render_records.h"
#include "vexel/Vexel.h"

struct AAssetManager;
struct ANativeWindow;

namespace ocr_ar {

// Text objects keyed by their text; several regions may show the same text.
using TextObjectCache = std::unordered_map<std::string, std::list<InpaintedTextObject>>;

// The overlay scene drawn over the live camera picture: the kit, the surface
// renderer, the scene with its orthographic camera (one unit per screen
// pixel, origin at the window centre), the background quad showing the
// camera frame, one slot node per translated text, and two caches of text
// objects so that a text that reappears is not built again.
//
// A process-wide singleton driven by the renderer bridge on the render
// thread; nothing here locks.
//
// Draw order: children of the scene root draw in attachment order with a
// less-or-equal depth test. The background writes depth at kBackgroundDepth;
// patches and texts write none and lie nearer, at kOverlayDepth, and the
// slot nodes are kept attached after the background (see CreateBackground).
class SceneHandler {
 public:
  static SceneHandler* Instance();
  static void DeleteInstance();

  SceneHandler(const SceneHandler&) = delete;
  SceneHandler& operator=(const SceneHandler&) = delete;

  // Kit, surface renderer, scene and camera; each replaces (and then
  // destroys) an earlier one. The two vectors are passed on to InitCamera.
  void Init(ANativeWindow* window, AAssetManager* assets, int width, int height,
            const Vexel::Vector3& cameraPosition, const Vexel::Vector3& cameraTarget);
  void InitCamera(int width, int height, const Vexel::Vector3& cameraPosition,
                  const Vexel::Vector3& cameraTarget);
  void DeleteCamera();
  void RenderOneFrame();
  void GetOrthoCameraWidthHeight(float* width, float* height);

  void SetBackgroundRectCorners(float left, float top, float right, float bottom);
  void GetBackgroundRectCorners(float* left, float* top, float* right, float* bottom) const;

  // Cache maintenance.
  void ClearAllTextObjects(bool force);
  void ClearTextObjects(unsigned int firstIndex, bool force);
  void UpdateTextObjectCache();

  // Background quad.
  void CreateBackground(int width, int height, int rotation, float left, float top, float right,
                        float bottom);
  std::unique_ptr<Vexel::Mesh> CreateBackgroundMesh(float cameraWidth, float cameraHeight,
                                                    int rotation, float left, float top,
                                                    float right, float bottom);
  void UpdateBackgroundImage(const void* data, int width, int height);

  // Fonts by translation language.
  void SetTranslationLanguage(const std::string& language);
  void SetTranslationLanguageUseDefaultFont(const std::string& language);
  void SetTranslationLanguageFont(const std::string& language, const std::string& fontPath);

  // Inpainted patch objects.
  PatchObjectPtr CreateInpaintedRectInstance(Vexel::Texture* texture);
  InpaintedRectObject CreateInpaintedRectObject(long id, const void* data, int width, int height);
  void UpdateOrCreateInpaintedRectObject(InpaintedRectObject& rect, long id, const void* data,
                                         int width, int height);
  void DeleteInpaintedRectObject(InpaintedRectObject& rect);
  void DeleteInpaintedTextObject(InpaintedTextObject& text);
  void CreateInpaintedTextObjectNodes(unsigned int index);

  // Text objects.
  void DrawTextObject(unsigned int index, const std::string& text,
                      const PositionScaleAngle& textPlacement, const Color& colour, long id,
                      const void* patchData, const double* colorScale, const double* colorShift,
                      int patchImageWidth, int patchImageHeight,
                      const PositionScaleAngle& patchPlacement);
  void SetTextObjectScale(Vexel::Text& text, const Vexel::Vector2& size,
                          const Vexel::Degrees& angle);
  InpaintedTextObject& UpdateOrCreateInpaintedTextObject(const std::string& text,
                                                         const Color& colour, long id,
                                                         const void* patchData, int patchWidth,
                                                         int patchHeight);

  // Read access for the bridge and for tests.
  bool HasRenderer() const { return renderer_ != nullptr; }
  Vexel::Scene* GetScene() const { return scene_.get(); }
  Vexel::Camera* GetCamera() const { return camera_.get(); }
  const Vexel::Font* GetFont() const { return font_.get(); }
  const std::string& GetTranslationLanguage() const { return translation_language_; }
  const std::map<std::string, std::string>& GetLanguageFonts() const { return language_fonts_; }
  const TextObjectCache& GetCurrentTextCache() const { return current_text_cache_; }
  const TextObjectCache& GetReusableTextCache() const { return reusable_text_cache_; }
  const std::vector<std::unique_ptr<Vexel::EmptyNode>>& GetTextNodes() const { return text_nodes_; }
  // Clearing passes the text object has gone through unused; -1 when it has
  // no count.
  long GetUnusedFrameCount(const Vexel::Text* text) const;
  int GetBackgroundWidth() const { return background_width_; }
  int GetBackgroundHeight() const { return background_height_; }
  const Vexel::Object* GetBackgroundObject() const { return background_object_.get(); }
  const Vexel::Texture* GetBackgroundTexture() const { return background_texture_.get(); }

  // Distances in front of the camera (near 1, far 300).
  static constexpr float kBackgroundDepth = 200.0f;
  static constexpr float kOverlayDepth = 100.0f;

 private:
  SceneHandler();
  // Tears down in the order the kit needs: text objects, slot nodes and
  // camera first; the remaining members then go in reverse declaration
  // order (background material, texture, mesh, object; ...; scene, renderer,
  // kit last), which is why they are declared in this order.
  ~SceneHandler();

  void RetireTextObject(InpaintedTextObject& object);
  void ReplaceFont(std::unique_ptr<Vexel::Font> font, const std::string& language);
  void EnsureFont();
  void KeepSlotNodesAfterBackground();
  void PlacePatch(InpaintedRectObject& patch, const PositionScaleAngle& placement,
                  const double* colorScale, const double* colorShift);
  void PlaceText(Vexel::Text& text, const PositionScaleAngle& placement);
  Vexel::ResourceManager& Resources();
  // Takes a node out of the scene graph (a no-op when it hangs nowhere); kit
  // nodes are detached before they are destroyed.
  static void Detach(Vexel::Node& node);

  // Declaration order is teardown order, reversed: the destructor leaves the
  // remaining members to the compiler, which destroys them from the last
  // declared (background material) up to the kit, and the kit needs every
  // object made through it gone first (scene before renderer before kit).
  // Keep new kit-owned members below kit_, renderer_ and scene_.
  std::unique_ptr<Vexel::Kit> kit_;
  std::unique_ptr<Vexel::AndroidSurfaceRenderer> renderer_;
  std::unique_ptr<Vexel::Scene> scene_;
  std::unique_ptr<Vexel::Camera> camera_;
  std::vector<std::unique_ptr<Vexel::EmptyNode>> text_nodes_;
  TextObjectCache current_text_cache_;
  TextObjectCache reusable_text_cache_;
  unsigned int texture_serial_ = 0;
  std::unique_ptr<Vexel::Mesh> inpainted_rect_mesh_;
  std::unique_ptr<Vexel::Font> font_;
  std::map<std::string, std::string> language_fonts_;
  std::string translation_language_;
  std::unordered_map<Vexel::Text*, unsigned int> unused_frame_counts_;
  unsigned int unused_frame_limit_ = 250;
  int background_width_ = 0;
  int background_height_ = 0;
  std::unique_ptr<Vexel::Object> background_object_;
  std::unique_ptr<Vexel::Mesh> background_mesh_;
  std::unique_ptr<Vexel::Texture> background_texture_;
  std::unique_ptr<Vexel::Material> background_material_;
  BackgroundCorners background_corners_;

  static SceneHandler* instance_;
};

}  // namespace ocr_ar
