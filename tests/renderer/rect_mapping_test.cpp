#include "renderer/rect_mapping.h"

#include <gtest/gtest.h>

namespace ocr_ar {
namespace {

constexpr float kTol = 1e-4f;

TEST(FitBackground, KeepsTheImageAspectRatioInsideTheWindow) {
  // 16:9 image in a 4:3 window: bars at top and bottom.
  const BackgroundCorners letterbox = FitBackground(640, 480, 1280, 720);
  EXPECT_FLOAT_EQ(letterbox.left, -1.0f);
  EXPECT_FLOAT_EQ(letterbox.right, 1.0f);
  EXPECT_FLOAT_EQ(letterbox.top, 0.75f);
  EXPECT_FLOAT_EQ(letterbox.bottom, -0.75f);
  // 4:3 image in a 16:9 window: bars on the sides.
  const BackgroundCorners pillarbox = FitBackground(1280, 720, 640, 480);
  EXPECT_FLOAT_EQ(pillarbox.left, -0.75f);
  EXPECT_FLOAT_EQ(pillarbox.right, 0.75f);
  EXPECT_FLOAT_EQ(pillarbox.top, 1.0f);
  EXPECT_FLOAT_EQ(pillarbox.bottom, -1.0f);
  // Same aspect: the whole window, exactly.
  EXPECT_TRUE(FitBackground(1280, 720, 640, 360).FillsWindow());
  EXPECT_TRUE(FitBackground(100, 100, 7, 7).FillsWindow());
}

TEST(FitBackground, LargeSizesDoNotOverflow) {
  const BackgroundCorners c = FitBackground(60000, 40000, 60000, 60000);
  EXPECT_NEAR(c.left, -2.0f / 3.0f, kTol);
  EXPECT_FLOAT_EQ(c.top, 1.0f);
}

TEST(OrientRect, TurnsCentresAndAnglesPerOrientation) {
  const ImageRect rect{100.0, 30.0, 50.0, 10.0, 5.0};
  const double w = 640.0;
  const double h = 480.0;

  const ImageRect r270 = OrientRect(rect, 270, w, h);
  EXPECT_DOUBLE_EQ(r270.center_x, w - 30.0);
  EXPECT_DOUBLE_EQ(r270.center_y, 100.0);
  EXPECT_DOUBLE_EQ(r270.angle, 95.0);

  const ImageRect r180 = OrientRect(rect, 180, w, h);
  EXPECT_DOUBLE_EQ(r180.center_x, w - 100.0);
  EXPECT_DOUBLE_EQ(r180.center_y, h - 30.0);
  EXPECT_DOUBLE_EQ(r180.angle, 185.0);

  const ImageRect r90 = OrientRect(rect, 90, w, h);
  EXPECT_DOUBLE_EQ(r90.center_x, 30.0);
  EXPECT_DOUBLE_EQ(r90.center_y, h - 100.0);
  EXPECT_DOUBLE_EQ(r90.angle, -85.0);

  for (int other : {0, 45, -90, 360}) {
    const ImageRect same = OrientRect(rect, other, w, h);
    EXPECT_DOUBLE_EQ(same.center_x, 100.0) << other;
    EXPECT_DOUBLE_EQ(same.center_y, 30.0) << other;
    EXPECT_DOUBLE_EQ(same.angle, 5.0) << other;
  }
  // Sizes never change.
  EXPECT_DOUBLE_EQ(r90.width, 50.0);
  EXPECT_DOUBLE_EQ(r90.height, 10.0);
}

TEST(AngleRule, BoundsCountAsUpright) {
  EXPECT_TRUE(IsUpright(45.0));
  EXPECT_TRUE(IsUpright(135.0));
  EXPECT_TRUE(IsUpright(225.0));
  EXPECT_TRUE(IsUpright(315.0));
  EXPECT_TRUE(IsUpright(90.0));
  EXPECT_FALSE(IsUpright(44.9));
  EXPECT_FALSE(IsUpright(135.1));
  EXPECT_FALSE(IsUpright(224.9));
  EXPECT_FALSE(IsUpright(315.1));
  EXPECT_FALSE(IsUpright(0.0));
  EXPECT_FALSE(IsUpright(180.0));
}

TEST(AngleRule, NegativeAndLargeAnglesAreNormalised) {
  EXPECT_DOUBLE_EQ(NormalizeDegrees(-30.0), 330.0);
  EXPECT_DOUBLE_EQ(NormalizeDegrees(360.0), 0.0);
  EXPECT_DOUBLE_EQ(NormalizeDegrees(-720.0), 0.0);
  EXPECT_DOUBLE_EQ(NormalizeDegrees(765.0), 45.0);
  EXPECT_FALSE(IsUpright(-30.0));  // 330: lying
  EXPECT_TRUE(IsUpright(-45.0));   // 315
  EXPECT_TRUE(IsUpright(-90.0));   // 270
  EXPECT_TRUE(IsUpright(405.0));   // 45
}

CameraView FullWindowView() {
  CameraView view;
  view.camera_width = 1280.0f;
  view.camera_height = 720.0f;
  view.bg_width = 640.0f;
  view.bg_height = 360.0f;
  view.corners = {-1.0f, 1.0f, 1.0f, -1.0f};
  return view;
}

TEST(CameraRecord, FullWindowScalesImagePixelsToCameraUnits) {
  // Image centre at the camera origin; y flips; angle negated.
  const PositionScaleAngle centre =
      ToCameraRecord({320.0, 180.0, 100.0, 20.0, 10.0}, FullWindowView());
  EXPECT_NEAR(centre.x, 0.0f, kTol);
  EXPECT_NEAR(centre.y, 0.0f, kTol);
  EXPECT_NEAR(centre.scale_x, 200.0f, kTol);
  EXPECT_NEAR(centre.scale_y, 40.0f, kTol);
  EXPECT_NEAR(centre.angle, -10.0f, kTol);

  const PositionScaleAngle corner = ToCameraRecord({0.0, 0.0, 10.0, 10.0, 0.0}, FullWindowView());
  EXPECT_NEAR(corner.x, -640.0f, kTol);
  EXPECT_NEAR(corner.y, 360.0f, kTol);
}

TEST(CameraRecord, UprightRectanglesSwapTheAxisScales) {
  // Unequal axis factors (camera 1280x720 over 640x480) make the rule
  // visible: an upright rectangle's width runs along the screen's y axis.
  CameraView view = FullWindowView();
  view.bg_height = 480.0f;  // sx = 2, sy = 1.5
  const PositionScaleAngle lying = ToCameraRecord({0, 0, 100.0, 20.0, 44.9}, view);
  EXPECT_NEAR(lying.scale_x, 200.0f, kTol);
  EXPECT_NEAR(lying.scale_y, 30.0f, kTol);
  const PositionScaleAngle upright = ToCameraRecord({0, 0, 100.0, 20.0, 45.0}, view);
  EXPECT_NEAR(upright.scale_x, 150.0f, kTol);
  EXPECT_NEAR(upright.scale_y, 40.0f, kTol);
  const PositionScaleAngle negative = ToCameraRecord({0, 0, 100.0, 20.0, -30.0}, view);
  EXPECT_NEAR(negative.scale_x, 200.0f, kTol);  // 330: lying
  EXPECT_NEAR(negative.angle, 30.0f, kTol);
}

TEST(CameraRecord, PatchMarginWidensOnlyTheWidth) {
  const PositionScaleAngle patch =
      ToCameraRecord({320.0, 180.0, 100.0, 20.0, 0.0}, FullWindowView(), kPatchWidthMargin);
  EXPECT_NEAR(patch.scale_x, 210.0f, kTol);
  EXPECT_NEAR(patch.scale_y, 40.0f, kTol);
  const PositionScaleAngle upright =
      ToCameraRecord({320.0, 180.0, 100.0, 20.0, 90.0}, FullWindowView(), kPatchWidthMargin);
  EXPECT_NEAR(upright.scale_x, 210.0f, kTol);
  EXPECT_NEAR(upright.scale_y, 40.0f, kTol);
}

TEST(CameraRecord, LetterboxedBackgroundMapsThroughItsCorners) {
  // 640x360 image in a 640x480 window: corners (-1, 0.75, 1, -0.75); the
  // image occupies window rows 60..420.
  CameraView view;
  view.camera_width = 640.0f;
  view.camera_height = 480.0f;
  view.bg_width = 640.0f;
  view.bg_height = 360.0f;
  view.corners = FitBackground(640, 480, 640, 360);

  const PositionScaleAngle top_left = ToCameraRecord({0.0, 0.0, 64.0, 36.0, 0.0}, view);
  EXPECT_NEAR(top_left.x, -320.0f, kTol);
  EXPECT_NEAR(top_left.y, 180.0f, kTol);  // 60 rows below the window's top
  EXPECT_NEAR(top_left.scale_x, 64.0f, kTol);
  EXPECT_NEAR(top_left.scale_y, 36.0f, kTol);

  const PositionScaleAngle bottom_right = ToCameraRecord({640.0, 360.0, 10.0, 10.0, 0.0}, view);
  EXPECT_NEAR(bottom_right.x, 320.0f, kTol);
  EXPECT_NEAR(bottom_right.y, -180.0f, kTol);
}

TEST(CameraRecord, PillarboxedBackgroundScalesBothSidesAlike) {
  // 320x240 image in a 1280x720 window: 960x720 in the middle.
  CameraView view;
  view.camera_width = 1280.0f;
  view.camera_height = 720.0f;
  view.bg_width = 320.0f;
  view.bg_height = 240.0f;
  view.corners = FitBackground(1280, 720, 320, 240);
  const PositionScaleAngle left_edge = ToCameraRecord({0.0, 120.0, 40.0, 10.0, 90.0}, view);
  EXPECT_NEAR(left_edge.x, -480.0f, 1e-3f);
  EXPECT_NEAR(left_edge.y, 0.0f, 1e-3f);
  EXPECT_NEAR(left_edge.scale_x, 120.0f, 1e-3f);
  EXPECT_NEAR(left_edge.scale_y, 30.0f, 1e-3f);
  EXPECT_NEAR(left_edge.angle, -90.0f, kTol);
}

}  // namespace
}  // namespace ocr_ar
