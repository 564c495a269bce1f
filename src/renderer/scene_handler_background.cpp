// Scene handler: the background quad showing the camera frame.
#include <sstream>
#include <stdexcept>

#include "common/log.h"
#include "renderer/scene_handler.h"
#include "renderer/shader_sources.h"

namespace ocr_ar {
namespace {

constexpr const char* kBackgroundMeshName = "BackgroundRectMesh";
constexpr const char* kBackgroundTextureName = "RenderTexture";

struct TexCoord {
  float u, v;
};

// Texture coordinates of the quad's vertices (bottom-right, top-right,
// bottom-left, top-left on screen), turning the image by the display
// orientation; v runs down the image rows.
const TexCoord* BackgroundTexCoords(int rotation) {
  static constexpr TexCoord kRotation0[4] = {{1, 1}, {1, 0}, {0, 1}, {0, 0}};
  static constexpr TexCoord kRotation90[4] = {{0, 1}, {1, 1}, {0, 0}, {1, 0}};
  static constexpr TexCoord kRotation180[4] = {{0, 0}, {0, 1}, {1, 0}, {1, 1}};
  static constexpr TexCoord kRotation270[4] = {{1, 0}, {0, 0}, {1, 1}, {0, 1}};
  switch (rotation) {
    case 0:
      return kRotation0;
    case 90:
      return kRotation90;
    case 180:
      return kRotation180;
    default:
      return kRotation270;
  }
}

}  // namespace

std::unique_ptr<Vexel::Mesh> SceneHandler::CreateBackgroundMesh(float cameraWidth,
                                                                float cameraHeight, int rotation,
                                                                float left, float top, float right,
                                                                float bottom) {
  // The corners are in normalised window units; the camera's window is in
  // screen pixels centred on the origin.
  const float half_w = cameraWidth / 2.0f;
  const float half_h = cameraHeight / 2.0f;
  const Vexel::Vector3 positions[4] = {
      {right * half_w, bottom * half_h, 0.0f},
      {right * half_w, top * half_h, 0.0f},
      {left * half_w, bottom * half_h, 0.0f},
      {left * half_w, top * half_h, 0.0f},
  };
  const TexCoord* uv = BackgroundTexCoords(rotation);

  auto mesh = std::make_unique<Vexel::Mesh>(kBackgroundMeshName);
  mesh->begin(4, 4, Vexel::Mesh::RENDER_TRIANGLE_STRIP);
  for (int i = 0; i < 4; ++i) {
    mesh->position(positions[i]);
    mesh->textureCoord(uv[i].u, uv[i].v);
    mesh->normal(0.0f, 0.0f, 1.0f);
  }
  for (unsigned int i = 0; i < 4; ++i)
    mesh->index(i);
  mesh->end();
  mesh->finalize();
  return mesh;
}

void SceneHandler::CreateBackground(int width, int height, int rotation, float left, float top,
                                    float right, float bottom) {
  if (scene_ == nullptr)
    throw std::logic_error("SceneHandler::CreateBackground: no scene");
  SetBackgroundRectCorners(left, top, right, bottom);

  if (background_object_ != nullptr) {
    Detach(*background_object_);
    background_object_.reset();
  }
  background_material_.reset();
  background_texture_.reset();
  background_mesh_.reset();

  float camera_width = 0.0f;
  float camera_height = 0.0f;
  GetOrthoCameraWidthHeight(&camera_width, &camera_height);
  background_mesh_ =
      CreateBackgroundMesh(camera_width, camera_height, rotation, left, top, right, bottom);
  background_texture_ = std::make_unique<Vexel::Texture>(Resources(), kBackgroundTextureName,
                                                         Vexel::Texture::TYPE_2D, false);
  background_material_ = std::make_unique<Vexel::Material>(Resources());
  background_material_->setShader(Vexel::Material::SHADER_VERTEX, shaders::kBackgroundVertexName,
                                  shaders::kBackgroundVertexSource);
  background_material_->setShader(Vexel::Material::SHADER_FRAGMENT,
                                  shaders::kBackgroundFragmentName,
                                  shaders::kBackgroundFragmentSource);
  background_material_->setShaderSampler(Vexel::Material::SHADER_FRAGMENT,
                                         shaders::kBackgroundSampler, background_texture_.get());
  background_material_->setShaderAutoUniform(
      Vexel::Material::SHADER_VERTEX, shaders::kWorldViewProj,
      Vexel::Material::AUTO_UNIFORM_WORLD_VIEW_PROJECTION_MATRIX);

  background_object_ = std::make_unique<Vexel::Object>(*background_mesh_);
  background_object_->setMaterial(0, background_material_.get());
  background_object_->setPosition(0.0f, 0.0f, -kBackgroundDepth);
  background_object_->setParent(scene_->getRootNode());
  KeepSlotNodesAfterBackground();

  background_width_ = width;
  background_height_ = height;
}

void SceneHandler::KeepSlotNodesAfterBackground() {
  // The patches and texts write no depth, so whatever draws after them
  // covers them: move the attached slot nodes behind the new background in
  // the root's child order (their own order is kept).
  Vexel::Node* root = scene_->getRootNode();
  for (auto& node : text_nodes_) {
    if (node != nullptr && node->getParent() == root) {
      root->removeChild(node.get());
      node->setParent(root);
    }
  }
}

void SceneHandler::UpdateBackgroundImage(const void* data, int width, int height) {
  if (background_texture_ != nullptr && data != nullptr && width == background_width_ &&
      height == background_height_) {
    background_texture_->setImage(static_cast<const unsigned char*>(data), width, height,
                                  Vexel::Texture::PIXEL_FORMAT_RGBA8);
    return;
  }
  std::ostringstream message;
  message << "SceneHandler::UpdateBackgroundImage: invalid background window buffer! "
          << "background_image is " << (data != nullptr ? "non-null" : "null")
          << " background_image_width = " << width << " != " << background_width_
          << " background_image_height = " << height << " != " << background_height_;
  OCR_LOGE("ERROR %s", message.str().c_str());
}

}  // namespace ocr_ar
