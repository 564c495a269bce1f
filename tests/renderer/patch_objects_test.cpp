#include <gtest/gtest.h>

#include <vector>

#include "recording_scene.h"
#include "renderer/shader_sources.h"

namespace ocr_ar {
namespace {

using testing::RecordingScene;
using vexel_recording::CountEntries;
using vexel_recording::LiveCount;
using vexel_recording::NodeState;
using vexel_recording::StateOf;

class PatchObjectsTest : public RecordingScene {
 protected:
  std::vector<unsigned char> pixels_ = std::vector<unsigned char>(8 * 6 * 4, 200);
};

TEST_F(PatchObjectsTest, TexturesAreNamedBySerialNeverReset) {
  SceneHandler& handler = Handler();
  InpaintedRectObject a = handler.CreateInpaintedRectObject(3, pixels_.data(), 8, 6);
  InpaintedRectObject b = handler.CreateInpaintedRectObject(4, nullptr, 8, 6);
  EXPECT_EQ(a.texture->getName(), "InpaintedTexture0");
  EXPECT_EQ(b.texture->getName(), "InpaintedTexture1");
  handler.DeleteInpaintedRectObject(a);
  handler.DeleteInpaintedRectObject(b);
  InpaintedRectObject c = handler.CreateInpaintedRectObject(5, nullptr, 1, 1);
  EXPECT_EQ(c.texture->getName(), "InpaintedTexture2");
  handler.DeleteInpaintedRectObject(c);
}

TEST_F(PatchObjectsTest, NewPatchUploadsItsPixelsAsRgba) {
  SceneHandler& handler = Handler();
  InpaintedRectObject rect = handler.CreateInpaintedRectObject(3, pixels_.data(), 8, 6);
  const auto& texture = StateOf(*rect.texture);
  EXPECT_EQ(texture.upload_count, 1);
  EXPECT_EQ(texture.last_data, pixels_.data());
  EXPECT_EQ(texture.format, Vexel::Texture::PIXEL_FORMAT_RGBA8);
  EXPECT_EQ(texture.min_filter, Vexel::Texture::FILTER_LINEAR);
  EXPECT_EQ(texture.mag_filter, Vexel::Texture::FILTER_LINEAR);
  EXPECT_EQ(texture.u_wrap, Vexel::Texture::WRAP_CLAMP);
  EXPECT_EQ(texture.v_wrap, Vexel::Texture::WRAP_CLAMP);
  EXPECT_EQ(rect.id, 3);
  EXPECT_EQ(rect.object->getParent(), nullptr);  // placed by the text code
  handler.DeleteInpaintedRectObject(rect);
}

TEST_F(PatchObjectsTest, NullDataMakesATextureWithoutImageAndKeepsTheId) {
  SceneHandler& handler = Handler();
  InpaintedRectObject rect = handler.CreateInpaintedRectObject(9, nullptr, 8, 6);
  EXPECT_EQ(StateOf(*rect.texture).upload_count, 0);
  EXPECT_EQ(rect.id, 9);
  ASSERT_NE(rect.object, nullptr);
  handler.DeleteInpaintedRectObject(rect);
}

TEST_F(PatchObjectsTest, MaterialUsesThePatchShadersAndWritesNoDepth) {
  SceneHandler& handler = Handler();
  InpaintedRectObject rect = handler.CreateInpaintedRectObject(1, pixels_.data(), 8, 6);
  const auto& material = StateOf(*rect.object->getMaterial(0));
  EXPECT_EQ(material.shaders.at(0).name, "InpaintedRectVertexShader");
  EXPECT_EQ(material.shaders.at(0).source, shaders::kInpaintedRectVertexSource);
  EXPECT_EQ(material.shaders.at(1).name, "InpaintedRectFragmentShader");
  EXPECT_EQ(material.shaders.at(1).source, shaders::kInpaintedRectFragmentSource);
  EXPECT_EQ(material.samplers.at("texture0").first, 1);
  EXPECT_EQ(material.samplers.at("texture0").second, rect.texture.get());
  EXPECT_EQ(material.auto_uniforms.at("worldViewProj").first, 0);
  EXPECT_EQ(material.auto_uniforms.at("worldViewProj").second,
            Vexel::Material::AUTO_UNIFORM_WORLD_VIEW_PROJECTION_MATRIX);
  EXPECT_EQ(material.vector_uniforms.count("colorScale"), 0u);  // set when placed
  EXPECT_EQ(material.blend, Vexel::Material::BLEND_ALPHA);
  EXPECT_FALSE(material.depth_write);
  handler.DeleteInpaintedRectObject(rect);
}

TEST_F(PatchObjectsTest, AllPatchesShareOneUnitSquareMesh) {
  SceneHandler& handler = Handler();
  InpaintedRectObject a = handler.CreateInpaintedRectObject(1, nullptr, 8, 6);
  InpaintedRectObject b = handler.CreateInpaintedRectObject(2, nullptr, 8, 6);
  EXPECT_EQ(CountEntries("Mesh InpaintedRectMesh"), 1);
  EXPECT_EQ(NodeState(*a.object).mesh_name, "InpaintedRectMesh");
  EXPECT_EQ(NodeState(*b.object).mesh_name, "InpaintedRectMesh");
  const auto& mesh = *NodeState(*a.object).mesh;
  EXPECT_EQ(mesh.type, Vexel::Mesh::RENDER_TRIANGLE_STRIP);
  EXPECT_TRUE(mesh.finalized);
  const std::vector<Vexel::Vector3> positions = {
      {0.5f, -0.5f, 0.0f}, {0.5f, 0.5f, 0.0f}, {-0.5f, -0.5f, 0.0f}, {-0.5f, 0.5f, 0.0f}};
  const std::vector<Vexel::Vector2> uvs = {{1, 1}, {1, 0}, {0, 1}, {0, 0}};
  EXPECT_EQ(mesh.positions, positions);
  EXPECT_EQ(mesh.uvs, uvs);
  EXPECT_EQ(mesh.indices, (std::vector<unsigned int>{0, 1, 2, 3}));
  handler.DeleteInpaintedRectObject(a);
  handler.DeleteInpaintedRectObject(b);
}

TEST_F(PatchObjectsTest, UploadsOnlyWhenTheIdChanges) {
  SceneHandler& handler = Handler();
  InpaintedRectObject rect = handler.CreateInpaintedRectObject(1, pixels_.data(), 8, 6);
  handler.UpdateOrCreateInpaintedRectObject(rect, 1, pixels_.data(), 8, 6);
  EXPECT_EQ(StateOf(*rect.texture).upload_count, 1);
  handler.UpdateOrCreateInpaintedRectObject(rect, 2, pixels_.data(), 8, 6);
  EXPECT_EQ(StateOf(*rect.texture).upload_count, 2);
  EXPECT_EQ(rect.id, 2);
  handler.UpdateOrCreateInpaintedRectObject(rect, 2, pixels_.data(), 8, 6);
  EXPECT_EQ(StateOf(*rect.texture).upload_count, 2);
  handler.UpdateOrCreateInpaintedRectObject(rect, 3, nullptr, 8, 6);  // no pixels: no upload
  EXPECT_EQ(StateOf(*rect.texture).upload_count, 2);
  EXPECT_EQ(rect.id, 2);
  EXPECT_EQ(CountEntries("setImage*"), 2);
  EXPECT_EQ(rect.texture->getName(), "InpaintedTexture0");
  handler.DeleteInpaintedRectObject(rect);
}

TEST_F(PatchObjectsTest, ASizeChangeMakesANewTextureAndObject) {
  SceneHandler& handler = Handler();
  InpaintedRectObject rect = handler.CreateInpaintedRectObject(1, pixels_.data(), 8, 6);
  Vexel::EmptyNode slot;
  slot.addChild(rect.object.get());
  const std::vector<unsigned char> larger(10 * 6 * 4, 1);
  handler.UpdateOrCreateInpaintedRectObject(rect, 1, larger.data(), 10, 6);
  EXPECT_EQ(rect.texture->getName(), "InpaintedTexture1");
  EXPECT_EQ(rect.texture->getWidth(), 10);
  EXPECT_EQ(slot.getChildCount(), 0u);  // the old object left the scene
  EXPECT_EQ(LiveCount("Texture"), 1);
  EXPECT_EQ(LiveCount("Object"), 1);
  EXPECT_EQ(LiveCount("Material"), 1);
  handler.DeleteInpaintedRectObject(rect);
}

TEST_F(PatchObjectsTest, DeleteDetachesAndDestroysObjectMaterialAndTexture) {
  SceneHandler& handler = Handler();
  InpaintedRectObject rect = handler.CreateInpaintedRectObject(1, pixels_.data(), 8, 6);
  Vexel::EmptyNode slot;
  slot.addChild(rect.object.get());
  vexel_recording::ClearJournal();
  handler.DeleteInpaintedRectObject(rect);
  EXPECT_EQ(vexel_recording::Journal(),
            (std::vector<std::string>{"~Texture InpaintedTexture0", "~Material", "~Object"}));
  EXPECT_EQ(slot.getChildCount(), 0u);
  EXPECT_EQ(rect.object, nullptr);
  EXPECT_EQ(rect.texture, nullptr);
  EXPECT_EQ(rect.id, -1);
}

}  // namespace
}  // namespace ocr_ar
