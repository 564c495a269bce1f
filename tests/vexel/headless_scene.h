#pragma once

#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "platform/desktop.h"
#include "vexel/Vexel.h"

namespace vexel_test {

// The renderer's two shader pairs: a plain textured quad and the inpainted
// patch with colour correction and faded edges.
inline constexpr const char* kQuadVertex =
    "#version 100\n attribute vec4 position; attribute vec2 uv0; uniform mat4 worldViewProj; "
    "varying vec2 oUv0; void main() { gl_Position = worldViewProj * position; oUv0 = uv0; }";
inline constexpr const char* kQuadFragment =
    "#version 100\n precision mediump int; precision mediump float; uniform sampler2D "
    "diffuseMap; varying vec2 oUv0; void main() { gl_FragColor = texture2D(diffuseMap, oUv0); }";
inline constexpr const char* kPatchVertex =
    "#version 100\n attribute vec4 vertex; attribute vec2 uv0; uniform mat4 worldViewProj; "
    "varying vec2 uv; void main(void) { uv = uv0; gl_Position = worldViewProj * vertex; }";
inline constexpr const char* kPatchFragment =
    "#version 100\n precision mediump float; precision mediump int; varying vec2 uv; uniform "
    "sampler2D texture0; uniform vec3 colorScale; uniform vec3 colorShift; void main(void) { vec4 "
    "col = texture2D(texture0, uv); gl_FragColor = vec4(col.rgb * colorScale + "
    "vec3(colorShift/255.0), col.a); vec2 uvCentered = abs((uv * vec2(2.0, 2.0)) - vec2(1.0, "
    "1.0)); float maxUVDist = max(uvCentered.x * uvCentered.x * uvCentered.x, uvCentered.y * "
    "uvCentered.y); const float minAlpha = 0.8; gl_FragColor *= vec4(1, 1, 1, (1.0 - maxUVDist) "
    "+ minAlpha); }";

using Rgba = std::array<int, 4>;

// An RGBA image read back from a window, top row first.
struct Frame {
  int width = 0;
  int height = 0;
  std::vector<std::uint8_t> pixels;

  Rgba At(int x, int y) const {
    const std::uint8_t* p = &pixels[(static_cast<std::size_t>(y) * width + x) * 4];
    return {p[0], p[1], p[2], p[3]};
  }
};

// True when every channel is within `tolerance` levels.
inline bool Near(const Rgba& actual, const Rgba& expected, int tolerance = 3) {
  for (int c = 0; c < 4; ++c) {
    if (std::abs(actual[c] - expected[c]) > tolerance)
      return false;
  }
  return true;
}

inline std::string Show(const Rgba& p) {
  return "(" + std::to_string(p[0]) + ", " + std::to_string(p[1]) + ", " + std::to_string(p[2]) +
         ", " + std::to_string(p[3]) + ")";
}

#define EXPECT_PIXEL(frame, x, y, ...)                                                    \
  do {                                                                                    \
    const ::vexel_test::Rgba expected_pixel = __VA_ARGS__;                                \
    const ::vexel_test::Rgba actual_pixel = (frame).At((x), (y));                         \
    EXPECT_TRUE(::vexel_test::Near(actual_pixel, expected_pixel))                         \
        << "pixel (" << (x) << ", " << (y) << ") is " << ::vexel_test::Show(actual_pixel) \
        << ", expected " << ::vexel_test::Show(expected_pixel);                           \
  } while (0)

// A kit drawing headless into an offscreen window of width x height pixels
// (64 x 48 unless a test fixture asks for another size),
// through an orthographic camera whose window is the same size in scene
// units: scene (x, y) lands on pixel column x + width/2, row height/2 - y.
// Content goes at z = -10, in front of the camera.
class HeadlessScene : public ::testing::Test {
 protected:
  static constexpr int kWidth = 64;
  static constexpr int kHeight = 48;
  static constexpr float kDepth = -10.0f;

  explicit HeadlessScene(int width = kWidth, int height = kHeight)
      : width_(width), height_(height) {}

  void SetUp() override {
    window_ = platform::desktop::CreateOffscreenWindow(width_, height_);
    kit_ = std::make_unique<Vexel::Kit>(nullptr, "");
    renderer_ = std::make_unique<Vexel::AndroidSurfaceRenderer>(
        *kit_, window_, Vexel::Renderer::ANTI_ALIASING_NONE);
    scene_ = std::make_unique<Vexel::Scene>(*kit_);
    scene_->setBackgroundColor(Vexel::Color(0, 0, 0, 1));
    camera_ = std::make_unique<Vexel::Camera>();
    camera_->setParent(scene_->getRootNode());
    camera_->setProjectionMode(Vexel::PROJECTION_ORTHOGRAPHIC);
    camera_->setOrthographicWindowSize(static_cast<float>(width_), static_cast<float>(height_));
    camera_->setAutomaticAspectRatio(false);
    camera_->setNearClipDistance(1.0f);
    camera_->setFarClipDistance(300.0f);
    renderer_->setScene(scene_.get());
  }

  void TearDown() override {
    camera_.reset();
    scene_.reset();
    renderer_.reset();
    kit_.reset();
    ANativeWindow_release(window_);
  }

  Frame Draw() {
    kit_->drawAll();
    return Frame{width_, height_, platform::desktop::ReadFrame(window_)};
  }

  // The unit quad centred on its node, v running down so that the first
  // image row is at the top.
  static std::unique_ptr<Vexel::Mesh> UnitQuad(const char* name = "UnitQuad") {
    auto mesh = std::make_unique<Vexel::Mesh>(name);
    mesh->begin(4, 4, Vexel::Mesh::RENDER_TRIANGLE_STRIP);
    mesh->position(0.5f, -0.5f, 0.0f);
    mesh->textureCoord(1.0f, 1.0f);
    mesh->position(0.5f, 0.5f, 0.0f);
    mesh->textureCoord(1.0f, 0.0f);
    mesh->position(-0.5f, -0.5f, 0.0f);
    mesh->textureCoord(0.0f, 1.0f);
    mesh->position(-0.5f, 0.5f, 0.0f);
    mesh->textureCoord(0.0f, 0.0f);
    for (unsigned int i = 0; i < 4; ++i)
      mesh->index(i);
    mesh->end();
    mesh->finalize();
    return mesh;
  }

  std::unique_ptr<Vexel::Texture> SolidTexture(const Rgba& color, int size = 2) {
    std::vector<unsigned char> pixels;
    for (int i = 0; i < size * size; ++i) {
      for (int c = 0; c < 4; ++c)
        pixels.push_back(static_cast<unsigned char>(color[c]));
    }
    auto texture = std::make_unique<Vexel::Texture>(kit_->getResourceManager(), "Solid",
                                                    Vexel::Texture::TYPE_2D, false);
    texture->setImage(pixels.data(), size, size, Vexel::Texture::PIXEL_FORMAT_RGBA8);
    return texture;
  }

  std::unique_ptr<Vexel::Material> QuadMaterial(Vexel::Texture* texture) {
    auto material = std::make_unique<Vexel::Material>(kit_->getResourceManager());
    material->setShader(Vexel::Material::SHADER_VERTEX, "QuadVertex", kQuadVertex);
    material->setShader(Vexel::Material::SHADER_FRAGMENT, "QuadFragment", kQuadFragment);
    material->setShaderSampler(Vexel::Material::SHADER_FRAGMENT, "diffuseMap", texture);
    material->setShaderAutoUniform(Vexel::Material::SHADER_VERTEX, "worldViewProj",
                                   Vexel::Material::AUTO_UNIFORM_WORLD_VIEW_PROJECTION_MATRIX);
    return material;
  }

  const int width_;
  const int height_;
  ANativeWindow* window_ = nullptr;
  std::unique_ptr<Vexel::Kit> kit_;
  std::unique_ptr<Vexel::AndroidSurfaceRenderer> renderer_;
  std::unique_ptr<Vexel::Scene> scene_;
  std::unique_ptr<Vexel::Camera> camera_;
};

}  // namespace vexel_test
