#include "inpainting/driver/strategy_dispatch.h"

#include <gtest/gtest.h>

#include <tbb/task_arena.h>

#include <algorithm>
#include <cmath>
#include <limits>
#include <vector>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "inpainting/driver/region_geometry.h"

namespace ocr_inpainting {
namespace {

const cv::Scalar kPaper(215, 215, 210);

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

// A 640x360 page with a dark word in every box, and the boxes as request
// values (angle 0, integer corners, so that overlay i covers exactly box i).
struct Page {
  cv::Mat frame;
  std::vector<cv::Rect> boxes;
  std::vector<double> values;
};

Page MakePage(const std::vector<cv::Rect>& boxes) {
  Page page{cv::Mat(360, 640, CV_8UC3, kPaper), boxes, {}};
  for (const cv::Rect& box : boxes) {
    cv::putText(page.frame, "Kaffee", {box.x + 6, box.y + box.height * 3 / 4},
                cv::FONT_HERSHEY_SIMPLEX, box.height / 40.0, cv::Scalar(20, 20, 20), 2,
                cv::LINE_AA);
    page.values.insert(page.values.end(), {box.x + box.width * 0.5, box.y + box.height * 0.5,
                                           double(box.width), double(box.height), 0.0});
  }
  return page;
}

// Mean squared error of `roi` against the paper colour.
double ErrorToPaper(const cv::Mat& roi) {
  return std::pow(cv::norm(roi, cv::Mat(roi.size(), roi.type(), kPaper), cv::NORM_L2), 2) /
         (roi.total() * 3.0);
}

// Many words apart go through the block path (one-member blocks), a single
// rectangle through the line path; both must erase the text.
TEST(InpaintingRotImg, ErasesEveryLineAndFindsItsColour) {
  const Page page = MakePage({{40, 40, 150, 40}, {330, 130, 180, 48}, {100, 250, 130, 34}});
  for (const size_t count : {size_t{3}, size_t{1}}) {
    ocr::log::ScopedCapture capture;
    const Result r = RunRequest(page.frame, {page.values.begin(), page.values.begin() + 5 * count});
    ASSERT_EQ(r.status, 0);
    ASSERT_EQ(r.overlays.size(), count);
    ASSERT_EQ(r.colors.size(), count);
    EXPECT_EQ(capture.Contains(" Start Inpainting Line Version", ocr::log::kInfo), count == 1);
    EXPECT_EQ(capture.Contains(" Start Inpainting Block Version", ocr::log::kInfo), count > 1);
    for (size_t i = 0; i < count; ++i) {
      ASSERT_EQ(r.overlays[i].type(), CV_8UC4) << i;
      ASSERT_EQ(r.overlays[i].size(), page.boxes[i].size()) << i;
      for (int ch = 0; ch < 3; ++ch)
        EXPECT_LT(r.colors[i][ch], 70) << "line " << i << " channel " << ch;
      // The overlay composited by its alpha over the frame.
      cv::Mat rgb;
      cv::Mat alpha;
      cv::cvtColor(r.overlays[i], rgb, cv::COLOR_RGBA2RGB);
      cv::extractChannel(r.overlays[i], alpha, 3);
      alpha.convertTo(alpha, CV_32F, 1 / 255.0);
      cv::Mat composited;
      cv::blendLinear(rgb, page.frame(page.boxes[i]), alpha, 1.0 - alpha, composited);
      const double before = ErrorToPaper(page.frame(page.boxes[i]));
      const double after = ErrorToPaper(composited);
      EXPECT_GT(10 * std::log10(before / std::max(after, 1e-10)), 8)
          << "line " << i << ": error " << before << " before, " << after << " after";
    }
  }
}

TEST(InpaintingRotImg, GivesTheSameResultsAsASerialRun) {
  // Stacked lines (multi-line blocks), lines apart, and turned rectangles.
  Page page = MakePage({{40, 30, 200, 30},
                        {40, 60, 200, 30},
                        {40, 90, 200, 30},
                        {330, 40, 180, 40},
                        {350, 200, 150, 30},
                        {350, 230, 150, 30},
                        {60, 270, 200, 44}});
  page.values.insert(page.values.end(), {160, 200, 180, 36, 14, 500, 320, 120, 30, -35});
  const Result parallel = RunRequest(page.frame, page.values);
  Result serial;
  tbb::task_arena one_thread(1);
  one_thread.execute([&] { serial = RunRequest(page.frame, page.values); });
  ASSERT_EQ(parallel.overlays.size(), 9u);
  ASSERT_EQ(serial.overlays.size(), 9u);
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
  const Page page =
      MakePage({{420, 290, 180, 48}, {60, 60, 240, 30}, {60, 90, 230, 30}, {440, 40, 140, 24}});
  ocr::log::ScopedCapture capture;
  const Result r = RunRequest(page.frame, page.values);
  ASSERT_EQ(r.overlays.size(), 4u);
  EXPECT_TRUE(capture.Contains("kavoSmart sep block Num 0, Ind 1", ocr::log::kDebug));
  EXPECT_TRUE(capture.Contains("kavoSmart block_result idx 0 size 2", ocr::log::kDebug));
  for (size_t i = 0; i < 4; ++i)
    EXPECT_EQ(r.overlays[i].size(), page.boxes[i].size()) << i;

  // Reversing the request reverses the answers of the stand-alone lines.
  std::vector<double> reversed;
  for (size_t i = 4; i-- > 0;)
    reversed.insert(reversed.end(), page.values.begin() + 5 * i, page.values.begin() + 5 * i + 5);
  const Result back = RunRequest(page.frame, reversed);
  ASSERT_EQ(back.overlays.size(), 4u);
  for (const size_t i : {size_t{0}, size_t{3}}) {
    EXPECT_EQ(cv::norm(back.overlays[3 - i], r.overlays[i], cv::NORM_INF), 0.0) << i;
    EXPECT_EQ(back.colors[3 - i], r.colors[i]) << i;
  }
}

TEST(InpaintingRotImg, SurvivesRectanglesOutsideTheImageOrNotFinite) {
  const Page page = MakePage({{40, 40, 150, 40}});
  const double nan = std::numeric_limits<double>::quiet_NaN();
  const double inf = std::numeric_limits<double>::infinity();
  const std::vector<double> values = {-500, -500, 80,  20,  0,       // outside
                                      nan,  100,  80,  20,  0,       // NaN centre
                                      100,  100,  inf, 20,  0,       // infinite width
                                      320,  180,  1e7, 1e7, 30,      // huge
                                      200,  200,  0,   0,   0,       // no area
                                      200,  200,  80,  20,  nan,     // NaN angle
                                      1e30, 1e30, 80,  20,  -1e30};  // far away
  const Result r = RunRequest(page.frame, values);
  EXPECT_EQ(r.status, 0);
  ASSERT_EQ(r.overlays.size(), 7u);
  for (const cv::Mat& overlay : r.overlays) {
    if (!overlay.empty()) {
      EXPECT_EQ(overlay.type(), CV_8UC4);
      EXPECT_LE(std::max(overlay.rows, overlay.cols), kLinePatchCap);
    }
  }
}

TEST(InpaintingRotImgBlockVersion, RefusesABlockBelow4x4) {
  ocr::log::ScopedCapture capture;
  std::vector<cv::Mat> overlays;
  std::vector<cv::Scalar> colors;
  EXPECT_EQ(
      InpaintingRotImgBlockVersion(MakePage({}).frame, {50, 50, 30, 0.5, 0}, overlays, colors), -1);
  EXPECT_TRUE(
      capture.Contains("Inpainting_Process: block_roi is too small: 3x31", ocr::log::kError));
  ASSERT_EQ(overlays.size(), 1u);
  EXPECT_TRUE(overlays[0].empty());
  EXPECT_EQ(colors, std::vector<cv::Scalar>{cv::Scalar::all(0)});
}

TEST(InpaintingRotImgLineVersion, HandlesPatchesTooSmallToErase) {
  const Page page = MakePage({{40, 40, 150, 40}});
  std::vector<double> values = page.values;
  values.insert(values.end(), {300, 300, 3, 2, 0});  // 3x2 patch
  values.insert(values.end(), {300, 300, 0, 9, 0});  // no patch
  ocr::log::ScopedCapture capture;
  std::vector<cv::Mat> overlays;
  std::vector<cv::Scalar> colors;
  EXPECT_EQ(InpaintingRotImgLineVersion(page.frame, values, overlays, colors), 0);
  ASSERT_EQ(overlays.size(), 3u);
  EXPECT_EQ(overlays[0].size(), page.boxes[0].size());
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
