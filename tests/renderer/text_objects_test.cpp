#include <gtest/gtest.h>

#include <cmath>
#include <vector>

#include "common/log.h"
#include "recording_scene.h"
#include "renderer/shader_sources.h"
#include "renderer/text_fitting.h"

namespace ocr_ar {
namespace {

using testing::RecordingScene;
using vexel_recording::CountEntries;
using vexel_recording::LiveCount;
using vexel_recording::NodeState;
using vexel_recording::StateOf;

class TextObjectsTest : public RecordingScene {
 protected:
  const InpaintedTextObject& CurrentObject(const std::string& text, std::size_t n = 0) {
    auto it = Handler().GetCurrentTextCache().at(text).begin();
    std::advance(it, n);
    return *it;
  }
  std::vector<unsigned char> pixels_ = std::vector<unsigned char>(8 * 6 * 4, 128);
};

TEST_F(TextObjectsTest, NewTextIsBuiltCentredWithItsPatchUnderIt) {
  SceneHandler& handler = Handler();
  const double scale[3] = {1.5, 1.0, 0.5};
  const double shift[3] = {10, 20, 30};
  const PositionScaleAngle text_place{-50.0f, 30.0f, 200.0f, 40.0f, 15.0f};
  const PositionScaleAngle patch_place{-50.0f, 30.0f, 210.0f, 42.0f, 15.0f};
  handler.DrawTextObject(2, "Notausgang", text_place,
                         Color::FromPacked(static_cast<std::int32_t>(0xFF336699u)), 7,
                         pixels_.data(), scale, shift, 8, 6, patch_place);

  const InpaintedTextObject& object = CurrentObject("Notausgang");
  EXPECT_EQ(object.slot_index, 2u);
  const auto& text = NodeState(*object.text);
  EXPECT_EQ(text.text, "Notausgang");
  EXPECT_TRUE(text.normalized);
  EXPECT_TRUE(text.initialized);
  EXPECT_EQ(text.alignment, Vexel::Text::ALIGN_CENTER);
  EXPECT_TRUE(text.container.isEmpty());
  EXPECT_EQ(text.color, Vexel::Color::fromBytes(0x99, 0x66, 0x33, 0xFF));
  EXPECT_EQ(text.rotation, 15.0f);
  EXPECT_EQ(text.position.z, -SceneHandler::kOverlayDepth);

  // Slot 2 (with 0 and 1 made empty) under the root: patch first, then text.
  ASSERT_EQ(handler.GetTextNodes().size(), 3u);
  Vexel::EmptyNode& slot = *handler.GetTextNodes()[2];
  EXPECT_EQ(slot.getParent(), Root(handler));
  ASSERT_EQ(slot.getChildCount(), 2u);
  EXPECT_EQ(slot.getChild(0), object.patch.object.get());
  EXPECT_EQ(slot.getChild(1), object.text.get());
  EXPECT_EQ(handler.GetTextNodes()[0]->getParent(), nullptr);

  const auto& patch = NodeState(*object.patch.object);
  EXPECT_EQ(patch.position, Vexel::Vector3(-50.0f, 30.0f, -SceneHandler::kOverlayDepth));
  EXPECT_EQ(patch.scale, Vexel::Vector3(210.0f, 42.0f, 1.0f));
  EXPECT_EQ(patch.rotation, 15.0f);
  const auto& material = StateOf(*object.patch.object->getMaterial(0));
  EXPECT_EQ(material.vector_uniforms.at("colorScale").second, Vexel::Vector3(1.5f, 1.0f, 0.5f));
  EXPECT_EQ(material.vector_uniforms.at("colorScale").first, 1);
  EXPECT_EQ(material.vector_uniforms.at("colorShift").second, Vexel::Vector3(10, 20, 30));
  EXPECT_EQ(handler.GetUnusedFrameCount(object.text.get()), 0);
}

TEST_F(TextObjectsTest, PatchWithoutCorrectionGetsIdentityUniforms) {
  Draw(0, "Exit", 1, pixels_.data(), 8, 6);
  const auto& material = StateOf(*CurrentObject("Exit").patch.object->getMaterial(0));
  EXPECT_EQ(material.vector_uniforms.at("colorScale").second, Vexel::Vector3(1, 1, 1));
  EXPECT_EQ(material.vector_uniforms.at("colorShift").second, Vexel::Vector3(0, 0, 0));
}

TEST_F(TextObjectsTest, TextFitsItsRectangleCentredOnIt) {
  const PositionScaleAngle place{100.0f, -40.0f, 300.0f, 30.0f, 30.0f};
  Handler().DrawTextObject(0, "Notausgang links", place, Color(), 1, nullptr, nullptr, nullptr, 0,
                           0, place);
  const auto& text = NodeState(*CurrentObject("Notausgang links").text);
  // The recording kit measures 16 code points x 0.5 em by 1.2 em.
  const float scale = text.scale.x;
  EXPECT_EQ(text.scale.y, scale);
  EXPECT_LE(8.0f * scale, 300.0f * text_fit::kWidthFill + 1e-3f);
  EXPECT_LE(1.2f * scale, 30.0f * text_fit::kHeightFill + 1e-3f);
  EXPECT_NEAR(1.2f * scale, 30.0f * text_fit::kHeightFill, 1e-3f);  // height decides
  // The bounds' centre (0, -0.6 em) turned by 30 degrees lands on the
  // rectangle's centre.
  const float radians = 30.0f * 3.14159265f / 180.0f;
  const float cx = text.position.x + 0.6f * scale * std::sin(radians);
  const float cy = text.position.y - 0.6f * scale * std::cos(radians);
  EXPECT_NEAR(cx, 100.0f, 1e-3f);
  EXPECT_NEAR(cy, -40.0f, 1e-3f);
}

TEST_F(TextObjectsTest, ShortTextInAWideBoxIsLetterSpaced) {
  const PositionScaleAngle place{0.0f, 0.0f, 400.0f, 40.0f, 0.0f};
  Handler().DrawTextObject(0, "Exit", place, Color(), 1, nullptr, nullptr, nullptr, 0, 0, place);
  const auto& text = NodeState(*CurrentObject("Exit").text);
  EXPECT_FLOAT_EQ(text.extra_spacing, text_fit::kMaxExtraSpacing);
  const float width = (2.0f + 3 * text.extra_spacing) * text.scale.x;
  EXPECT_LE(width, 400.0f * text_fit::kWidthFill);
}

TEST_F(TextObjectsTest, SmallRectangleChangesDoNotLayTheTextOutAgain) {
  PositionScaleAngle place{0.0f, 0.0f, 160.0f, 40.0f, 0.0f};
  Handler().DrawTextObject(0, "Exit", place, Color(), 1, nullptr, nullptr, nullptr, 0, 0, place);
  const auto& text = NodeState(*CurrentObject("Exit").text);
  const int layouts = text.layout_count;
  for (int frame = 0; frame < 5; ++frame) {
    Handler().UpdateTextObjectCache();
    place.scale_x += 0.3f;  // a tracked rectangle jitters
    Handler().DrawTextObject(0, "Exit", place, Color(), 1, nullptr, nullptr, nullptr, 0, 0, place);
    Handler().ClearTextObjects(1, false);
  }
  EXPECT_EQ(text.layout_count, layouts);
}

TEST_F(TextObjectsTest, IdenticalTextIsReusedWithNewColourAndNoUpload) {
  SceneHandler& handler = Handler();
  Draw(0, "Exit", 4, pixels_.data(), 8, 6);
  const Vexel::Text* first = CurrentObject("Exit").text.get();
  handler.UpdateTextObjectCache();
  handler.DrawTextObject(3, "Exit", {}, Color::FromPacked(static_cast<std::int32_t>(0xFF0000FFu)),
                         4, pixels_.data(), nullptr, nullptr, 8, 6, {});
  const InpaintedTextObject& again = CurrentObject("Exit");
  EXPECT_EQ(again.text.get(), first);
  EXPECT_EQ(again.slot_index, 3u);
  EXPECT_EQ(NodeState(*again.text).color, Vexel::Color(1, 0, 0, 1));
  EXPECT_EQ(CountEntries("Text"), 1);
  EXPECT_EQ(CountEntries("setImage*"), 1);
  EXPECT_TRUE(handler.GetReusableTextCache().empty());
}

TEST_F(TextObjectsTest, AReusedTextWithANewIdUploadsItsPatch) {
  SceneHandler& handler = Handler();
  Draw(0, "Exit", 4, pixels_.data(), 8, 6);
  handler.UpdateTextObjectCache();
  Draw(0, "Exit", 5, pixels_.data(), 8, 6);
  EXPECT_EQ(CountEntries("setImage InpaintedTexture0 8x6"), 2);
  EXPECT_EQ(CurrentObject("Exit").patch.id, 5);
}

TEST_F(TextObjectsTest, OfTwoCachedObjectsTheOneWithTheSameIdIsTaken) {
  SceneHandler& handler = Handler();
  Draw(0, "Exit", 1, pixels_.data(), 8, 6);
  Draw(1, "Exit", 2, pixels_.data(), 8, 6);
  handler.UpdateTextObjectCache();
  Draw(0, "Exit", 2, pixels_.data(), 8, 6);
  EXPECT_EQ(CurrentObject("Exit").patch.texture->getName(), "InpaintedTexture1");
  EXPECT_EQ(CountEntries("setImage*"), 2);  // no new upload
}

TEST_F(TextObjectsTest, ASlotShowsOnlyItsCurrentText) {
  SceneHandler& handler = Handler();
  Draw(0, "eins");
  handler.UpdateTextObjectCache();
  Draw(0, "zwei");
  handler.ClearTextObjects(1, false);
  Vexel::EmptyNode& slot = *handler.GetTextNodes()[0];
  ASSERT_EQ(slot.getChildCount(), 2u);
  EXPECT_EQ(slot.getChild(1), CurrentObject("zwei").text.get());
  // "eins" stays cached for reuse, detached.
  const auto& cached = handler.GetReusableTextCache().at("eins").front();
  EXPECT_EQ(cached.text->getParent(), nullptr);
  EXPECT_EQ(handler.GetUnusedFrameCount(cached.text.get()), 1);
}

TEST_F(TextObjectsTest, SlotsBeyondTheFrameLeaveTheScene) {
  SceneHandler& handler = Handler();
  Draw(0, "eins");
  Draw(1, "zwei");
  Draw(2, "drei");
  handler.UpdateTextObjectCache();
  Draw(0, "eins");
  handler.ClearTextObjects(1, false);
  EXPECT_EQ(handler.GetTextNodes()[0]->getParent(), Root(handler));
  EXPECT_EQ(handler.GetTextNodes()[1]->getParent(), nullptr);
  EXPECT_EQ(handler.GetTextNodes()[2]->getParent(), nullptr);
}

TEST_F(TextObjectsTest, TheBoldCjkFaceDrawsTextsAsGiven) {
  SceneHandler& handler = Handler();
  handler.SetTranslationLanguageFont("ja", "/system/fonts/NotoSansCJK-Bold.ttc");
  handler.SetTranslationLanguage("ja");
  Draw(0, "非常口");
  EXPECT_FALSE(NodeState(*CurrentObject("非常口").text).normalized);
  EXPECT_EQ(NodeState(*CurrentObject("非常口").text).font_reference_character, 0xFF41u);
}

TEST_F(TextObjectsTest, AFailedBuildLeavesNoHalfObjectBehind) {
  SceneHandler& handler = Handler();
  vexel_recording::FailOn("Text.initialize");
  EXPECT_THROW(Draw(0, "Exit"), Vexel::Exception);
  EXPECT_TRUE(handler.GetCurrentTextCache().empty());
  EXPECT_EQ(LiveCount("Text"), 0);
  vexel_recording::ClearFailures();
  Draw(0, "Exit");
  EXPECT_EQ(LiveCount("Text"), 1);
}

TEST_F(TextObjectsTest, DrawingWithoutASceneThrows) {
  EXPECT_THROW(SceneHandler::Instance()->DrawTextObject(0, "x", {}, Color(), -1, nullptr, nullptr,
                                                        nullptr, 0, 0, {}),
               std::logic_error);
}

}  // namespace
}  // namespace ocr_ar
