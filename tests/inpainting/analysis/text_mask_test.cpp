// The text mask and its binarisation, and the whole analysis (mask and
// colour) under concurrency.
#include "inpainting/analysis/text_mask.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include <tbb/parallel_for.h>
#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "inpainting/analysis/binarization.h"
#include "inpainting/analysis/center_crop.h"
#include "inpainting/analysis/font_color.h"
#include "inpainting/analysis/synthetic_patch.h"

namespace {

using namespace ocr_inpainting;
using ocr::log::kInfo;
using ocr_testing::Background;
using ocr_testing::CoveredShare;
using ocr_testing::PatchRecipe;

struct Analysis {
  int status = 0;
  cv::Mat mask, font_mask;
  int vertical_partition = -1;
  cv::Scalar color;
};

// Mask and colour of a patch; the fill is the true background when given,
// else the pipeline's erase.
Analysis Analyse(const cv::Mat& patch, const cv::Mat& background = cv::Mat()) {
  Analysis a;
  a.status = GetMask(patch, a.mask, a.font_mask, a.vertical_partition);
  if (a.status == 0) {
    const cv::Mat fill = background.empty() ? ocr_testing::TeleaFill(patch, a.mask) : background;
    EXPECT_EQ(GetFontColor(patch, a.mask, fill, a.font_mask, a.color), 0);
  }
  return a;
}

TEST(GetMask, CoversTextNotBackgroundAndFindsTheDrawnColour) {
  PatchRecipe dark, light, red, blue;
  light.text_color = {240, 240, 240};
  light.background_color = {30, 40, 50};
  red.text_color = {200, 30, 30};
  red.background = Background::kGradient;
  red.background_color = {250, 240, 200};
  blue.text_color = {30, 30, 160};
  blue.background = Background::kTexture;
  blue.background_color = {220, 210, 190};
  blue.background_color2 = {8, 8, 8};
  for (const PatchRecipe& recipe : {dark, light, red, blue}) {
    const auto patch = ocr_testing::DrawTextPatch(recipe);
    const Analysis a = Analyse(patch.rgb, patch.background);
    ASSERT_EQ(a.status, 0);
    EXPECT_EQ(CoveredShare(a.mask, patch.TextPixels()), 1.0) << recipe.text_color;
    // Background more than 5 px from any text: beyond the edges and the dilation.
    cv::Mat distance;
    cv::distanceTransform(patch.coverage == 0, distance, cv::DIST_L2, cv::DIST_MASK_PRECISE);
    EXPECT_EQ(CoveredShare(a.mask, distance > 5), 0.0) << recipe.text_color;
    // The font mask holds the strokes, whichever way round the contrast is.
    EXPECT_GT(CoveredShare(a.font_mask, patch.TextPixels()), 0.97) << recipe.text_color;
    EXPECT_LT(CoveredShare(a.font_mask, patch.BackgroundPixels()), 0.01) << recipe.text_color;
    for (int c = 0; c < 3; ++c)
      EXPECT_NEAR(a.color[c], recipe.text_color[c], 6.0) << recipe.text_color << " -> " << a.color;
  }
}

TEST(GetMask, PatchesBelow4x4AreRefusedAnd4x4IsNotDilated) {
  for (const cv::Size size : {cv::Size(3, 20), cv::Size(20, 3), cv::Size(0, 0)}) {
    ocr::log::ScopedCapture capture;
    const Analysis a = Analyse(cv::Mat(size, CV_8UC3, cv::Scalar::all(128)));
    EXPECT_EQ(a.status, -1);
    EXPECT_EQ(a.mask.size(), size);
    EXPECT_EQ(cv::countNonZero(a.mask), 0);
    EXPECT_TRUE(capture.Contains(
        "Inpainting_Process: input image of GetInpaintingMask() is too small", ocr::log::kError));
  }
  cv::Mat patch(4, 4, CV_8UC3, cv::Scalar::all(230));
  patch(cv::Rect(1, 1, 2, 2)).setTo(cv::Scalar::all(20));
  ocr::log::ScopedCapture capture;
  const Analysis a = Analyse(patch);
  EXPECT_EQ(a.status, 0);
  EXPECT_EQ(a.mask.at<uchar>(1, 1), 255);
  EXPECT_TRUE(
      capture.Contains("Inpainting_Process: No dilation needed for 4*4 image. ", ocr::log::kWarn));
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

TEST(FindMask, FillsOutlinesButLeavesHolesOpen) {
  cv::Mat ring = cv::Mat::zeros(40, 40, CV_8UC1);
  cv::circle(ring, {20, 20}, 15, cv::Scalar(255), 3);
  cv::circle(ring, {20, 20}, 2, cv::Scalar(255), cv::FILLED);  // an island in the hole
  cv::Mat filled = cv::Mat::zeros(40, 40, CV_8UC1);
  EXPECT_EQ(FindMask(ring, &filled), 0);
  EXPECT_EQ(cv::norm(filled, ring, cv::NORM_INF), 0);
}

// White boxes on a black mask.
cv::Mat Boxes(cv::Size size, std::initializer_list<cv::Rect> boxes) {
  cv::Mat mask = cv::Mat::zeros(size, CV_8UC1);
  for (const cv::Rect& box : boxes)
    mask(box).setTo(255);
  return mask;
}

TEST(Partitions, WordGapsLineBandsAndTheirInkTests) {
  // A word gap must be wider than half the height, a band between lines
  // higher than a fifth of it; each piece needs 10 % ink.
  const cv::Size line(100, 20), block(100, 60);
  const struct {
    const char* name;
    bool (*search)(const cv::Mat&, int*);
    cv::Mat mask;
    bool worth_using;
    int split;
  } cases[] = {
      {"two words: split at the second", GetVerticalPartition,
       Boxes(line, {{5, 5, 25, 10}, {60, 5, 35, 10}}), true, 61},
      {"right piece under 10 % ink", GetVerticalPartition,
       Boxes(line, {{5, 5, 40, 10}, {80, 5, 3, 10}}), false, 100},
      {"left piece under 10 % ink", GetVerticalPartition,
       Boxes(line, {{2, 5, 3, 10}, {20, 5, 75, 10}}), false, 0},
      {"one word: unchanged", GetVerticalPartition, Boxes(line, {{5, 5, 90, 10}}), false, -7},
      {"band between lines", GetHorizontalPartition,
       Boxes(block, {{0, 5, 40, 15}, {0, 25, 100, 15}, {0, 45, 40, 10}}), true, 40},
      {"bottom piece under 10 % ink", GetHorizontalPartition,
       Boxes(block, {{0, 5, 40, 15}, {0, 25, 100, 15}, {0, 45, 10, 10}}), false, 60},
  };
  for (const auto& c : cases) {
    int split = -7;
    EXPECT_EQ(c.search(c.mask, &split), c.worth_using) << c.name;
    EXPECT_EQ(split, c.split) << c.name;
  }
}

TEST(Plausibility, CentreCropAndStrictBounds) {
  EXPECT_EQ(CenterCropRange(20), cv::Range(2, 18));
  EXPECT_EQ(CenterCropRange(5), cv::Range(0, 4));
  EXPECT_EQ(CenterCropRange(1), cv::Range(0, 1));
  cv::Mat mask = cv::Mat::zeros(10, 10, CV_8UC1);
  for (const auto& [white, plausible] :
       {std::pair{10, false}, std::pair{11, true}, std::pair{89, true}, std::pair{90, false}}) {
    mask.setTo(0);
    mask.reshape(1, 1).colRange(0, white).setTo(255);
    EXPECT_EQ(ValidBinaryResultCheck(mask, 100), plausible) << white;
  }
}

// A 30 x 30 mask whose centre crop (rows and columns 3..26) is `share`
// white, filled from the top.
cv::Mat MaskWithCentreShare(double share) {
  cv::Mat mask = cv::Mat::zeros(30, 30, CV_8UC1);
  mask(cv::Rect(3, 3, 24, static_cast<int>(24 * share))).setTo(255);
  return mask;
}

TEST(GetBinaryImgNormalized, ArbiterTable) {
  const cv::Mat plausible = MaskWithCentreShare(0.5), full = MaskWithCentreShare(1.0);
  const cv::Mat empty = cv::Mat::zeros(30, 30, CV_8UC1), short_ref = plausible.rowRange(0, 20);
  // A white ref inside a black frame: eroded in place, its top row and left
  // column would darken and break the tie between the two halves.
  cv::Mat framed = cv::Mat::zeros(32, 32, CV_8UC1), left = empty.clone();
  framed(cv::Rect(1, 1, 30, 30)).setTo(255);
  left.colRange(0, 15).setTo(255);
  const struct {
    cv::Mat ref, mask, candidate;
    int mask_check, candidate_check;
    bool replaced;
  } cases[] = {
      {plausible, full, plausible, 0, 1, true},
      {plausible, full, empty, 0, 0, false},
      {plausible, plausible, full, 1, 0, false},
      // Both plausible: the one closer to the eroded ref wins, a tie keeps...
      {plausible, plausible, 255 - plausible, 1, 1, false},
      {plausible, 255 - plausible, plausible, 1, 1, true},
      {plausible, plausible, plausible.clone(), 1, 1, false},
      {framed(cv::Rect(1, 1, 30, 30)), left, 255 - left, 1, 1, false},
      // ...but below 21 rows the mask is kept without comparing.
      {short_ref, 255 - short_ref, short_ref, 1, 1, false},
  };
  for (const auto& c : cases) {
    const std::string checks = "INPAINT_TAG: font_mask_check: " + std::to_string(c.mask_check) +
                               ", bw_candidate_check: " + std::to_string(c.candidate_check) + " .";
    ocr::log::ScopedCapture capture;
    cv::Mat mask = c.mask.clone();
    GetBinaryImgNormalized(c.ref, c.candidate, mask);
    EXPECT_EQ(cv::norm(mask, c.replaced ? c.candidate : c.mask, cv::NORM_INF), 0) << checks;
    EXPECT_TRUE(capture.Contains(checks, kInfo));
    EXPECT_EQ(capture.Contains("Inpainting_Process: use default font_mask", kInfo),
              c.candidate_check == 0)
        << checks;
  }
}

TEST(GetBinaryImg, NormalisesThePolarityOfTheWholeMask) {
  // CLAHE marks the bright background; compared with its inverse, the text wins.
  const auto patch = ocr_testing::DrawTextPatch(PatchRecipe{});
  cv::Mat dst = cv::Mat::zeros(patch.rgb.size(), CV_8UC1);
  GetBinaryImg(patch.rgb, patch.TextPixels(), 0, 0, false, false, kMethodClahe, dst);
  EXPECT_GT(CoveredShare(dst, patch.TextPixels()), 0.99);
  EXPECT_EQ(CoveredShare(dst, patch.BackgroundPixels()), 0.0);
}

TEST(AnalysisConcurrency, ParallelWorkersMatchTheSerialRun) {
  std::vector<cv::Mat> patches;
  for (const PatchRecipe& recipe : ocr_testing::VariedRecipes(48, 11))
    patches.push_back(ocr_testing::DrawTextPatch(recipe).rgb);
  std::vector<Analysis> serial;
  for (const cv::Mat& patch : patches)
    serial.push_back(Analyse(patch));
  // Each patch twice, so that workers run the same inputs at the same time.
  std::vector<Analysis> parallel(2 * patches.size());
  tbb::parallel_for(size_t{0}, parallel.size(),
                    [&](size_t i) { parallel[i] = Analyse(patches[i % patches.size()]); });
  for (size_t i = 0; i < parallel.size(); ++i) {
    const Analysis& expected = serial[i % patches.size()];
    EXPECT_EQ(cv::norm(parallel[i].mask, expected.mask, cv::NORM_INF), 0) << i;
    EXPECT_EQ(cv::norm(parallel[i].font_mask, expected.font_mask, cv::NORM_INF), 0) << i;
    EXPECT_EQ(parallel[i].vertical_partition, expected.vertical_partition) << i;
    EXPECT_EQ(parallel[i].color, expected.color) << i;
  }
}

}  // namespace
