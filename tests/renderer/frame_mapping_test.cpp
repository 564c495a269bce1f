// The bridge's per-frame logic on plain values: unpacking the host's arrays,
// colour correction, and the mapping of image rectangles into camera space.
#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <limits>
#include <opencv2/core.hpp>
#include <vector>

#include "common/log.h"
#include "recording_scene.h"
#include "renderer/frame_mapping.h"

namespace ocr_ar {
namespace {

TEST(ColorCorrection, ScalesShiftsClampsAndTruncatesKeepingAlpha) {
  const double nan = std::numeric_limits<double>::quiet_NaN();
  const double inf = std::numeric_limits<double>::infinity();
  struct Case {
    std::uint32_t in;
    double scale[3], shift[3];
    std::uint32_t out;
  } cases[] = {
      // (10, 200, 100): 15.9 truncated, 400 and -10 clamped; alpha kept.
      {0x7F64C80Au, {1.5, 2.0, 0.5}, {0.9, 0.0, -60.0}, 0x7F00FF0Fu},
      {0xFF101010u, {nan, inf, -inf}, {0.0, 0.0, 0.0}, 0xFF00FF00u},
  };
  for (const Case& c : cases) {
    const Color in = Color::FromPacked(static_cast<std::int32_t>(c.in));
    EXPECT_EQ(static_cast<std::uint32_t>(CorrectColor(in, c.scale, c.shift).Packed()), c.out);
    // Only with both a scale and a shift.
    EXPECT_EQ(CorrectColor(in, c.scale, nullptr).Packed(), in.Packed());
    EXPECT_EQ(CorrectColor(in, nullptr, c.shift).Packed(), in.Packed());
  }
}

// Two texts whose values all differ.
testing::HostFrame TwoTexts() {
  testing::HostFrame frame;
  frame.Add("eins", {1, 2, 3, 4, 5}, 0x100000007LL, 0xFF0000FFu)
      .Add("zwei", {11, 12, 13, 14, 15}, -2, 0x12345678u);
  frame.text_rects = {21, 22, 23, 24, 25, 31, 32, 33, 34, 35};
  frame.scales = {1, 2, 3, 4, 5, 6};
  frame.shifts = {-1, -2, -3, -4, -5, -6};
  frame.patches[1] = cv::Mat(2, 3, CV_8UC4);
  return frame;
}

TEST(UnpackTextRecord, ReadsEachArrayAtTheTextsOffset) {
  testing::HostFrame frame = TwoTexts();
  const TextRecord r = UnpackTextRecord(frame.Arrays(), 1, "zwei");
  EXPECT_EQ(r.text, "zwei");
  EXPECT_EQ(std::vector<double>({r.patch_rect.center_x, r.patch_rect.angle, r.text_rect.center_y,
                                 r.text_rect.height}),
            std::vector<double>({11, 15, 32, 34}));
  EXPECT_EQ(r.patch.id, -2);
  EXPECT_EQ(r.patch.data, frame.patches[1].data);
  EXPECT_EQ(std::make_pair(r.patch.width, r.patch.height), std::make_pair(3, 2));
  EXPECT_EQ(r.patch.color_scale, frame.scales.data() + 3);
  EXPECT_EQ(r.patch.color_shift, frame.shifts.data() + 3);
  EXPECT_EQ(r.color.Packed(), 0x12345678);
  EXPECT_EQ(UnpackTextRecord(frame.Arrays(), 0, "").patch.id, 7);  // the low 32 bits only
}

TEST(UnpackTextRecord, MissingPartsGiveDefaults) {
  testing::HostFrame frame = TwoTexts();
  FrameArrays arrays = frame.Arrays();
  arrays.ids = {};  // no patch without both ids and addresses; rectangles and colour unaffected
  const TextRecord r = UnpackTextRecord(arrays, 0, "x");
  EXPECT_EQ(r.patch.id, -1);
  EXPECT_EQ(r.patch.data, nullptr);
  EXPECT_EQ(r.patch.color_scale, nullptr);
  EXPECT_EQ(r.patch.color_shift, nullptr);
  EXPECT_DOUBLE_EQ(r.text_rect.center_x, 21);
  EXPECT_EQ(r.color.Packed(), static_cast<std::int32_t>(0xFF0000FFu));

  arrays = frame.Arrays();
  arrays.colors = {};
  arrays.color_shifts.size = 3;  // only text 0 has a shift
  arrays.text_rects.size = 7;    // text 1's rectangle is cut off
  const TextRecord s = UnpackTextRecord(arrays, 1, "x");
  EXPECT_EQ(s.color.Packed(), kDefaultTextColor);
  EXPECT_EQ(s.patch.color_shift, nullptr);
  EXPECT_DOUBLE_EQ(s.text_rect.width, 0.0);
  EXPECT_DOUBLE_EQ(s.patch_rect.width, 13.0);
  EXPECT_FALSE(HasAllRects(arrays, 2));
  EXPECT_TRUE(HasAllRects(arrays, 1));

  // A patch that is not RGBA in one piece would be read past its end.
  frame.patches[1] = cv::Mat(2, 3, CV_8UC3);
  ocr::log::ScopedCapture log;
  const TextRecord t = UnpackTextRecord(frame.Arrays(), 1, "x");
  EXPECT_EQ(t.patch.data, nullptr);
  EXPECT_EQ(std::make_pair(t.patch.width, t.patch.height), std::make_pair(0, 0));
  EXPECT_EQ(t.patch.id, -2);
  EXPECT_TRUE(
      log.Contains("Vexel: patch matrix of text 1 is not 8-bit RGBA in one piece; not drawn.",
                   ocr::log::kError));
}

TEST(BackgroundRgba, PassesRgbaThroughAndConvertsOtherLayouts) {
  cv::Mat scratch;
  const cv::Mat rgba(2, 3, CV_8UC4, cv::Scalar(1, 2, 3, 4));
  EXPECT_EQ(BackgroundRgba(rgba, scratch), rgba.data);
  const auto* rgb = static_cast<const unsigned char*>(
      BackgroundRgba(cv::Mat(2, 3, CV_8UC3, cv::Scalar(10, 20, 30)), scratch));
  ASSERT_NE(rgb, nullptr);
  EXPECT_EQ(std::vector<int>(rgb, rgb + 4), (std::vector<int>{10, 20, 30, 255}));
  const cv::Mat big(4, 6, CV_8UC4, cv::Scalar(5, 6, 7, 8));
  const cv::Mat window = big(cv::Rect(1, 1, 3, 2));  // rows not contiguous
  const auto* copied = static_cast<const unsigned char*>(BackgroundRgba(window, scratch));
  ASSERT_NE(copied, nullptr);
  EXPECT_NE(copied, window.data);
  EXPECT_EQ(copied[4 * 5 + 2], 7);
  EXPECT_EQ(BackgroundRgba(cv::Mat(2, 2, CV_32FC4), scratch), nullptr);
  EXPECT_EQ(BackgroundRgba(cv::Mat(), scratch), nullptr);
}

TEST(OrientRect, TurnsCentresAndAnglesPerOrientation) {
  const ImageRect rect{100.0, 30.0, 50.0, 10.0, 5.0};
  const struct {
    int orientation;
    double x, y, angle;
  } cases[] = {{270, 640 - 30, 100, 95}, {180, 640 - 100, 480 - 30, 185},
               {90, 30, 480 - 100, -85}, {0, 100, 30, 5},
               {45, 100, 30, 5},         {-90, 100, 30, 5}};
  for (const auto& c : cases) {
    const ImageRect oriented = OrientRect(rect, c.orientation, 640.0, 480.0);
    EXPECT_DOUBLE_EQ(oriented.center_x, c.x) << c.orientation;
    EXPECT_DOUBLE_EQ(oriented.center_y, c.y) << c.orientation;
    EXPECT_DOUBLE_EQ(oriented.angle, c.angle) << c.orientation;
    EXPECT_DOUBLE_EQ(oriented.width, 50.0) << c.orientation;  // sizes never change
    EXPECT_DOUBLE_EQ(oriented.height, 10.0) << c.orientation;
  }
}

TEST(AngleRule, UprightBetween45And135Or225And315BoundsIncluded) {
  for (double angle : {45.0, 90.0, 135.0, 225.0, 315.0, -45.0, -90.0, 405.0})
    EXPECT_TRUE(IsUpright(angle)) << angle;
  for (double angle : {0.0, 44.9, 135.1, 180.0, 224.9, 315.1, -30.0})
    EXPECT_FALSE(IsUpright(angle)) << angle;
  EXPECT_DOUBLE_EQ(NormalizeDegrees(-30.0), 330.0);
  EXPECT_DOUBLE_EQ(NormalizeDegrees(-720.0), 0.0);
  EXPECT_DOUBLE_EQ(NormalizeDegrees(765.0), 45.0);
}

// The walk by 360 that the rule describes, kept here to compare against.
double WalkIntoRange(double angle) {
  while (angle < 0.0)
    angle += 360.0;
  while (angle >= 360.0)
    angle -= 360.0;
  return angle;
}

TEST(AngleRule, SameBitsAsTheWalkAndEndsForHugeAndNonFiniteAngles) {
  cv::RNG rng(7);
  for (int i = 0; i < 20000; ++i) {
    const double magnitude = std::pow(10.0, rng.uniform(-12.0, 6.0));
    const double angle = rng.uniform(0, 2) == 0 ? magnitude : -magnitude;
    const double walked = WalkIntoRange(angle);
    const double reduced = NormalizeDegrees(angle);
    EXPECT_EQ(std::memcmp(&walked, &reduced, sizeof walked), 0) << angle;
  }
  // A tiny negative angle rounds to 360 on the way in; the walk then lands on 0.
  EXPECT_EQ(NormalizeDegrees(-1e-20), 0.0);
  const double inf = std::numeric_limits<double>::infinity();
  for (double angle : {1e300, -1e300, 1e17})
    EXPECT_TRUE(NormalizeDegrees(angle) >= 0.0 && NormalizeDegrees(angle) < 360.0) << angle;
  for (double angle : {inf, -inf, std::numeric_limits<double>::quiet_NaN()}) {
    EXPECT_TRUE(std::isnan(NormalizeDegrees(angle)));
    EXPECT_FALSE(IsUpright(angle));  // counts as lying
  }
}

CameraView View(float camera_w, float camera_h, float image_w, float image_h) {
  return {camera_w, camera_h, image_w, image_h,
          FitBackground(static_cast<int>(camera_w), static_cast<int>(camera_h),
                        static_cast<int>(image_w), static_cast<int>(image_h))};
}

TEST(CameraRecord, MapsImagePixelsIntoCameraUnits) {
  const CameraView full = View(1280, 720, 640, 360);
  const CameraView uneven = {1280, 720, 640, 480, {-1, 1, 1, -1}};  // sx = 2, sy = 1.5
  const CameraView letterbox = View(640, 480, 640, 360);            // window rows 60..420
  const CameraView pillarbox = View(1280, 720, 320, 240);           // 960x720 in the middle
  const struct {
    CameraView view;
    ImageRect rect;
    double width_factor;
    PositionScaleAngle record;
  } cases[] = {
      // Image centre at the origin; y flips; the angle is negated.
      {full, {320, 180, 100, 20, 10}, 1.0, {0, 0, 200, 40, -10}},
      {full, {0, 0, 10, 10, 0}, 1.0, {-640, 360, 20, 20, 0}},
      // The patch margin widens only the width, upright or lying.
      {full, {320, 180, 100, 20, 0}, kPatchWidthMargin, {0, 0, 210, 40, 0}},
      {full, {320, 180, 100, 20, 90}, kPatchWidthMargin, {0, 0, 210, 40, -90}},
      // An upright rectangle's width runs along the screen's y axis.
      {uneven, {0, 0, 100, 20, 44.9}, 1.0, {-640, 360, 200, 30, -44.9f}},
      {uneven, {0, 0, 100, 20, 45}, 1.0, {-640, 360, 150, 40, -45}},
      {uneven, {0, 0, 100, 20, 315}, 1.0, {-640, 360, 150, 40, -315}},
      {uneven, {0, 0, 100, 20, 315.1}, 1.0, {-640, 360, 200, 30, -315.1f}},
      {uneven, {0, 0, 100, 20, -30}, 1.0, {-640, 360, 200, 30, 30}},
      // A background that does not fill the window maps through its corners.
      {letterbox, {0, 0, 64, 36, 0}, 1.0, {-320, 180, 64, 36, 0}},
      {letterbox, {640, 360, 10, 10, 0}, 1.0, {320, -180, 10, 10, 0}},
      {pillarbox, {0, 120, 40, 10, 90}, 1.0, {-480, 0, 120, 30, -90}},
  };
  for (const auto& c : cases) {
    const PositionScaleAngle r = ToCameraRecord(c.rect, c.view, c.width_factor);
    const std::string where = std::to_string(c.rect.center_x) + "," +
                              std::to_string(c.rect.center_y) + " at " +
                              std::to_string(c.rect.angle);
    EXPECT_NEAR(r.x, c.record.x, 1e-3f) << where;
    EXPECT_NEAR(r.y, c.record.y, 1e-3f) << where;
    EXPECT_NEAR(r.scale_x, c.record.scale_x, 1e-3f) << where;
    EXPECT_NEAR(r.scale_y, c.record.scale_y, 1e-3f) << where;
    EXPECT_NEAR(r.angle, c.record.angle, 1e-3f) << where;
  }
}

}  // namespace
}  // namespace ocr_ar
