#include "inpainting/driver/strategy_dispatch.h"

#include <gtest/gtest.h>

#include <tbb/task_arena.h>

#include <algorithm>
#include <limits>
#include <vector>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "inpainting/driver/region_geometry.h"
#include "text_scene_support.h"

namespace ocr_inpainting {
namespace {

using ocr_testing::Background;
using ocr_testing::DrawnTextLine;
using ocr_testing::TextScene;

struct Result {
  int status = 0;
  std::vector<cv::Mat> overlays;
  std::vector<cv::Scalar> colors;
};

Result RunRequest(const cv::Mat& image, const std::vector<double>& values) {
  Result r;
  r.status = InpaintingRotImg(image, values, r.overlays, r.colors);
  return r;
}

cv::Size LinePatchSize(const cv::RotatedRect& rect) {
  cv::Size size;
  cv::Mat transform;
  GetSizeAndTransform(rect, size, transform, kLinePatchCap);
  return size;
}

// Black text on light grey, well apart, each line a different size.
TextScene SeparateLines() {
  const cv::Mat background(360, 640, CV_8UC3, cv::Scalar(215, 215, 210));
  std::vector<DrawnTextLine> lines;
  const char* const words[] = {"Bahnhof", "Ausgang 3", "Kaffee", "Apotheke"};
  for (int k = 0; k < 4; ++k) {
    DrawnTextLine line;
    line.text = words[k];
    line.centre = cv::Point2f(160.0f + 320.0f * float(k % 2), 70.0f + 90.0f * float(k));
    line.scale = 0.8 + 0.2 * k;
    line.thickness = 2;
    line.color = cv::Scalar(20, 20, 20);
    line.angle = k == 2 ? 12.0f : 0.0f;
    line.font = cv::FONT_HERSHEY_SIMPLEX;
    lines.push_back(line);
  }
  return ocr_testing::DrawTextLines(background, lines);
}

// PSNR of `a` against `b` over the pixels of `mask`, all three channels.
double Psnr(const cv::Mat& a, const cv::Mat& b, const cv::Mat& mask) {
  cv::Mat diff;
  cv::absdiff(a, b, diff);
  diff.convertTo(diff, CV_32F);
  const cv::Scalar mean_square = cv::mean(diff.mul(diff), mask);
  const double mse = (mean_square[0] + mean_square[1] + mean_square[2]) / 3;
  return 10 * std::log10(255.0 * 255.0 / std::max(mse, 1e-10));
}

cv::Mat RectMask(const cv::Size& size, const std::vector<cv::RotatedRect>& rects) {
  cv::Mat mask = cv::Mat::zeros(size, CV_8UC1);
  for (const cv::RotatedRect& rect : rects) {
    cv::Point2f corners[4];
    rect.points(corners);
    std::vector<cv::Point> polygon(corners, corners + 4);
    cv::fillConvexPoly(mask, polygon, cv::Scalar(255));
  }
  return mask;
}

TEST(InpaintingRotImg, ErasesEveryLineAndFindsItsColour) {
  const TextScene scene = SeparateLines();
  const Result r = RunRequest(scene.frame, scene.values);
  ASSERT_EQ(r.status, 0);
  ASSERT_EQ(r.overlays.size(), 4u);
  ASSERT_EQ(r.colors.size(), 4u);
  cv::Mat composited = scene.frame.clone();
  for (size_t i = 0; i < 4; ++i) {
    EXPECT_EQ(r.overlays[i].type(), CV_8UC4) << i;
    EXPECT_EQ(r.overlays[i].size(), LinePatchSize(scene.rects[i])) << i;
    for (int ch = 0; ch < 3; ++ch)
      EXPECT_LT(r.colors[i][ch], 70) << "line " << i << " channel " << ch;
    ocr_testing::CompositeOverlay(r.overlays[i], scene.rects[i], composited);
  }
  const cv::Mat inside = RectMask(scene.frame.size(), scene.rects);
  const double before = Psnr(scene.frame, scene.background, inside);
  const double after = Psnr(composited, scene.background, inside);
  EXPECT_GT(after, before + 8) << "before " << before << " dB, after " << after << " dB";
}

TEST(InpaintingRotImg, GivesTheSameResultsAsASerialRun) {
  const TextScene scene = ocr_testing::MakeRandomTextScene(Background::kPhoto, {640, 480}, 8, 99);
  const Result parallel = RunRequest(scene.frame, scene.values);
  Result serial;
  tbb::task_arena one_thread(1);
  one_thread.execute([&] { serial = RunRequest(scene.frame, scene.values); });
  ASSERT_EQ(parallel.overlays.size(), serial.overlays.size());
  for (size_t i = 0; i < serial.overlays.size(); ++i) {
    ASSERT_EQ(parallel.overlays[i].size(), serial.overlays[i].size()) << i;
    EXPECT_EQ(cv::norm(parallel.overlays[i], serial.overlays[i], cv::NORM_INF), 0.0) << i;
    EXPECT_EQ(parallel.colors[i], serial.colors[i]) << i;
  }
}

TEST(InpaintingRotImg, ReturnsResultsInRequestOrder) {
  // Lines 1 and 2 are stacked (one block), 0 and 3 stand alone; the blocks
  // run in another order than the request's, yet every overlay lands at its
  // rectangle's index.
  const cv::Mat background(400, 600, CV_8UC3, cv::Scalar(230, 225, 220));
  std::vector<DrawnTextLine> lines(4);
  const cv::Point2f centres[] = {{450, 330}, {200, 80}, {200, 115}, {470, 60}};
  const char* const words[] = {"Ticket", "Tagesgericht", "Tagesgericht", "open"};
  const double scales[] = {1.4, 0.9, 0.9, 0.6};
  for (int k = 0; k < 4; ++k) {
    lines[k].text = words[k];
    lines[k].centre = centres[k];
    lines[k].scale = scales[k];
    lines[k].color = cv::Scalar(30, 40, 120);
    lines[k].font = cv::FONT_HERSHEY_DUPLEX;
  }
  const TextScene scene = ocr_testing::DrawTextLines(background, lines);
  ocr::log::ScopedCapture capture;
  const Result r = RunRequest(scene.frame, scene.values);
  ASSERT_EQ(r.overlays.size(), 4u);
  EXPECT_TRUE(capture.Contains("kavoSmart sep block Num 0, Ind 1", ocr::log::kDebug));
  EXPECT_TRUE(capture.Contains("kavoSmart block_result idx 0 size 2", ocr::log::kDebug));
  for (size_t i = 0; i < 4; ++i)
    EXPECT_EQ(r.overlays[i].size(), LinePatchSize(scene.rects[i])) << i;

  // Reversing the request reverses the answers of the stand-alone lines.
  std::vector<cv::RotatedRect> reversed(scene.rects.rbegin(), scene.rects.rend());
  const Result back = RunRequest(scene.frame, ocr_testing::FlattenRects(reversed));
  ASSERT_EQ(back.overlays.size(), 4u);
  for (const size_t i : {size_t{0}, size_t{3}}) {
    EXPECT_EQ(cv::norm(back.overlays[3 - i], r.overlays[i], cv::NORM_INF), 0.0) << i;
    EXPECT_EQ(back.colors[3 - i], r.colors[i]) << i;
  }
}

TEST(InpaintingRotImg, ASingleRectangleTakesTheLinePath) {
  const TextScene scene = SeparateLines();
  const std::vector<double> first(scene.values.begin(), scene.values.begin() + 5);
  ocr::log::ScopedCapture capture;
  const Result r = RunRequest(scene.frame, first);
  EXPECT_EQ(r.status, 0);
  ASSERT_EQ(r.overlays.size(), 1u);
  EXPECT_EQ(r.overlays[0].size(), LinePatchSize(scene.rects[0]));
  EXPECT_TRUE(capture.Contains(" Start Inpainting Line Version", ocr::log::kInfo));
  EXPECT_FALSE(capture.Contains(" Start Inpainting Block Version"));
}

TEST(InpaintingRotImg, RefusesRequestsNoStrategyCanServe) {
  const cv::Mat frame(100, 100, CV_8UC3, cv::Scalar::all(200));
  const std::vector<double> one = {50, 50, 40, 10, 0};
  const struct {
    cv::Mat image;
    std::vector<double> values;
    const char* message;
  } cases[] = {
      {cv::Mat(), one, " Inpainting_Process: Error in input of inpainting. Empty data."},
      {frame, {}, " Inpainting_Process: Error in rotate_recs.size 0"},
      {frame, {50, 50, 40, 10, 0, 1, 2}, " Inpainting_Process: Error in rotate_recs.size 7"},
      {cv::Mat(100, 100, CV_8UC4), one,
       " Inpainting_Process: Error in type of convert RGBA to RGB."},
      {cv::Mat(100, 100, CV_8UC1), one,
       " Inpainting_Process: Error in type of convert RGBA to RGB."},
  };
  for (const auto& c : cases) {
    ocr::log::ScopedCapture capture;
    Result r;
    r.overlays = {cv::Mat(3, 3, CV_8UC1)};
    r.status = InpaintingRotImg(c.image, c.values, r.overlays, r.colors);
    EXPECT_EQ(r.status, -1) << c.message;
    EXPECT_EQ(capture.Count(c.message, ocr::log::kError), 1) << c.message;
    EXPECT_EQ(r.overlays.size(), 1u) << "outputs touched: " << c.message;
    EXPECT_TRUE(r.colors.empty()) << c.message;
  }
}

TEST(InpaintingRotImg, ImagesBelow4x4SucceedWithEmptyOverlays) {
  const cv::Mat tiny(3, 3, CV_8UC3, cv::Scalar::all(9));
  for (const std::vector<double>& values :
       {std::vector<double>{1, 1, 2, 2, 0}, std::vector<double>{1, 1, 2, 2, 0, 2, 2, 1, 1, 0}}) {
    ocr::log::ScopedCapture capture;
    const Result r = RunRequest(tiny, values);
    EXPECT_EQ(r.status, 0);
    ASSERT_EQ(r.overlays.size(), values.size() / 5);
    for (size_t i = 0; i < r.overlays.size(); ++i) {
      EXPECT_TRUE(r.overlays[i].empty());
      EXPECT_EQ(r.colors[i], cv::Scalar::all(0));
    }
    EXPECT_TRUE(
        capture.Contains(" Inpainting_Process: input image size is too small ", ocr::log::kError));
  }
}

TEST(InpaintingRotImg, SurvivesRectanglesOutsideTheImageOrNotFinite) {
  const TextScene scene = SeparateLines();
  const double nan = std::numeric_limits<double>::quiet_NaN();
  const double inf = std::numeric_limits<double>::infinity();
  const std::vector<double> values = {-500, -500, 80,  20,  0,       // outside
                                      nan,  100,  80,  20,  0,       // NaN centre
                                      100,  100,  inf, 20,  0,       // infinite width
                                      320,  180,  1e7, 1e7, 30,      // huge
                                      200,  200,  0,   0,   0,       // no area
                                      200,  200,  80,  20,  nan,     // NaN angle
                                      1e30, 1e30, 80,  20,  -1e30};  // far away
  const Result r = RunRequest(scene.frame, values);
  EXPECT_EQ(r.status, 0);
  ASSERT_EQ(r.overlays.size(), 7u);
  for (const cv::Mat& overlay : r.overlays) {
    if (!overlay.empty()) {
      EXPECT_EQ(overlay.type(), CV_8UC4);
      EXPECT_LE(std::max(overlay.rows, overlay.cols), kLinePatchCap);
    }
  }
}

TEST(InpaintingRotImgBlockVersion, ErasesAllRectanglesAsOneBlock) {
  const TextScene scene = SeparateLines();
  ocr::log::ScopedCapture capture;
  std::vector<cv::Mat> overlays;
  std::vector<cv::Scalar> colors;
  const std::vector<double> pair(scene.values.begin(), scene.values.begin() + 10);
  EXPECT_EQ(InpaintingRotImgBlockVersion(scene.frame, pair, overlays, colors), 0);
  ASSERT_EQ(overlays.size(), 2u);
  ASSERT_EQ(colors.size(), 2u);
  for (const cv::Mat& overlay : overlays)
    EXPECT_EQ(overlay.type(), CV_8UC4);
  EXPECT_TRUE(capture.Contains(" Start Inpainting Block Version", ocr::log::kInfo));
  EXPECT_TRUE(capture.Contains("  Inpainting_Process: rotate_rects.size = 10", ocr::log::kInfo));
  EXPECT_TRUE(capture.Contains("kMinSizeKernel", ocr::log::kInfo));
  EXPECT_TRUE(capture.Contains("InpaintingThreshold enter", ocr::log::kInfo));
  EXPECT_TRUE(capture.Contains("InpaintImgBlockVersion end", ocr::log::kWarn));
}

TEST(InpaintingRotImgBlockVersion, RefusesABlockBelow4x4) {
  const cv::Mat frame(100, 100, CV_8UC3, cv::Scalar::all(128));
  ocr::log::ScopedCapture capture;
  std::vector<cv::Mat> overlays;
  std::vector<cv::Scalar> colors;
  EXPECT_EQ(InpaintingRotImgBlockVersion(frame, {50, 50, 30, 0.5, 0}, overlays, colors), -1);
  EXPECT_TRUE(
      capture.Contains("Inpainting_Process: block_roi is too small: 3x31", ocr::log::kError));
  ASSERT_EQ(overlays.size(), 1u);
  EXPECT_TRUE(overlays[0].empty());
  EXPECT_EQ(colors, std::vector<cv::Scalar>{cv::Scalar::all(0)});
}

TEST(InpaintingRotImgBlockVersion, LeavesOutputsAloneForATinyImage) {
  std::vector<cv::Mat> overlays = {cv::Mat(1, 1, CV_8UC1)};
  std::vector<cv::Scalar> colors = {cv::Scalar(1, 2, 3)};
  EXPECT_EQ(InpaintingRotImgBlockVersion(cv::Mat(3, 8, CV_8UC3), {1, 1, 2, 2, 0}, overlays, colors),
            0);
  EXPECT_EQ(overlays.size(), 1u);
  EXPECT_EQ(colors, std::vector<cv::Scalar>{cv::Scalar(1, 2, 3)});
}

TEST(InpaintingRotImgLineVersion, HandlesPatchesTooSmallToErase) {
  const TextScene scene = SeparateLines();
  std::vector<double> values(scene.values.begin(), scene.values.begin() + 5);
  values.insert(values.end(), {300, 300, 3, 2, 0});  // 3x2 patch
  values.insert(values.end(), {300, 300, 0, 9, 0});  // no patch
  ocr::log::ScopedCapture capture;
  std::vector<cv::Mat> overlays;
  std::vector<cv::Scalar> colors;
  EXPECT_EQ(InpaintingRotImgLineVersion(scene.frame, values, overlays, colors), 0);
  ASSERT_EQ(overlays.size(), 3u);
  EXPECT_EQ(overlays[0].size(), LinePatchSize(scene.rects[0]));
  ASSERT_EQ(overlays[1].size(), cv::Size(3, 2));
  ASSERT_EQ(overlays[1].type(), CV_8UC4);
  cv::Mat alpha;
  cv::extractChannel(overlays[1], alpha, 3);
  EXPECT_EQ(cv::countNonZero(alpha), 0);
  EXPECT_TRUE(overlays[2].empty());
  EXPECT_EQ(capture.Count("Inpainting_Process: Rect too small", ocr::log::kWarn), 1);
  EXPECT_EQ(colors[1], cv::Scalar::all(0));
  EXPECT_EQ(colors[2], cv::Scalar::all(0));
}

}  // namespace
}  // namespace ocr_inpainting
