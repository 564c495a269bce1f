#include <gtest/gtest.h>

#include <vector>

#include "common/log.h"
#include "recording_scene.h"
#include "renderer/shader_sources.h"

namespace ocr_ar {
namespace {

using testing::RecordingScene;
using vexel_recording::LiveCount;
using vexel_recording::NodeState;
using vexel_recording::StateOf;

class BackgroundTest : public RecordingScene {
 protected:
  const Vexel::Mesh::Impl& BackgroundMesh() {
    return *NodeState(*Handler().GetBackgroundObject()).mesh;
  }
};

TEST_F(BackgroundTest, QuadFillsTheCornersInCameraPixels) {
  SceneHandler& handler = Handler();  // camera 640 x 480
  handler.CreateBackground(320, 180, 0, -1.0f, 0.75f, 1.0f, -0.75f);
  const auto& mesh = BackgroundMesh();
  EXPECT_EQ(mesh.name, "BackgroundRectMesh");
  EXPECT_EQ(mesh.type, Vexel::Mesh::RENDER_TRIANGLE_STRIP);
  const std::vector<Vexel::Vector3> positions = {
      {320, -180, 0}, {320, 180, 0}, {-320, -180, 0}, {-320, 180, 0}};
  EXPECT_EQ(mesh.positions, positions);
  EXPECT_EQ(mesh.normals, std::vector<Vexel::Vector3>(4, Vexel::Vector3(0, 0, 1)));
  EXPECT_EQ(mesh.indices, (std::vector<unsigned int>{0, 1, 2, 3}));
  EXPECT_TRUE(mesh.finalized);
  float l = 0, t = 0, r = 0, b = 0;
  handler.GetBackgroundRectCorners(&l, &t, &r, &b);
  EXPECT_EQ(t, 0.75f);
  EXPECT_EQ(handler.GetBackgroundWidth(), 320);
  EXPECT_EQ(handler.GetBackgroundHeight(), 180);
}

TEST_F(BackgroundTest, TextureCoordinatesTurnWithTheRotation) {
  using UV = std::vector<Vexel::Vector2>;
  const std::pair<int, UV> cases[] = {
      {0, {{1, 1}, {1, 0}, {0, 1}, {0, 0}}},   {90, {{0, 1}, {1, 1}, {0, 0}, {1, 0}}},
      {180, {{0, 0}, {0, 1}, {1, 0}, {1, 1}}}, {270, {{1, 0}, {0, 0}, {1, 1}, {0, 1}}},
      {45, {{1, 0}, {0, 0}, {1, 1}, {0, 1}}},  // any other: as 270
  };
  for (const auto& [rotation, uvs] : cases) {
    Handler().CreateBackground(4, 4, rotation, -1, 1, 1, -1);
    EXPECT_EQ(BackgroundMesh().uvs, uvs) << rotation;
  }
}

TEST_F(BackgroundTest, MaterialShowsRenderTextureWithTheBackgroundShaders) {
  Handler().CreateBackground(4, 4, 0, -1, 1, 1, -1);
  const Vexel::Object& object = *Handler().GetBackgroundObject();
  const auto& material = StateOf(*object.getMaterial(0));
  EXPECT_EQ(material.shaders.at(0).name, "BackgroundImageVertShader");
  EXPECT_EQ(material.shaders.at(0).source, shaders::kBackgroundVertexSource);
  EXPECT_EQ(material.shaders.at(1).name, "BackgroundImageFragShader");
  EXPECT_EQ(material.shaders.at(1).source, shaders::kBackgroundFragmentSource);
  EXPECT_EQ(material.samplers.at("diffuseMap").second, Handler().GetBackgroundTexture());
  EXPECT_EQ(material.auto_uniforms.at("worldViewProj").second,
            Vexel::Material::AUTO_UNIFORM_WORLD_VIEW_PROJECTION_MATRIX);
  EXPECT_TRUE(material.depth_write);
  EXPECT_EQ(Handler().GetBackgroundTexture()->getName(), "RenderTexture");
  EXPECT_EQ(NodeState(object).position.z, -SceneHandler::kBackgroundDepth);
}

TEST_F(BackgroundTest, LiesBehindTheOverlaysInDepthAndDrawOrder) {
  SceneHandler& handler = Handler();
  handler.CreateBackground(4, 4, 0, -1, 1, 1, -1);
  Draw(0, "eins");
  Draw(1, "zwei");
  // A rebuilt background (new orientation) is attached last; the slot nodes
  // must still come after it.
  handler.CreateBackground(4, 4, 90, -1, 1, 1, -1);
  Vexel::Node* root = Root(handler);
  std::vector<const Vexel::Node*> order;
  for (std::size_t i = 0; i < root->getChildCount(); ++i)
    order.push_back(root->getChild(i));
  const std::vector<const Vexel::Node*> expected = {
      handler.GetCamera(), handler.GetBackgroundObject(), handler.GetTextNodes()[0].get(),
      handler.GetTextNodes()[1].get()};
  EXPECT_EQ(order, expected);
  // Within the camera's clip range, the background farther away.
  EXPECT_GT(SceneHandler::kBackgroundDepth, SceneHandler::kOverlayDepth);
  EXPECT_LE(SceneHandler::kBackgroundDepth, handler.GetCamera()->getFarClipDistance());
  EXPECT_GE(SceneHandler::kOverlayDepth, handler.GetCamera()->getNearClipDistance());
}

TEST_F(BackgroundTest, RecreatingReplacesEveryPart) {
  SceneHandler& handler = Handler();
  handler.CreateBackground(4, 4, 0, -1, 1, 1, -1);
  handler.CreateBackground(8, 2, 180, -1, 1, 1, -1);
  EXPECT_EQ(LiveCount("Object"), 1);
  EXPECT_EQ(LiveCount("Material"), 1);
  EXPECT_EQ(LiveCount("Texture"), 1);
  EXPECT_EQ(LiveCount("Mesh"), 1);
  EXPECT_EQ(Root(handler)->getChildCount(), 2u);  // camera and background
}

TEST_F(BackgroundTest, UploadsFramesOfTheCreatedSizeOnly) {
  SceneHandler& handler = Handler();
  handler.CreateBackground(4, 2, 0, -1, 1, 1, -1);
  const std::vector<unsigned char> frame(4 * 2 * 4, 77);
  handler.UpdateBackgroundImage(frame.data(), 4, 2);
  const auto& texture = StateOf(*handler.GetBackgroundTexture());
  EXPECT_EQ(texture.upload_count, 1);
  EXPECT_EQ(texture.format, Vexel::Texture::PIXEL_FORMAT_RGBA8);
  EXPECT_EQ(texture.last_data, frame.data());

  ocr::log::ScopedCapture log;
  handler.UpdateBackgroundImage(frame.data(), 2, 4);
  handler.UpdateBackgroundImage(nullptr, 4, 2);
  EXPECT_EQ(texture.upload_count, 1);
  const std::vector<std::string> expected = {
      "ERROR SceneHandler::UpdateBackgroundImage: invalid background window buffer! "
      "background_image is non-null background_image_width = 2 != 4 "
      "background_image_height = 4 != 2",
      "ERROR SceneHandler::UpdateBackgroundImage: invalid background window buffer! "
      "background_image is null background_image_width = 4 != 4 "
      "background_image_height = 2 != 2"};
  EXPECT_EQ(log.Texts(), expected);
  EXPECT_EQ(log.Count(expected[0], ocr::log::kError), 1);
}

TEST_F(BackgroundTest, NoBackgroundYetRejectsEveryFrame) {
  ocr::log::ScopedCapture log;
  const unsigned char pixel[4] = {};
  Handler().UpdateBackgroundImage(pixel, 1, 1);
  EXPECT_TRUE(
      log.Contains("ERROR SceneHandler::UpdateBackgroundImage: invalid background window buffer! "
                   "background_image is non-null background_image_width = 1 != 0 "
                   "background_image_height = 1 != 0",
                   ocr::log::kError));
}

}  // namespace
}  // namespace ocr_ar
