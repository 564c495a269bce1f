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
  auto material = QuadMaterial(&texture);
  // Scene x -8..24, y -8..16: pixel columns 24..55, rows 8..31.
  auto quad = AddQuad(material.get(), 32, 24, 8, 4);

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
  auto background = AddQuad(background_material.get(), kWidth, kHeight);
  auto patch_texture = SolidTexture({255, 0, 0, 128});
  auto patch_material = QuadMaterial(patch_texture.get());
  patch_material->setBlendMode(Material::BLEND_ALPHA);
  patch_material->setDepthWriteEnabled(false);
  auto patch = AddQuad(patch_material.get(), 20, 20);

  const Frame frame = Draw();
  // 128/255 of red over blue; the frame's alpha: 128 + 255 * (1 - 128/255).
  EXPECT_PIXEL(frame, 32, 24, {128, 0, 127, 255 - 127 + 128 * 128 / 255});
  EXPECT_PIXEL(frame, 2, 2, {0, 0, 255, 255});
}

TEST_F(Drawing, PatchShaderCorrectsColourAndFadesTowardsTheEdges) {
  auto texture = SolidTexture({100, 100, 100, 200}, 8);
  auto material = PatchMaterial(kit_->getResourceManager(), texture.get(),
                                Vexel::Vector3(2, 1, 0.5f), Vexel::Vector3(0, 51, 0));
  // Opaque drawing shows what the shader wrote, alpha included.
  material->setBlendMode(Material::BLEND_NONE);
  auto patch = AddQuad(material.get(), kWidth, kHeight);

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
  Vexel::EmptyNode parent;
  parent.setParent(scene_->getRootNode());
  parent.setPosition(-10, 0, kDepth);
  parent.setRotation(Vexel::Degrees(90));
  // A 12 x 2 bar 10 units along the parent's x axis, which points up.
  auto bar = AddQuad(material.get(), 12, 2);
  bar->setParent(&parent);
  bar->setPosition(10, 0, 0);

  const Frame frame = Draw();
  // World: centre (-10, 10), 2 wide and 12 tall: columns 21..22, rows 8..19.
  EXPECT_PIXEL(frame, 21, 9, {0, 255, 0, 255});
  EXPECT_PIXEL(frame, 22, 18, {0, 255, 0, 255});
  EXPECT_PIXEL(frame, 25, 14, {0, 0, 0, 255});
  // Not where the bar would be without the parent's rotation: (0, 0) area.
  EXPECT_PIXEL(frame, 32, 24, {0, 0, 0, 255});

  // Hiding the parent hides the child.
  parent.setVisible(false);
  EXPECT_PIXEL(Draw(), 21, 9, {0, 0, 0, 255});
}

TEST_F(Drawing, OnlyContentBetweenTheClipDistancesIsDrawnOverTheClearColour) {
  scene_->setBackgroundColor(Vexel::Color(1, 0, 0, 0.5f));
  auto texture = SolidTexture({255, 255, 0, 255});
  auto material = QuadMaterial(texture.get());
  auto quad = AddQuad(material.get(), 4, 4);
  // Nearer than the near clip distance, beyond the far one, just inside it.
  for (const float z : {0.0f, -301.0f, -299.0f}) {
    quad->setPosition(0, 0, z);
    EXPECT_PIXEL(Draw(), 32, 24, z == -299.0f ? Rgba{255, 255, 0, 255} : Rgba{255, 0, 0, 128})
        << "at z = " << z;
  }
}

}  // namespace
}  // namespace vexel_test
