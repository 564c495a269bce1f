#include <gtest/gtest.h>

#include <cmath>

#include "common/log.h"
#include "recording_scene.h"
#include "renderer/text_fitting.h"

namespace ocr_ar::testing {
namespace {

using vexel_recording::MeshOf;
using vexel_recording::UniformsOf;
using SceneObjectsTest = RecordingScene;
using UV = std::vector<Vexel::Vector2>;

TEST_F(SceneObjectsTest, PatchTexturesAreNumberedBySerialNeverReset) {
  SceneHandler& handler = Handler();
  InpaintedRectObject a = handler.CreateInpaintedRectObject(3, pixels_.data(), 8, 6);
  InpaintedRectObject b = handler.CreateInpaintedRectObject(4, nullptr, 8, 6);
  EXPECT_EQ(a.texture->getName(), "InpaintedTexture0");
  EXPECT_EQ(b.texture->getName(), "InpaintedTexture1");
  EXPECT_EQ(b.id, 4);  // without pixels: no image, the id as given
  EXPECT_EQ(CountEntries("Texture.setImage*"), 1);
  handler.DeleteInpaintedRectObject(a);
  handler.DeleteInpaintedRectObject(b);

  // A new size: a new texture with the next number and a new object; the
  // old object leaves the scene.
  InpaintedRectObject c = handler.CreateInpaintedRectObject(5, pixels_.data(), 8, 6);
  Vexel::EmptyNode slot;
  slot.addChild(c.object.get());
  const std::vector<unsigned char> larger(10 * 6 * 4, 1);
  handler.UpdateOrCreateInpaintedRectObject(c, 5, larger.data(), 10, 6);
  EXPECT_EQ(CountEntries("Texture.setImage InpaintedTexture3 10 6 8"), 1);
  EXPECT_EQ(slot.getChildCount(), 0u);
  for (const char* type : {"Texture", "Object", "Material"})
    EXPECT_EQ(LiveCount(type), 1) << type;
  handler.DeleteInpaintedRectObject(c);
}

TEST_F(SceneObjectsTest, PatchesShareTheUnitSquareAndFadeThroughThePatchShaders) {
  InpaintedRectObject a = Handler().CreateInpaintedRectObject(1, nullptr, 8, 6);
  InpaintedRectObject b = Handler().CreateInpaintedRectObject(2, nullptr, 8, 6);
  EXPECT_EQ(CountEntries("Mesh InpaintedRectMesh"), 1);
  EXPECT_EQ(&MeshOf(*a.object), &MeshOf(*b.object));
  const std::vector<Vexel::Vector3> positions = {
      {0.5f, -0.5f, 0.0f}, {0.5f, 0.5f, 0.0f}, {-0.5f, -0.5f, 0.0f}, {-0.5f, 0.5f, 0.0f}};
  EXPECT_EQ(MeshOf(*a.object).positions, positions);
  EXPECT_EQ(MeshOf(*a.object).uvs, (UV{{1, 1}, {1, 0}, {0, 1}, {0, 0}}));
  for (const std::string entry :
       {"Material.setShader 0 InpaintedRectVertexShader #version 100\n attribute vec4 vertex; "
        "attribute vec2 uv0; uniform mat4 worldViewProj; varying vec2 uv; void main(void) { uv "
        "= uv0; gl_Position = worldViewProj * vertex; }",
        "Material.setShader 1 InpaintedRectFragmentShader #version 100\n precision mediump "
        "float; precision mediump int; varying vec2 uv; uniform sampler2D texture0; uniform "
        "vec3 colorScale; uniform vec3 colorShift; void main(void) { vec4 col = "
        "texture2D(texture0, uv); gl_FragColor = vec4(col.rgb * colorScale + "
        "vec3(colorShift/255.0), col.a); vec2 uvCentered = abs((uv * vec2(2.0, 2.0)) - "
        "vec2(1.0, 1.0)); float maxUVDist = max(uvCentered.x * uvCentered.x * uvCentered.x, "
        "uvCentered.y * uvCentered.y); const float minAlpha = 0.8; gl_FragColor *= vec4(1, 1, "
        "1, (1.0 - maxUVDist) + minAlpha); }",
        "Material.setBlendMode 0", "Material.setDepthWriteEnabled false"}) {
    EXPECT_EQ(CountEntries(entry), 2) << entry;
  }
}

TEST_F(SceneObjectsTest, BackgroundQuadShowsTheImageTurnedByTheRotationBehindTheTexts) {
  Draw(0, "eins");
  Draw(1, "zwei");
  Journal().clear();
  const std::pair<int, UV> cases[] = {
      {0, {{1, 1}, {1, 0}, {0, 1}, {0, 0}}},   {90, {{0, 1}, {1, 1}, {0, 0}, {1, 0}}},
      {180, {{0, 0}, {0, 1}, {1, 0}, {1, 1}}}, {270, {{1, 0}, {0, 0}, {1, 1}, {0, 1}}},
      {45, {{1, 0}, {0, 0}, {1, 1}, {0, 1}}},  // any other: as 270
  };
  for (const auto& [rotation, uvs] : cases) {
    Handler().CreateBackground(320, 180, rotation, -1.0f, 0.75f, 1.0f, -0.75f);
    EXPECT_EQ(MeshOf(*Handler().GetBackgroundObject()).uvs, uvs) << rotation;
  }
  for (const std::string entry :
       {"Mesh BackgroundRectMesh", "Texture RenderTexture",
        "Material.setShader 0 BackgroundImageVertShader #version 100\n attribute vec4 "
        "position; attribute vec2 uv0; uniform mat4 worldViewProj; varying vec2 oUv0; void "
        "main() { gl_Position = worldViewProj * position; oUv0 = uv0; }",
        "Material.setShader 1 BackgroundImageFragShader #version 100\n precision mediump int; "
        "precision mediump float; uniform sampler2D diffuseMap; varying vec2 oUv0; void main() "
        "{ gl_FragColor = texture2D(diffuseMap, oUv0); }"}) {
    EXPECT_EQ(CountEntries(entry), 5) << entry;
  }
  // Every rebuild replaced the old parts and attached the new quad before
  // the text slots, which write no depth and must draw after it.
  EXPECT_EQ(LiveCount("Mesh"), 2);  // with the patches' shared one
  EXPECT_EQ(Root()->getChildCount(), 4u);
  EXPECT_EQ(Root()->getChild(1), Handler().GetBackgroundObject());
  EXPECT_EQ(Root()->getChild(2), Slot(0));
  EXPECT_EQ(Root()->getChild(3), Slot(1));
}

TEST_F(SceneObjectsTest, BackgroundTakesFramesOfItsSizeOnly) {
  Handler().CreateBackground(4, 2, 0, -1, 1, 1, -1);
  ocr::log::ScopedCapture log;
  Handler().UpdateBackgroundImage(pixels_.data(), 4, 2);
  Handler().UpdateBackgroundImage(pixels_.data(), 2, 4);
  Handler().UpdateBackgroundImage(nullptr, 4, 2);
  EXPECT_EQ(CountEntries("Texture.setImage*"), 1);
  EXPECT_EQ(CountEntries("Texture.setImage RenderTexture 4 2 8"), 1);
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

TEST_F(SceneObjectsTest, ATextFitsItsRectangleCentredOnIt) {
  const PositionScaleAngle place{100.0f, -40.0f, 300.0f, 30.0f, 30.0f};
  Handler().DrawTextObject(0, "Notausgang links", place, Color(), 1, nullptr, nullptr, nullptr, 0,
                           0, place);
  const Vexel::Text& text = *Current("Notausgang links").text;
  const float scale = text.getScale().x;
  EXPECT_EQ(text.getScale().y, scale);
  EXPECT_LE(text.getBoundingBox().width() * scale, 300.0f * text_fit::kWidthFill + 1e-3f);
  // The line ink box (0.9 em, which holds the glyphs' ink), not the line
  // box, fills the height, and its centre (0, -0.65 em) turned by 30 degrees
  // lands on the rectangle's centre.
  EXPECT_NEAR(0.9f * scale, 30.0f * text_fit::kHeightFill, 1e-3f);
  const float radians = 30.0f * 3.14159265f / 180.0f;
  EXPECT_NEAR(text.getPosition().x + 0.65f * scale * std::sin(radians), 100.0f, 1e-3f);
  EXPECT_NEAR(text.getPosition().y - 0.65f * scale * std::cos(radians), -40.0f, 1e-3f);
}

TEST(TextFitting, TheFittedBoxIsTheLineInkBoxGrownToHoldTheGlyphsInk) {
  const Vexel::Rect bounds(-2.0f, 0.0f, 2.0f, -1.2f);
  // An accent above the capitals: the box grows upwards, keeping the
  // room for descenders.
  EXPECT_EQ(text_fit::FittedBox(bounds, {-2.0f, -0.2f, 2.0f, -1.0f}, {-1.9f, -0.1f, 1.9f, -0.8f}),
            Vexel::Rect(-2.0f, -0.1f, 2.0f, -1.0f));
  // Spaces alone: the line ink box has no width, its height still counts.
  EXPECT_EQ(text_fit::FittedBox(bounds, {0.0f, -0.2f, 0.0f, -1.0f}, {}),
            Vexel::Rect(-2.0f, -0.2f, 2.0f, -1.0f));
  EXPECT_EQ(text_fit::FittedBox(bounds, {}, {-1.0f, -0.3f, 1.0f, -0.9f}),
            Vexel::Rect(-2.0f, -0.3f, 2.0f, -0.9f));
  EXPECT_EQ(text_fit::FittedBox(bounds, {}, {}), bounds);
}

TEST_F(SceneObjectsTest, IdenticalTextsAreReusedAndTheirPatchesUploadedOnlyOnANewId) {
  Draw(0, "Exit", 4, true);
  Draw(1, "Exit", 5, true);  // a second object with the same text
  Draw(2, "Ende");
  Handler().UpdateTextObjectCache();
  EXPECT_EQ(Cached("Exit"), 2u);
  // Of the two, the one whose patch holds the id is taken: no upload.
  Handler().DrawTextObject(3, "Exit", {}, Color::FromPacked(static_cast<std::int32_t>(0xFF0000FFu)),
                           5, pixels_.data(), nullptr, nullptr, 8, 6, {});
  const InpaintedTextObject& again = Current("Exit");
  EXPECT_EQ(again.patch.texture->getName(), "InpaintedTexture1");
  EXPECT_EQ(again.slot_index, 3u);
  EXPECT_EQ(again.text->getColor(), Vexel::Color(1, 0, 0, 1));
  EXPECT_EQ(CountEntries("Texture.setImage*"), 2);
  // The other one, with a new id: uploaded into its texture again.
  Draw(0, "Exit", 6, true);
  EXPECT_EQ(CountEntries("Texture.setImage InpaintedTexture0 8 6 8"), 2);
  EXPECT_EQ(CountEntries("Text"), 3);

  // The slot of an undrawn text leaves the scene; the text stays cached.
  Handler().ClearTextObjects(1, false);
  EXPECT_EQ(Slot(0)->getParent(), Root());
  EXPECT_EQ(Slot(2)->getParent(), nullptr);
  const InpaintedTextObject& cached = Handler().GetReusableTextCache().at("Ende").front();
  EXPECT_EQ(Handler().GetUnusedFrameCount(cached.text.get()), 1);
}

}  // namespace
}  // namespace ocr_ar::testing
