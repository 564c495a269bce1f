#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <opencv2/core.hpp>
#include <vector>

#include "common/log.h"
#include "renderer/background_frame.h"
#include "renderer/color_correction.h"
#include "renderer/frame_records.h"
#include "renderer/renderer_bridge.h"
#include "renderer/vexel_utils.h"

namespace ocr_ar {
namespace {

long long AddressOf(const cv::Mat& mat) {
  return reinterpret_cast<long long>(&mat);
}

TEST(Color, UnpacksTheHostIntFromTheLeastSignificantByteUp) {
  const Color c = Color::FromPacked(static_cast<std::int32_t>(0x80332211u));
  EXPECT_EQ(c.channel[0], 0x11);
  EXPECT_EQ(c.channel[1], 0x22);
  EXPECT_EQ(c.channel[2], 0x33);
  EXPECT_EQ(c.channel[3], 0x80);
  EXPECT_EQ(c.Packed(), static_cast<std::int32_t>(0x80332211u));
}

TEST(ColorCorrection, ScalesShiftsClampsAndTruncates) {
  const Color in = Color::FromPacked(static_cast<std::int32_t>(0x7F64C80Au));  // 10, 200, 100
  const double scale[3] = {1.5, 2.0, 0.5};
  const double shift[3] = {0.9, 0.0, -60.0};
  const Color out = CorrectColor(in, scale, shift);
  EXPECT_EQ(out.channel[0], 15);    // 15.9 truncated
  EXPECT_EQ(out.channel[1], 255);   // 400 clamped
  EXPECT_EQ(out.channel[2], 0);     // -10 clamped
  EXPECT_EQ(out.channel[3], 0x7F);  // alpha kept
}

TEST(ColorCorrection, NanAndInfinitiesBecomeBounds) {
  const Color in = Color::FromPacked(static_cast<std::int32_t>(0xFF101010u));
  const double nan = std::numeric_limits<double>::quiet_NaN();
  const double inf = std::numeric_limits<double>::infinity();
  const double scale[3] = {nan, inf, -inf};
  const double shift[3] = {0.0, 0.0, 0.0};
  const Color out = CorrectColor(in, scale, shift);
  EXPECT_EQ(out.channel[0], 0);
  EXPECT_EQ(out.channel[1], 255);
  EXPECT_EQ(out.channel[2], 0);
}

TEST(ColorCorrection, NeedsBothScaleAndShift) {
  const Color in = Color::FromPacked(static_cast<std::int32_t>(0xFF405060u));
  const double values[3] = {2.0, 2.0, 2.0};
  EXPECT_EQ(CorrectColor(in, values, nullptr).Packed(), in.Packed());
  EXPECT_EQ(CorrectColor(in, nullptr, values).Packed(), in.Packed());
}

TEST(MatPointer, YieldsDataColumnsAndRows) {
  cv::Mat mat(6, 8, CV_8UC4);
  int width = -1;
  int height = -1;
  EXPECT_EQ(vexel_utils::GetOpenCVMatDataPointer(AddressOf(mat), &width, &height), mat.data);
  EXPECT_EQ(width, 8);
  EXPECT_EQ(height, 6);
  EXPECT_EQ(vexel_utils::GetOpenCVMatDataPointer(0, &width, &height), nullptr);
  EXPECT_EQ(width, 0);
  EXPECT_EQ(height, 0);
}

TEST(MatByteBuffer, CapacityLeavesTheChannelCountOut) {
  EXPECT_EQ(bridge::MatByteBufferCapacity(cv::Mat(6, 8, CV_8UC4)), 48u);
  EXPECT_EQ(bridge::MatByteBufferCapacity(cv::Mat(6, 8, CV_8UC1)), 48u);
  EXPECT_EQ(bridge::MatByteBufferCapacity(cv::Mat(6, 8, CV_32FC3)), 192u);
  EXPECT_EQ(bridge::MatByteBufferCapacity(cv::Mat()), 0u);
}

// The arrays of a two-text frame.
struct TwoTexts {
  std::vector<double> patch_rects{1, 2, 3, 4, 5, 11, 12, 13, 14, 15};
  std::vector<double> text_rects{21, 22, 23, 24, 25, 31, 32, 33, 34, 35};
  std::vector<std::int64_t> ids{0x100000007LL, -2};
  cv::Mat patch0 = cv::Mat(4, 6, CV_8UC4, cv::Scalar::all(9));
  cv::Mat patch1 = cv::Mat(2, 3, CV_8UC4, cv::Scalar::all(7));
  std::vector<std::int64_t> addresses{AddressOf(patch0), AddressOf(patch1)};
  std::vector<double> scales{1, 2, 3, 4, 5, 6};
  std::vector<double> shifts{-1, -2, -3, -4, -5, -6};
  std::vector<std::int32_t> colors{static_cast<std::int32_t>(0xFF0000FFu), 0x12345678};

  FrameArrays Arrays() const {
    FrameArrays a;
    a.patch_rects = {patch_rects.data(), patch_rects.size()};
    a.text_rects = {text_rects.data(), text_rects.size()};
    a.ids = {ids.data(), ids.size()};
    a.patch_mat_addrs = {addresses.data(), addresses.size()};
    a.color_scales = {scales.data(), scales.size()};
    a.color_shifts = {shifts.data(), shifts.size()};
    a.colors = {colors.data(), colors.size()};
    return a;
  }
};

TEST(UnpackTextRecord, ReadsEachArrayAtTheTextsOffset) {
  const TwoTexts frame;
  const TextRecord r = UnpackTextRecord(frame.Arrays(), 1, "zwei");
  EXPECT_EQ(r.text, "zwei");
  EXPECT_DOUBLE_EQ(r.patch_rect.center_x, 11);
  EXPECT_DOUBLE_EQ(r.patch_rect.angle, 15);
  EXPECT_DOUBLE_EQ(r.text_rect.center_y, 32);
  EXPECT_DOUBLE_EQ(r.text_rect.height, 34);
  EXPECT_EQ(r.patch.id, -2);
  EXPECT_EQ(r.patch.data, frame.patch1.data);
  EXPECT_EQ(r.patch.width, 3);
  EXPECT_EQ(r.patch.height, 2);
  EXPECT_EQ(r.patch.color_scale, frame.scales.data() + 3);
  EXPECT_EQ(r.patch.color_shift, frame.shifts.data() + 3);
  EXPECT_EQ(r.color.Packed(), 0x12345678);
}

TEST(UnpackTextRecord, KeepsOnlyTheLow32BitsOfTheId) {
  const TwoTexts frame;
  EXPECT_EQ(UnpackTextRecord(frame.Arrays(), 0, "").patch.id, 7);
}

TEST(UnpackTextRecord, PatchNeedsBothIdsAndAddresses) {
  const TwoTexts frame;
  FrameArrays arrays = frame.Arrays();
  arrays.ids = {};
  const TextRecord r = UnpackTextRecord(arrays, 0, "x");
  EXPECT_EQ(r.patch.id, -1);
  EXPECT_EQ(r.patch.data, nullptr);
  EXPECT_EQ(r.patch.color_scale, nullptr);
  EXPECT_EQ(r.patch.color_shift, nullptr);
  // The rectangles and colour do not depend on the patch.
  EXPECT_DOUBLE_EQ(r.text_rect.center_x, 21);
  EXPECT_EQ(r.color.Packed(), static_cast<std::int32_t>(0xFF0000FFu));
}

TEST(UnpackTextRecord, AbsentOrShortArraysGiveDefaults) {
  const TwoTexts frame;
  FrameArrays arrays = frame.Arrays();
  arrays.colors = {};
  arrays.color_shifts.size = 3;  // only text 0 has a shift
  arrays.text_rects.size = 7;    // text 1's rectangle is cut off
  const TextRecord r = UnpackTextRecord(arrays, 1, "x");
  EXPECT_EQ(r.color.Packed(), kDefaultTextColor);
  EXPECT_EQ(r.patch.color_shift, nullptr);
  EXPECT_DOUBLE_EQ(r.text_rect.width, 0.0);
  EXPECT_DOUBLE_EQ(r.patch_rect.width, 13.0);
  EXPECT_FALSE(HasAllRects(arrays, 2));
  EXPECT_TRUE(HasAllRects(arrays, 1));
  EXPECT_TRUE(HasAllRects(FrameArrays{}, 0));
}

TEST(UnpackTextRecord, PatchOfAnotherLayoutContributesNoPixels) {
  TwoTexts frame;
  frame.patch1 = cv::Mat(2, 3, CV_8UC3, cv::Scalar::all(1));
  ocr::log::ScopedCapture log;
  const TextRecord r = UnpackTextRecord(frame.Arrays(), 1, "x");
  EXPECT_EQ(r.patch.data, nullptr);
  EXPECT_EQ(r.patch.width, 0);
  EXPECT_EQ(r.patch.height, 0);
  EXPECT_EQ(r.patch.id, -2);
  EXPECT_TRUE(
      log.Contains("Vexel: patch matrix of text 1 is not 8-bit RGBA in one piece; not drawn.",
                   ocr::log::kError));
}

TEST(UnpackTextRecord, UnreadableTextIsEmptyBlackAndWithoutPatch) {
  const TextRecord r = UnreadableTextRecord();
  EXPECT_EQ(r.text, "");
  EXPECT_EQ(r.patch.id, -1);
  EXPECT_EQ(r.patch.data, nullptr);
  EXPECT_DOUBLE_EQ(r.text_rect.width, 0.0);
  EXPECT_DOUBLE_EQ(r.patch_rect.center_x, 0.0);
  EXPECT_EQ(r.color.Packed(), static_cast<std::int32_t>(0xFF000000u));
}

TEST(BackgroundRgba, PassesRgbaThroughAndConvertsOtherLayouts) {
  cv::Mat scratch;
  cv::Mat rgba(2, 3, CV_8UC4, cv::Scalar(1, 2, 3, 4));
  EXPECT_EQ(BackgroundRgba(rgba, scratch), rgba.data);

  cv::Mat rgb(2, 3, CV_8UC3, cv::Scalar(10, 20, 30));
  const auto* converted = static_cast<const unsigned char*>(BackgroundRgba(rgb, scratch));
  ASSERT_NE(converted, nullptr);
  EXPECT_EQ(converted[0], 10);
  EXPECT_EQ(converted[1], 20);
  EXPECT_EQ(converted[2], 30);
  EXPECT_EQ(converted[3], 255);

  cv::Mat big(4, 6, CV_8UC4, cv::Scalar(5, 6, 7, 8));
  cv::Mat window = big(cv::Rect(1, 1, 3, 2));  // rows not contiguous
  const auto* copied = static_cast<const unsigned char*>(BackgroundRgba(window, scratch));
  ASSERT_NE(copied, nullptr);
  EXPECT_NE(copied, window.data);
  EXPECT_EQ(copied[4 * 5 + 2], 7);

  EXPECT_EQ(BackgroundRgba(cv::Mat(2, 2, CV_32FC4), scratch), nullptr);
  EXPECT_EQ(BackgroundRgba(cv::Mat(), scratch), nullptr);
}

}  // namespace
}  // namespace ocr_ar
