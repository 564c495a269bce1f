#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "headless_scene.h"

namespace vexel_test {
namespace {

using Vexel::Kit;

class KitLifetimes : public HeadlessScene {};

TEST_F(KitLifetimes, KitsAndRenderersReplacedInAnyOrderKeepDrawingTheResources) {
  {
    Kit newer(nullptr, "");
    EXPECT_EQ(Kit::getCurrent(), &newer);
  }
  EXPECT_EQ(Kit::getCurrent(), kit_.get());  // the newest live kit is current again
  renderer_.reset();
  kit_->drawAll();  // no renderer left: nothing to draw
  // Made while no renderer (and so no device) exists: the next one draws them.
  auto texture = SolidTexture({255, 0, 255, 255});
  auto material = QuadMaterial(texture.get());
  auto quad = AddQuad(material.get(), 8, 8);
  renderer_ = std::make_unique<Vexel::AndroidSurfaceRenderer>(*kit_, window_,
                                                              Vexel::Renderer::ANTI_ALIASING_NONE);
  renderer_->setScene(scene_.get());
  EXPECT_PIXEL(Draw(), 32, 24, {255, 0, 255, 255});

  // The order in which the renderer rebuilds on a new window: kit first,
  // then the renderer, then the scene, each replacing (and destroying) the
  // old one.
  kit_ = std::make_unique<Kit>(nullptr, "");
  EXPECT_EQ(Kit::getCurrent(), kit_.get());
  renderer_ = std::make_unique<Vexel::AndroidSurfaceRenderer>(*kit_, window_,
                                                              Vexel::Renderer::ANTI_ALIASING_NONE);
  scene_ = std::make_unique<Vexel::Scene>(*kit_);
  EXPECT_EQ(camera_->getParent(), nullptr);  // the old root let go of it
  EXPECT_EQ(quad->getParent(), nullptr);
  camera_->setParent(scene_->getRootNode());
  quad->setParent(scene_->getRootNode());
  renderer_->setScene(scene_.get());
  EXPECT_PIXEL(Draw(), 32, 24, {255, 0, 255, 255});  // resources of the old kit

  // The renderer outlives its kit and still draws through the shared state.
  const std::size_t presented = platform::desktop::PresentedFrameCount(window_);
  kit_.reset();
  renderer_->draw();
  EXPECT_EQ(platform::desktop::PresentedFrameCount(window_), presented + 1);
  EXPECT_PIXEL((Frame{kWidth, kHeight, platform::desktop::ReadFrame(window_)}), 32, 24,
               {255, 0, 255, 255});
}

TEST_F(KitLifetimes, DestroyingNodesAndScenesDetachesWhatHangsOnThem) {
  auto group = std::make_unique<Vexel::EmptyNode>();
  Vexel::EmptyNode child;
  group->setParent(scene_->getRootNode());
  group->addChild(&child);
  EXPECT_EQ(scene_->getRootNode()->getChildCount(), 2u);  // camera and group
  group.reset();
  EXPECT_EQ(child.getParent(), nullptr);
  EXPECT_EQ(scene_->getRootNode()->getChildCount(), 1u);

  child.setParent(scene_->getRootNode());
  scene_.reset();
  EXPECT_EQ(child.getParent(), nullptr);
  EXPECT_EQ(renderer_->getScene(), nullptr);
  EXPECT_PIXEL(Draw(), 0, 0, {0, 0, 0, 0});  // no scene: transparent black
}

TEST_F(KitLifetimes, ResourcesDestroyedBeforeTheirUsersLeaveNothingDangling) {
  auto texture = SolidTexture({0, 0, 255, 255});
  auto material = QuadMaterial(texture.get());
  auto quad = AddQuad(material.get(), 8, 8);

  quad_mesh_.reset();  // the object keeps the geometry
  EXPECT_PIXEL(Draw(), 32, 24, {0, 0, 255, 255});
  texture.reset();  // the sampler reads an unbound unit: black, opaque
  EXPECT_PIXEL(Draw(), 32, 24, {0, 0, 0, 255});
  material.reset();
  EXPECT_EQ(quad->getMaterial(0), nullptr);
  EXPECT_EQ(quad->getMaterial(7), nullptr);  // no such slot
  Draw();
  quad.reset();
}

TEST_F(KitLifetimes, ThousandCreateDestroyCyclesLeakNoGpuObjects) {
  const std::size_t before = Kit::getLiveGpuObjectCount();
  {
    Vexel::Font font("DejaVuSans.ttf", Vexel::Font::FILE_TYPE_SYSTEM, true);
    {
      // The font's glyph page comes to the device with its first drawn text
      // and stays with the font.
      Vexel::Text warm_up;
      warm_up.setFont(font);
      warm_up.setText("Cycle 0123456789");
      warm_up.setParent(scene_->getRootNode());
      Draw();
    }
    const std::size_t baseline = Kit::getLiveGpuObjectCount();
    EXPECT_GT(baseline, before);
    {
      auto texture = SolidTexture({1, 2, 3, 4});
      EXPECT_EQ(Kit::getLiveGpuObjectCount(), baseline + 1);
    }
    EXPECT_EQ(Kit::getLiveGpuObjectCount(), baseline);

    for (int cycle = 0; cycle < 1000; ++cycle) {
      auto texture = SolidTexture({255, 255, 255, 255});
      auto material = QuadMaterial(texture.get());
      auto quad = AddQuad(material.get(), 1, 1);
      quad_mesh_.reset();  // a mesh of its own each cycle
      Vexel::Text text;
      text.setFont(font);
      text.setText("Cycle " + std::to_string(cycle % 10));
      text.initialize();
      text.setParent(scene_->getRootNode());
      if (cycle % 50 == 0)
        Draw();
    }
    EXPECT_EQ(Kit::getLiveGpuObjectCount(), baseline);

    for (int cycle = 0; cycle < 20; ++cycle) {
      ANativeWindow* window = platform::desktop::CreateOffscreenWindow(32, 16);
      Kit kit(nullptr, "");
      Vexel::AndroidSurfaceRenderer renderer(kit, window, Vexel::Renderer::ANTI_ALIASING_NONE);
      Vexel::Scene scene(kit);
      Vexel::Camera camera;
      camera.setParent(scene.getRootNode());
      renderer.setScene(&scene);
      kit.drawAll();
      ANativeWindow_release(window);
    }
    EXPECT_EQ(Kit::getLiveGpuObjectCount(), baseline);
  }
  EXPECT_EQ(Kit::getLiveGpuObjectCount(), before);  // the glyph page went with the font
}

TEST(KitLog, ABareLogNameGoesToTheKitLogDirectory) {
  const std::string directory = ::testing::TempDir() + "vexel-log-test";
  ASSERT_EQ(setenv("VEXEL_LOG_DIR", directory.c_str(), 1), 0);
  {
    Vexel::Kit kit(nullptr, "Vexel.log");
    EXPECT_EQ(kit.getLogFilePath(), directory + "/Vexel.log");
  }
  unsetenv("VEXEL_LOG_DIR");
  std::ifstream log(directory + "/Vexel.log");
  std::string first_line;
  std::getline(log, first_line);
  EXPECT_NE(first_line.find(" I Vexel: kit created"), std::string::npos) << first_line;
  log.close();
  std::filesystem::remove_all(directory);
}

}  // namespace
}  // namespace vexel_test
