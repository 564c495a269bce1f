#include <cmath>

#include "headless_scene.h"

namespace vexel_test {
namespace {

using Vexel::Material;
using Vexel::Texture;

class Drawing : public HeadlessScene {};

TEST_F(Drawing, TexturedQuadLandsWhereTheCameraMapsItWithTheFirstRowOnTop) {
  // 2x2 image: first row red, green; second row blue, white.
  const unsigned char pixels[] = {255, 0, 0,   255, 0,   255, 0,   255,
                                  0,   0, 255, 255, 255, 255, 255, 255};
  Texture texture(kit_->getResourceManager(), "Quadrants", Texture::TYPE_2D, false);
  texture.setImage(pixels, 2, 2, Texture::PIXEL_FORMAT_RGBA8);
  texture.setMinFilterMode(Texture::FILTER_NEAREST);
  texture.setMagFilterMode(Texture::FILTER_NEAREST);
  EXPECT_EQ(texture.getWidth(), 2);
  EXPECT_EQ(texture.getHeight(), 2);
  auto material = QuadMaterial(&texture);
  auto mesh = UnitQuad();
  Vexel::Object quad(*mesh);
  quad.setMaterial(0, material.get());
  quad.setParent(scene_->getRootNode());
  // Scene x -8..24, y -8..16: pixel columns 24..55, rows 8..31.
  quad.setPosition(8, 4, kDepth);
  quad.setScale(32, 24, 1);

  const Frame frame = Draw();
  EXPECT_PIXEL(frame, 26, 10, {255, 0, 0, 255});
  EXPECT_PIXEL(frame, 53, 10, {0, 255, 0, 255});
  EXPECT_PIXEL(frame, 26, 29, {0, 0, 255, 255});
  EXPECT_PIXEL(frame, 53, 29, {255, 255, 255, 255});
  // Edges: first and last covered pixels, and just outside.
  EXPECT_PIXEL(frame, 24, 8, {255, 0, 0, 255});
  EXPECT_PIXEL(frame, 55, 31, {255, 255, 255, 255});
  EXPECT_PIXEL(frame, 23, 20, {0, 0, 0, 255});
  EXPECT_PIXEL(frame, 56, 20, {0, 0, 0, 255});
  EXPECT_PIXEL(frame, 40, 7, {0, 0, 0, 255});
  EXPECT_PIXEL(frame, 40, 32, {0, 0, 0, 255});
}

TEST_F(Drawing, HalfTransparentPatchBlendsOverTheBackground) {
  auto background_texture = SolidTexture({0, 0, 255, 255});
  auto background_material = QuadMaterial(background_texture.get());
  auto mesh = UnitQuad();
  Vexel::Object background(*mesh);
  background.setMaterial(0, background_material.get());
  background.setScale(kWidth, kHeight, 1);
  background.setPosition(0, 0, kDepth);
  background.setParent(scene_->getRootNode());

  auto patch_texture = SolidTexture({255, 0, 0, 128});
  auto patch_material = QuadMaterial(patch_texture.get());
  patch_material->setBlendMode(Material::BLEND_ALPHA);
  patch_material->setDepthWriteEnabled(false);
  Vexel::Object patch(*mesh);
  patch.setMaterial(0, patch_material.get());
  patch.setScale(20, 20, 1);
  patch.setPosition(0, 0, kDepth);
  patch.setParent(scene_->getRootNode());

  const Frame frame = Draw();
  // 128/255 of red over blue; the frame's alpha: 128 + 255 * (1 - 128/255).
  EXPECT_PIXEL(frame, 32, 24, {128, 0, 127, 255 - 127 + 128 * 128 / 255});
  EXPECT_PIXEL(frame, 2, 2, {0, 0, 255, 255});
}

TEST_F(Drawing, PatchShaderCorrectsColourAndFadesTowardsTheEdges) {
  auto texture = SolidTexture({100, 100, 100, 200}, 8);
  Material material(kit_->getResourceManager());
  material.setShader(Material::SHADER_VERTEX, "PatchVertex", kPatchVertex);
  material.setShader(Material::SHADER_FRAGMENT, "PatchFragment", kPatchFragment);
  material.setShaderSampler(Material::SHADER_FRAGMENT, "texture0", texture.get());
  material.setShaderAutoUniform(Material::SHADER_VERTEX, "worldViewProj",
                                Material::AUTO_UNIFORM_WORLD_VIEW_PROJECTION_MATRIX);
  material.setShaderUniform(Material::SHADER_FRAGMENT, "colorScale", Vexel::Vector3(2, 1, 0.5f));
  material.setShaderUniform(Material::SHADER_FRAGMENT, "colorShift", Vexel::Vector3(0, 51, 0));
  // Opaque drawing shows what the shader wrote, alpha included.
  material.setBlendMode(Material::BLEND_NONE);
  auto mesh = UnitQuad();
  Vexel::Object patch(*mesh);
  patch.setMaterial(0, &material);
  patch.setScale(kWidth, kHeight, 1);
  patch.setPosition(0, 0, kDepth);
  patch.setParent(scene_->getRootNode());

  const Frame frame = Draw();
  // Centre: rgb * scale + shift, alpha * (1 + 0.8) clamped.
  EXPECT_PIXEL(frame, 32, 24, {200, 151, 50, 255});
  // Top row (v near 0): alpha factor 1 - 0.98 + 0.8 = 0.82 or so.
  const Rgba edge = frame.At(32, 0);
  EXPECT_NEAR(edge[3], 200 * (1.0 - std::pow(47.0 / 48.0, 2) + 0.8), 4);
}

TEST_F(Drawing, NestedNodesComposeScaleRotationAndPosition) {
  auto texture = SolidTexture({0, 255, 0, 255});
  auto material = QuadMaterial(texture.get());
  auto mesh = UnitQuad();
  Vexel::EmptyNode parent;
  parent.setParent(scene_->getRootNode());
  parent.setPosition(-10, 0, kDepth);
  parent.setRotation(Vexel::Degrees(90));
  Vexel::Object bar(*mesh);
  bar.setMaterial(0, material.get());
  bar.setParent(&parent);
  // A 12 x 2 bar 10 units along the parent's x axis, which points up.
  bar.setPosition(10, 0, 0);
  bar.setScale(12, 2, 1);

  const Frame frame = Draw();
  // World: centre (-10, 10), 2 wide and 12 tall: columns 21..22, rows 8..19.
  EXPECT_PIXEL(frame, 21, 9, {0, 255, 0, 255});
  EXPECT_PIXEL(frame, 22, 18, {0, 255, 0, 255});
  EXPECT_PIXEL(frame, 25, 14, {0, 0, 0, 255});
  // Not where the bar would be without the parent's rotation: (0, 0) area.
  EXPECT_PIXEL(frame, 32, 24, {0, 0, 0, 255});

  // Hiding the parent hides the child.
  parent.setVisible(false);
  const Frame hidden = Draw();
  EXPECT_PIXEL(hidden, 21, 9, {0, 0, 0, 255});
}

TEST_F(Drawing, MovingTheCameraMovesTheView) {
  auto texture = SolidTexture({255, 255, 0, 255});
  auto material = QuadMaterial(texture.get());
  auto mesh = UnitQuad();
  Vexel::Object quad(*mesh);
  quad.setMaterial(0, material.get());
  quad.setScale(4, 4, 1);
  quad.setPosition(0, 0, kDepth);
  quad.setParent(scene_->getRootNode());
  camera_->setPosition(10, 5, 0);

  const Frame frame = Draw();
  // The quad at scene (0, 0) appears 10 left and 5 down of the centre.
  EXPECT_PIXEL(frame, 22, 29, {255, 255, 0, 255});
  EXPECT_PIXEL(frame, 32, 24, {0, 0, 0, 255});
}

TEST_F(Drawing, ContentOutsideTheClipDistancesIsNotDrawn) {
  auto texture = SolidTexture({255, 255, 255, 255});
  auto material = QuadMaterial(texture.get());
  auto mesh = UnitQuad();
  Vexel::Object quad(*mesh);
  quad.setMaterial(0, material.get());
  quad.setScale(8, 8, 1);
  quad.setParent(scene_->getRootNode());

  quad.setPosition(0, 0, 0.0f);  // nearer than the near clip distance
  EXPECT_PIXEL(Draw(), 32, 24, {0, 0, 0, 255});
  quad.setPosition(0, 0, -301.0f);  // beyond the far one
  EXPECT_PIXEL(Draw(), 32, 24, {0, 0, 0, 255});
  quad.setPosition(0, 0, -299.0f);
  EXPECT_PIXEL(Draw(), 32, 24, {255, 255, 255, 255});
}

TEST_F(Drawing, BackgroundColourAndNoSceneClearTheFrame) {
  scene_->setBackgroundColor(Vexel::Color(1, 0, 0, 0.5f));
  EXPECT_PIXEL(Draw(), 0, 0, {255, 0, 0, 128});
  renderer_->setScene(nullptr);
  EXPECT_EQ(renderer_->getScene(), nullptr);
  EXPECT_PIXEL(Draw(), 0, 0, {0, 0, 0, 0});
}

TEST_F(Drawing, BgraImagesAreSwizzledOnUpload) {
  const unsigned char bgra[] = {255, 0, 0, 255};  // blue
  Texture texture(kit_->getResourceManager(), "Bgra", Texture::TYPE_2D, false);
  texture.setImage(bgra, 1, 1, Texture::PIXEL_FORMAT_BGRA8);
  auto material = QuadMaterial(&texture);
  auto mesh = UnitQuad();
  Vexel::Object quad(*mesh);
  quad.setMaterial(0, material.get());
  quad.setScale(8, 8, 1);
  quad.setPosition(0, 0, kDepth);
  quad.setParent(scene_->getRootNode());
  EXPECT_PIXEL(Draw(), 32, 24, {0, 0, 255, 255});
}

}  // namespace
}  // namespace vexel_test
