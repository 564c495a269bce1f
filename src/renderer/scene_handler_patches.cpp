// Scene handler: inpainted patch objects. One shared unit-square mesh, one
// texture and material per patch; a patch is uploaded again only when its
// id changes, as texture uploads are the costly step on a phone.
#include <sstream>

#include "renderer/scene_handler.h"
#include "renderer/shader_sources.h"

namespace ocr_ar {
namespace {

constexpr const char* kInpaintedRectMeshName = "InpaintedRectMesh";
constexpr const char* kInpaintedTextureName = "InpaintedTexture";

// The unit square centred on its node, so a node's scale is the patch size;
// v runs downwards so that the first image row is at the top.
struct UnitSquareVertex {
  float x, y, u, v;
};
constexpr UnitSquareVertex kUnitSquare[4] = {
    {0.5f, -0.5f, 1.0f, 1.0f},
    {0.5f, 0.5f, 1.0f, 0.0f},
    {-0.5f, -0.5f, 0.0f, 1.0f},
    {-0.5f, 0.5f, 0.0f, 0.0f},
};

}  // namespace

void PatchObjectDeleter::operator()(Vexel::Object* object) const {
  delete object->getMaterial(0);
  delete object;
}

PatchObjectPtr SceneHandler::CreateInpaintedRectInstance(Vexel::Texture* texture) {
  texture->setMinFilterMode(Vexel::Texture::FILTER_LINEAR);
  texture->setMagFilterMode(Vexel::Texture::FILTER_LINEAR);
  texture->setUWrapMode(Vexel::Texture::WRAP_CLAMP);
  texture->setVWrapMode(Vexel::Texture::WRAP_CLAMP);

  auto material = std::make_unique<Vexel::Material>(Resources());
  material->setShader(Vexel::Material::SHADER_VERTEX, shaders::kInpaintedRectVertexName,
                      shaders::kInpaintedRectVertexSource);
  material->setShader(Vexel::Material::SHADER_FRAGMENT, shaders::kInpaintedRectFragmentName,
                      shaders::kInpaintedRectFragmentSource);
  material->setShaderSampler(Vexel::Material::SHADER_FRAGMENT, shaders::kPatchSampler, texture);
  material->setShaderAutoUniform(Vexel::Material::SHADER_VERTEX, shaders::kWorldViewProj,
                                 Vexel::Material::AUTO_UNIFORM_WORLD_VIEW_PROJECTION_MATRIX);
  material->setBlendMode(Vexel::Material::BLEND_ALPHA);
  material->setDepthWriteEnabled(false);

  if (inpainted_rect_mesh_ == nullptr) {
    auto mesh = std::make_unique<Vexel::Mesh>(kInpaintedRectMeshName);
    mesh->begin(4, 4, Vexel::Mesh::RENDER_TRIANGLE_STRIP);
    for (const UnitSquareVertex& vertex : kUnitSquare) {
      mesh->position(vertex.x, vertex.y, 0.0f);
      mesh->textureCoord(vertex.u, vertex.v);
    }
    for (unsigned int i = 0; i < 4; ++i)
      mesh->index(i);
    mesh->end();
    mesh->finalize();
    inpainted_rect_mesh_ = std::move(mesh);
  }

  PatchObjectPtr object(new Vexel::Object(*inpainted_rect_mesh_));
  object->setMaterial(0, material.get());
  material.release();  // owned by the object from here on (PatchObjectDeleter)
  return object;
}

InpaintedRectObject SceneHandler::CreateInpaintedRectObject(long id, const void* data, int width,
                                                            int height) {
  InpaintedRectObject rect;
  std::ostringstream name;
  name << kInpaintedTextureName << texture_serial_;
  ++texture_serial_;
  rect.texture = std::make_unique<Vexel::Texture>(Resources(), name.str().c_str(),
                                                  Vexel::Texture::TYPE_2D, false);
  if (data != nullptr) {
    rect.texture->setImage(static_cast<const unsigned char*>(data), width, height,
                           Vexel::Texture::PIXEL_FORMAT_RGBA8);
  }
  rect.object = CreateInpaintedRectInstance(rect.texture.get());
  rect.id = id;
  return rect;
}

void SceneHandler::UpdateOrCreateInpaintedRectObject(InpaintedRectObject& rect, long id,
                                                     const void* data, int width, int height) {
  if (rect.texture != nullptr && rect.texture->getWidth() == width &&
      rect.texture->getHeight() == height) {
    if (data == nullptr || rect.id == id)
      return;  // unchanged patch: no upload
    rect.texture->setImage(static_cast<const unsigned char*>(data), width, height,
                           Vexel::Texture::PIXEL_FORMAT_RGBA8);
    rect.id = id;
    return;
  }
  DeleteInpaintedRectObject(rect);
  rect = CreateInpaintedRectObject(id, data, width, height);
}

void SceneHandler::DeleteInpaintedRectObject(InpaintedRectObject& rect) {
  rect.texture.reset();
  if (rect.object != nullptr) {
    Detach(*rect.object);
    rect.object.reset();  // material 0 first, then the object
  }
  rect.id = -1;
}

void SceneHandler::DeleteInpaintedTextObject(InpaintedTextObject& text) {
  DeleteInpaintedRectObject(text.patch);
  if (text.text != nullptr) {
    Detach(*text.text);
    text.text.reset();
  }
  text.slot_index = kRetiredSlotIndex;
}

void SceneHandler::CreateInpaintedTextObjectNodes(unsigned int index) {
  // Slots are appended in index order; this adds the one at `index`.
  while (text_nodes_.size() <= index)
    text_nodes_.push_back(std::make_unique<Vexel::EmptyNode>());
}

}  // namespace ocr_ar
