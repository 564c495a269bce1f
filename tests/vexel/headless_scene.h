#pragma once

#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <string>
#include <vector>

#include "platform/desktop.h"
#include "scene_parts.h"

namespace vexel_test {

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

inline ::testing::AssertionResult PixelNear(const Frame& frame, int x, int y,
                                            const Rgba& expected) {
  if (Near(frame.At(x, y), expected))
    return ::testing::AssertionSuccess();
  return ::testing::AssertionFailure()
         << "pixel (" << x << ", " << y << ") is " << ::testing::PrintToString(frame.At(x, y))
         << ", expected " << ::testing::PrintToString(expected);
}

#define EXPECT_PIXEL(frame, x, y, ...) \
  EXPECT_TRUE(::vexel_test::PixelNear((frame), (x), (y), __VA_ARGS__))

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
    quad_mesh_.reset();
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

  std::unique_ptr<Vexel::Texture> SolidTexture(const Rgba& color, int size = 2) {
    std::vector<unsigned char> pixels(static_cast<std::size_t>(size) * size * 4);
    for (std::size_t i = 0; i < pixels.size(); ++i)
      pixels[i] = static_cast<unsigned char>(color[i % 4]);
    auto texture = std::make_unique<Vexel::Texture>(kit_->getResourceManager(), "Solid",
                                                    Vexel::Texture::TYPE_2D, false);
    texture->setImage(pixels.data(), size, size, Vexel::Texture::PIXEL_FORMAT_RGBA8);
    return texture;
  }

  std::unique_ptr<Vexel::Material> QuadMaterial(Vexel::Texture* texture) {
    return vexel_test::QuadMaterial(kit_->getResourceManager(), texture);
  }

  // A width x height quad drawn with `material`, centred on scene (x, y) at
  // kDepth. The shared mesh is made on first use, so a test decides whether
  // it exists before the renderer does.
  std::unique_ptr<Vexel::Object> AddQuad(Vexel::Material* material, float width, float height,
                                         float x = 0, float y = 0) {
    if (!quad_mesh_)
      quad_mesh_ = UnitQuad();
    auto quad = std::make_unique<Vexel::Object>(*quad_mesh_);
    quad->setMaterial(0, material);
    quad->setScale(width, height, 1);
    quad->setPosition(x, y, kDepth);
    quad->setParent(scene_->getRootNode());
    return quad;
  }

  const int width_;
  const int height_;
  ANativeWindow* window_ = nullptr;
  std::unique_ptr<Vexel::Kit> kit_;
  std::unique_ptr<Vexel::AndroidSurfaceRenderer> renderer_;
  std::unique_ptr<Vexel::Scene> scene_;
  std::unique_ptr<Vexel::Camera> camera_;
  std::unique_ptr<Vexel::Mesh> quad_mesh_;
};

}  // namespace vexel_test
