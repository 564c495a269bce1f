// One frame of the overlay as the renderer builds it, drawn headless: a
// 1280x720 camera image, 20 inpainted patches and 20 translated strings of
// 20 to 40 characters; and the layout of those strings alone.
#include <benchmark/benchmark.h>

#include <memory>
#include <random>
#include <string>
#include <vector>

#include "platform/desktop.h"
#include "scene_parts.h"
#include "vexel/Vexel.h"

namespace {

constexpr int kWidth = 1280;
constexpr int kHeight = 720;
constexpr int kItems = 20;

// 20 strings of 20 to 40 characters from a seeded generator.
std::vector<std::string> Strings() {
  static const char* const words[] = {"menu",   "station",  "exit",   "bus",    "ticket", "open",
                                      "daily",  "until",    "price",  "street", "north",  "gate",
                                      "coffee", "platform", "closed", "Sunday", "left",   "hotel"};
  std::mt19937 random(42);
  std::vector<std::string> strings;
  for (int i = 0; i < kItems; ++i) {
    std::uniform_int_distribution<std::size_t> length(20, 40);
    const std::size_t target = length(random);
    std::string text;
    while (text.size() < target) {
      if (!text.empty())
        text += ' ';
      text += words[random() % (sizeof(words) / sizeof(words[0]))];
    }
    strings.push_back(text.substr(0, target));
  }
  return strings;
}

std::vector<unsigned char> Image(int width, int height, unsigned seed) {
  std::vector<unsigned char> pixels(static_cast<std::size_t>(width) * height * 4);
  std::mt19937 random(seed);
  for (auto& p : pixels)
    p = static_cast<unsigned char>(random());
  return pixels;
}

// The renderer's scene: background quad, then per item a patch and its text.
class OverlayScene {
 public:
  explicit OverlayScene(int items)
      : window_(platform::desktop::CreateOffscreenWindow(kWidth, kHeight)),
        kit_(std::make_unique<Vexel::Kit>(nullptr, "")),
        renderer_(std::make_unique<Vexel::AndroidSurfaceRenderer>(
            *kit_, window_, Vexel::Renderer::ANTI_ALIASING_NONE)),
        scene_(std::make_unique<Vexel::Scene>(*kit_)),
        font_(std::make_unique<Vexel::Font>("NotoSansCJK-Regular.ttc",
                                            Vexel::Font::FILE_TYPE_SYSTEM, true)),
        mesh_(vexel_test::UnitQuad("InpaintedRectMesh")),
        camera_image_(Image(kWidth, kHeight, 1)) {
    auto& resources = kit_->getResourceManager();
    camera_.setParent(scene_->getRootNode());
    camera_.setProjectionMode(Vexel::PROJECTION_ORTHOGRAPHIC);
    camera_.setOrthographicWindowSize(kWidth, kHeight);
    camera_.setAutomaticAspectRatio(false);
    renderer_->setScene(scene_.get());

    background_texture_ = std::make_unique<Vexel::Texture>(resources, "RenderTexture",
                                                           Vexel::Texture::TYPE_2D, false);
    background_texture_->setImage(camera_image_.data(), kWidth, kHeight,
                                  Vexel::Texture::PIXEL_FORMAT_RGBA8);
    background_material_ = vexel_test::QuadMaterial(resources, background_texture_.get());
    background_ = std::make_unique<Vexel::Object>(*mesh_);
    background_->setMaterial(0, background_material_.get());
    background_->setScale(kWidth, kHeight, 1);
    background_->setPosition(0, 0, -100);
    background_->setParent(scene_->getRootNode());

    const std::vector<std::string> strings = Strings();
    for (int i = 0; i < items; ++i) {
      Item item;
      const float x = -500.0f + 520.0f * static_cast<float>(i % 2);
      const float y = 320.0f - 32.0f * static_cast<float>(i);
      item.slot = std::make_unique<Vexel::EmptyNode>();
      item.slot->setParent(scene_->getRootNode());
      item.slot->setPosition(x, y, -50);
      const std::vector<unsigned char> patch = Image(240, 40, 100 + i);
      item.texture = std::make_unique<Vexel::Texture>(
          resources, ("InpaintedTexture" + std::to_string(i)).c_str(), Vexel::Texture::TYPE_2D,
          false);
      item.texture->setImage(patch.data(), 240, 40, Vexel::Texture::PIXEL_FORMAT_RGBA8);
      item.material = vexel_test::PatchMaterial(resources, item.texture.get(),
                                                Vexel::Vector3(1, 1, 1), Vexel::Vector3(0, 0, 0));
      item.material->setBlendMode(Vexel::Material::BLEND_ALPHA);
      item.material->setDepthWriteEnabled(false);
      item.patch = std::make_unique<Vexel::Object>(*mesh_);
      item.patch->setMaterial(0, item.material.get());
      item.patch->setScale(480, 30, 1);
      item.patch->setParent(item.slot.get());
      item.text = std::make_unique<Vexel::Text>();
      item.text->setFont(*font_);
      item.text->setText(strings[static_cast<std::size_t>(i)]);
      item.text->setHorizontalAlignment(Vexel::Text::ALIGN_CENTER);
      item.text->initialize();
      item.text->setColor(Vexel::Color(0.1f, 0.1f, 0.1f, 1));
      const Vexel::Rect box = item.text->getBoundingBox();
      const float scale = 24.0f / box.height();
      item.text->setScale(scale, scale, 1);
      item.text->setPosition(-scale * (box.left + box.right) / 2,
                             -scale * (box.top + box.bottom) / 2, 0);
      item.text->setParent(item.slot.get());
      items_.push_back(std::move(item));
    }
  }

  ~OverlayScene() {
    items_.clear();
    background_.reset();
    background_material_.reset();
    background_texture_.reset();
    camera_.setParent(nullptr);
    scene_.reset();
    renderer_.reset();
    kit_.reset();
    ANativeWindow_release(window_);
  }

  void UploadCameraImage() {
    background_texture_->setImage(camera_image_.data(), kWidth, kHeight,
                                  Vexel::Texture::PIXEL_FORMAT_RGBA8);
  }
  void Draw() { kit_->drawAll(); }

 private:
  struct Item {
    std::unique_ptr<Vexel::EmptyNode> slot;
    std::unique_ptr<Vexel::Texture> texture;
    std::unique_ptr<Vexel::Material> material;
    std::unique_ptr<Vexel::Object> patch;
    std::unique_ptr<Vexel::Text> text;
  };

  ANativeWindow* window_;
  std::unique_ptr<Vexel::Kit> kit_;
  std::unique_ptr<Vexel::AndroidSurfaceRenderer> renderer_;
  std::unique_ptr<Vexel::Scene> scene_;
  std::unique_ptr<Vexel::Font> font_;
  std::unique_ptr<Vexel::Mesh> mesh_;
  std::vector<unsigned char> camera_image_;
  Vexel::Camera camera_;
  std::unique_ptr<Vexel::Texture> background_texture_;
  std::unique_ptr<Vexel::Material> background_material_;
  std::unique_ptr<Vexel::Object> background_;
  std::vector<Item> items_;
};

// Draw and present (on Linux the read-back into the desktop window), with
// 20 patches and texts, and with the background alone for comparison.
void BM_OverlayFrame(benchmark::State& state) {
  OverlayScene scene(static_cast<int>(state.range(0)));
  scene.Draw();
  for (auto _ : state)
    scene.Draw();
}
BENCHMARK(BM_OverlayFrame)->Arg(kItems)->Arg(0)->Unit(benchmark::kMillisecond)->UseRealTime();

// As the renderer runs per camera frame: upload the new image, then draw.
void BM_OverlayFrameWithCameraUpload(benchmark::State& state) {
  OverlayScene scene(kItems);
  scene.Draw();
  for (auto _ : state) {
    scene.UploadCameraImage();
    scene.Draw();
  }
}
BENCHMARK(BM_OverlayFrameWithCameraUpload)->Unit(benchmark::kMillisecond)->UseRealTime();

// Shaping, bidi ordering and line placement of the 20 strings (glyphs
// already rasterised by the first pass).
void BM_TextLayout(benchmark::State& state) {
  Vexel::Kit kit(nullptr, "");
  Vexel::Font font("NotoSansCJK-Regular.ttc", Vexel::Font::FILE_TYPE_SYSTEM, true);
  const std::vector<std::string> strings = Strings();
  std::vector<std::unique_ptr<Vexel::Text>> texts;
  for (const std::string& s : strings) {
    texts.push_back(std::make_unique<Vexel::Text>());
    texts.back()->setFont(font);
    texts.back()->setText(s);
    texts.back()->initialize();
  }
  for (auto _ : state) {
    for (std::size_t i = 0; i < texts.size(); ++i) {
      texts[i]->setText(strings[i]);
      texts[i]->initialize();
    }
    benchmark::DoNotOptimize(texts.back()->getBoundingBox());
  }
  state.SetItemsProcessed(state.iterations() * kItems);
}
BENCHMARK(BM_TextLayout)->Unit(benchmark::kMicrosecond);

// First layout of CJK strings whose glyphs are not yet in the atlas:
// includes distance-field rasterisation.
void BM_TextLayoutWithNewGlyphs(benchmark::State& state) {
  Vexel::Kit kit(nullptr, "");
  const std::string ideographs = "日本語中文字幕翻訳駅出口時刻表営業中本日休業切符売場";
  for (auto _ : state) {
    state.PauseTiming();
    auto text = std::make_unique<Vexel::Text>();
    {
      // The face goes with the text: a fresh atlas each time.
      Vexel::Font font("NotoSansCJK-Regular.ttc", Vexel::Font::FILE_TYPE_SYSTEM, true);
      text->setFont(font);
    }
    text->setText(ideographs);
    state.ResumeTiming();
    text->initialize();
    state.PauseTiming();
    text.reset();
    state.ResumeTiming();
  }
  state.SetItemsProcessed(state.iterations() * 26);
}
BENCHMARK(BM_TextLayoutWithNewGlyphs)->Unit(benchmark::kMillisecond)->Iterations(5);

}  // namespace
