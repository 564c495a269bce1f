#include "inpainting/analysis/text_mask.h"

#include <gtest/gtest.h>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "inpainting/analysis/synthetic_patch.h"

namespace {

using namespace ocr_inpainting;
using ocr::log::kError;
using ocr::log::kInfo;
using ocr::log::kWarn;
using ocr_testing::Background;
using ocr_testing::CoveredShare;
using ocr_testing::PatchSpec;

struct Masks {
  cv::Mat mask, font_mask;
  int vertical_partition = -1;
  int status = 0;
};

Masks RunGetMask(const cv::Mat& patch) {
  Masks out;
  out.status = GetMask(patch, out.mask, out.font_mask, out.vertical_partition);
  return out;
}

// Background pixels more than 5 pixels from any text: beyond the edge mask
// and the dilation.
cv::Mat FarBackground(const ocr_testing::SyntheticPatch& patch) {
  cv::Mat distance;
  cv::distanceTransform(patch.coverage == 0, distance, cv::DIST_L2, cv::DIST_MASK_PRECISE);
  return distance > 5;
}

TEST(GetMask, CoversTextNotBackgroundWithTextPolarityInBothMasks) {
  PatchSpec dark, light, red, blue;
  light.text_color = {240, 240, 240};
  light.background_color = {30, 40, 50};
  red.text_color = {200, 30, 30};
  red.background = Background::kGradient;
  red.background_color = {250, 240, 200};
  blue.text_color = {30, 30, 160};
  blue.background = Background::kTexture;
  blue.background_color = {220, 210, 190};
  blue.background_color2 = {8, 8, 8};
  for (const PatchSpec& spec : {dark, light, red, blue}) {
    const auto patch = ocr_testing::DrawTextPatch(spec);
    const Masks m = RunGetMask(patch.rgb);
    ASSERT_EQ(m.status, 0);
    EXPECT_EQ(CoveredShare(m.mask, patch.TextPixels()), 1.0) << spec.text_color;
    EXPECT_EQ(CoveredShare(m.mask, FarBackground(patch)), 0.0) << spec.text_color;
    // The font mask holds the strokes, whichever way round the contrast is.
    EXPECT_GT(CoveredShare(m.font_mask, patch.TextPixels()), 0.97) << spec.text_color;
    EXPECT_LT(CoveredShare(m.font_mask, patch.BackgroundPixels()), 0.01) << spec.text_color;
  }
}

TEST(GetMask, TwoWordsSplitAtTheSecondWord) {
  PatchSpec spec;
  spec.size = {240, 40};
  spec.lines = {"ab       cd"};
  const auto patch = ocr_testing::DrawTextPatch(spec);
  const Masks m = RunGetMask(patch.rgb);
  // The widest run of columns without ink lies between the words.
  cv::Mat ink_columns;
  cv::reduce(patch.coverage, ink_columns, 0, cv::REDUCE_MAX);
  std::vector<cv::Point> ink;
  cv::findNonZero(ink_columns, ink);
  size_t widest = 0;
  for (size_t i = 1; i + 1 < ink.size(); ++i) {
    if (ink[i + 1].x - ink[i].x > ink[widest + 1].x - ink[widest].x)
      widest = i;
  }
  EXPECT_GT(m.vertical_partition, ink[widest].x);
  EXPECT_LE(m.vertical_partition, ink[widest + 1].x + 2);
}

TEST(GetMask, PatchesBelow4x4AreRefusedAndEmptyOnesDoNotCrash) {
  for (const cv::Size size : {cv::Size(3, 20), cv::Size(20, 3), cv::Size(0, 0)}) {
    ocr::log::ScopedCapture capture;
    const Masks m = RunGetMask(cv::Mat(size, CV_8UC3, cv::Scalar::all(128)));
    EXPECT_EQ(m.status, -1);
    EXPECT_EQ(m.mask.size(), size);
    EXPECT_EQ(cv::countNonZero(m.mask), 0);
    EXPECT_EQ(m.vertical_partition, -1);
    EXPECT_TRUE(capture.Contains(
        "Inpainting_Process: input image of GetInpaintingMask() is too small", kError));
  }
}

TEST(GetMask, FourByFourGetsAMaskWithoutDilation) {
  cv::Mat patch(4, 4, CV_8UC3, cv::Scalar::all(230));
  patch(cv::Rect(1, 1, 2, 2)).setTo(cv::Scalar::all(20));
  ocr::log::ScopedCapture capture;
  const Masks m = RunGetMask(patch);
  EXPECT_EQ(m.status, 0);
  EXPECT_EQ(m.mask.at<uchar>(1, 1), 255);
  EXPECT_TRUE(capture.Contains("Inpainting_Process: No dilation needed for 4*4 image. ", kWarn));
  EXPECT_TRUE(capture.Contains("Inpainting_Process: Keep the same contour mask ", kInfo));
}

TEST(GetInpaintingMask, AllWhiteMaskGetsABlackFrame) {
  const cv::Mat patch(30, 30, CV_8UC3, cv::Scalar::all(128));
  const cv::Mat part_mask(30, 30, CV_8UC1, cv::Scalar(255));
  cv::Mat mask = cv::Mat::zeros(30, 30, CV_8UC1), font_mask = mask.clone();
  int column = -1;
  ocr::log::ScopedCapture capture;
  EXPECT_EQ(GetInpaintingMask(patch, part_mask, mask, font_mask, column), 0);
  EXPECT_TRUE(capture.Contains(" Inpainting: after dilate is all white...", kInfo));
  EXPECT_EQ(cv::countNonZero(mask), 28 * 28);
  EXPECT_EQ(cv::countNonZero(mask(cv::Rect(1, 1, 28, 28))), 28 * 28);
}

TEST(GetInpaintingMask, RegionOfALargerImageGivesTheSameMasksAsACopy) {
  // The block path hands in regions of the block patch and its edge mask.
  PatchSpec spec;
  spec.size = {200, 90};
  spec.lines = {"Menu", "Carte"};
  spec.background = Background::kTexture;
  spec.background_color2 = {6, 6, 6};
  const auto block = ocr_testing::DrawTextPatch(spec);
  cv::Mat edges;
  cv::morphologyEx(block.rgb, edges, cv::MORPH_GRADIENT, cv::Mat::ones(3, 3, CV_8U));
  cv::cvtColor(edges, edges, cv::COLOR_RGB2GRAY);
  edges = edges > 40;
  const cv::Rect region(20, 8, 150, 40);
  Masks view, copy;
  GetInpaintingMask(block.rgb(region), edges(region), view.mask, view.font_mask,
                    view.vertical_partition);
  GetInpaintingMask(block.rgb(region).clone(), edges(region).clone(), copy.mask, copy.font_mask,
                    copy.vertical_partition);
  EXPECT_EQ(cv::norm(view.mask, copy.mask, cv::NORM_INF), 0);
  EXPECT_EQ(cv::norm(view.font_mask, copy.font_mask, cv::NORM_INF), 0);
  EXPECT_EQ(view.vertical_partition, copy.vertical_partition);
}

TEST(PartialImgDilation, KeepsTwoPixelBandsOutOfTheDilation) {
  for (const int rows : {20, 21}) {
    cv::Mat mask = cv::Mat::zeros(rows, 30, CV_8UC1);
    mask.at<uchar>(2, 10) = 255;   // reaches row 1 when dilated
    mask.at<uchar>(10, 2) = 255;   // reaches column 1
    mask.at<uchar>(10, 27) = 255;  // reaches column 28
    PartialImgDilation(mask);
    EXPECT_EQ(mask.at<uchar>(1, 10), rows < 21 ? 0 : 255) << rows;
    EXPECT_EQ(mask.at<uchar>(3, 10), 255) << rows;
    EXPECT_EQ(mask.at<uchar>(10, 1), 0) << rows;
    EXPECT_EQ(mask.at<uchar>(10, 3), 255) << rows;
    EXPECT_EQ(mask.at<uchar>(10, 28), 0) << rows;
  }
}

TEST(FindMask, FillsOutlinesLeavesHolesOpenAndInputUntouched) {
  cv::Mat ring = cv::Mat::zeros(40, 40, CV_8UC1);
  cv::circle(ring, {20, 20}, 15, cv::Scalar(255), 3);
  cv::circle(ring, {20, 20}, 2, cv::Scalar(255), cv::FILLED);  // an island in the hole
  const cv::Mat input = ring.clone();
  cv::Mat filled = cv::Mat::zeros(40, 40, CV_8UC1);
  EXPECT_EQ(FindMask(ring, &filled), 0);
  EXPECT_EQ(cv::norm(ring, input, cv::NORM_INF), 0);
  EXPECT_EQ(cv::norm(filled, ring, cv::NORM_INF), 0);

  ocr::log::ScopedCapture capture;
  cv::Mat untouched(40, 40, CV_8UC1, cv::Scalar(7));
  EXPECT_EQ(FindMask(cv::Mat::zeros(40, 40, CV_8UC1), &untouched), 0);
  EXPECT_EQ(cv::countNonZero(untouched != 7), 0);
  EXPECT_TRUE(capture.Contains("Inpainting: No contours found", kWarn));
}

TEST(GetContourMask, RisingEdgesAndThePartMask) {
  cv::Mat grey = cv::Mat::zeros(40, 40, CV_8UC1);
  grey(cv::Rect(10, 10, 20, 20)).setTo(200);
  cv::Mat part_mask = cv::Mat::zeros(40, 40, CV_8UC1);
  part_mask(cv::Rect(33, 33, 5, 5)).setTo(255);
  cv::Mat contour_mask;
  EXPECT_EQ(GetContourMask(grey, part_mask, contour_mask), 0);
  EXPECT_EQ(contour_mask.at<uchar>(20, 10), 255);  // left side rises in +x
  EXPECT_EQ(contour_mask.at<uchar>(10, 20), 255);  // top side rises in +y
  EXPECT_EQ(contour_mask.at<uchar>(20, 20), 0);
  EXPECT_EQ(contour_mask.at<uchar>(20, 30), 0);  // right side falls
  EXPECT_EQ(cv::countNonZero(contour_mask(cv::Rect(33, 33, 5, 5))), 25);
}

}  // namespace
