#include "inpainting/analysis/binarization.h"

#include <gtest/gtest.h>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "inpainting/analysis/center_crop.h"
#include "inpainting/analysis/synthetic_patch.h"

namespace {

using namespace ocr_inpainting;
using ocr::log::kInfo;
using ocr_testing::CoveredShare;

TEST(CenterCropRange, DropsTenPercentEachSideUnlessNothingWouldRemain) {
  EXPECT_EQ(CenterCropRange(20), cv::Range(2, 18));
  EXPECT_EQ(CenterCropRange(5), cv::Range(0, 4));
  EXPECT_EQ(CenterCropRange(1), cv::Range(0, 1));
}

TEST(ValidBinaryResultCheck, BothBoundsAreStrict) {
  cv::Mat mask = cv::Mat::zeros(10, 10, CV_8UC1);
  const std::pair<int, bool> cases[] = {{10, false}, {11, true}, {89, true}, {90, false}};
  for (const auto& [white, plausible] : cases) {
    mask.setTo(0);
    mask.reshape(1, 1).colRange(0, white).setTo(255);
    EXPECT_EQ(ValidBinaryResultCheck(mask, 100), plausible) << white;
  }
}

// A mask whose centre crop (of a 30x30 ref: rows and columns 3..26) is
// `share` white, filled from the top.
cv::Mat MaskWithCentreShare(double share) {
  cv::Mat mask = cv::Mat::zeros(30, 30, CV_8UC1);
  mask(cv::Rect(3, 3, 24, static_cast<int>(24 * share))).setTo(255);
  return mask;
}

TEST(GetBinaryImgNormalized, ArbiterTable) {
  const cv::Mat ref = MaskWithCentreShare(0.5);
  const cv::Mat plausible = MaskWithCentreShare(0.5);
  const cv::Mat full = MaskWithCentreShare(1.0);
  const cv::Mat empty = cv::Mat::zeros(30, 30, CV_8UC1);
  struct Case {
    cv::Mat mask, candidate;
    bool replaced;
    bool default_logged;
    const char* checks;
  } cases[] = {
      {full, plausible, true, false, "INPAINT_TAG: font_mask_check: 0, bw_candidate_check: 1 ."},
      {full, empty, false, true, "INPAINT_TAG: font_mask_check: 0, bw_candidate_check: 0 ."},
      {plausible, full, false, true, "INPAINT_TAG: font_mask_check: 1, bw_candidate_check: 0 ."},
      // Both plausible: the one closer to the eroded ref wins, a tie keeps.
      {plausible, 255 - plausible, false, false,
       "INPAINT_TAG: font_mask_check: 1, bw_candidate_check: 1 ."},
      {255 - plausible, plausible, true, false,
       "INPAINT_TAG: font_mask_check: 1, bw_candidate_check: 1 ."},
      {plausible, plausible.clone(), false, false,
       "INPAINT_TAG: font_mask_check: 1, bw_candidate_check: 1 ."},
  };
  for (const Case& c : cases) {
    ocr::log::ScopedCapture capture;
    cv::Mat mask = c.mask.clone();
    GetBinaryImgNormalized(ref, c.candidate, mask);
    const cv::Mat& expected = c.replaced ? c.candidate : c.mask;
    EXPECT_EQ(cv::norm(mask, expected, cv::NORM_INF), 0) << c.checks;
    EXPECT_TRUE(capture.Contains(c.checks, kInfo));
    EXPECT_EQ(capture.Contains("Inpainting_Process: use default font_mask", kInfo),
              c.default_logged)
        << c.checks;
  }
}

TEST(GetBinaryImgNormalized, BelowTwentyOneRowsBothPlausibleKeepsTheMask) {
  const cv::Mat ref = MaskWithCentreShare(0.5).rowRange(0, 20);
  cv::Mat mask = 255 - ref;
  const cv::Mat before = mask.clone();
  GetBinaryImgNormalized(ref, ref, mask);
  EXPECT_EQ(cv::norm(mask, before, cv::NORM_INF), 0);
}

TEST(GetBinaryImgNormalized, ErodesACopySoARegionIgnoresItsSurroundings) {
  // White ref inside a black frame: eroded in place, its top row and left
  // column would darken and break the tie between the two halves below.
  cv::Mat parent = cv::Mat::zeros(32, 32, CV_8UC1);
  parent(cv::Rect(1, 1, 30, 30)).setTo(255);
  const cv::Mat ref = parent(cv::Rect(1, 1, 30, 30));
  cv::Mat mask = cv::Mat::zeros(30, 30, CV_8UC1);
  mask.colRange(0, 15).setTo(255);
  const cv::Mat candidate = 255 - mask;
  const cv::Mat before = mask.clone();
  GetBinaryImgNormalized(ref, candidate, mask);
  EXPECT_EQ(cv::norm(mask, before, cv::NORM_INF), 0);
}

ocr_testing::SyntheticPatch DarkTextPatch() {
  return ocr_testing::DrawTextPatch(ocr_testing::PatchSpec{});
}

TEST(BinarisationMethods, HlsMarksDarkClaheMarksBrightPcaSeparates) {
  const auto patch = DarkTextPatch();
  const cv::Mat text = patch.TextPixels();
  const cv::Mat background = patch.BackgroundPixels();
  cv::Mat hls, clahe, pca;
  HLSThreshold(patch.rgb, &hls);
  BinarizationByClahe(patch.rgb, &clahe);
  cv::Mat lab(patch.rgb.size(), CV_32FC3);
  GetLabImage(patch.rgb, &lab);
  PCAThreshold(lab, &pca);
  EXPECT_EQ(CoveredShare(hls, text), 1.0);
  EXPECT_EQ(CoveredShare(hls, background), 0.0);
  // The equalisation may lift a few stroke pixels over the level.
  EXPECT_LT(CoveredShare(clahe, text), 0.01);
  EXPECT_EQ(CoveredShare(clahe, background), 1.0);
  // Either polarity, but one of the two classes exactly.
  const cv::Mat pca_text = CoveredShare(pca, text) > 0.5 ? pca : 255 - pca;
  EXPECT_EQ(CoveredShare(pca_text, text), 1.0);
  EXPECT_EQ(CoveredShare(pca_text, background), 0.0);
}

TEST(RGBSobel, KeepsOnlyEdgesRisingInXAndY) {
  cv::Mat grey = cv::Mat::zeros(40, 40, CV_8UC1);
  grey(cv::Rect(10, 10, 20, 20)).setTo(200);
  ocr::log::ScopedCapture capture;
  cv::Mat edges;
  RGBSobel(grey, &edges);
  EXPECT_EQ(edges.at<uchar>(20, 10), 255);  // left side, rising in +x
  EXPECT_EQ(edges.at<uchar>(10, 20), 255);  // top side, rising in +y
  EXPECT_EQ(edges.at<uchar>(20, 29), 0);    // right side, falling
  EXPECT_EQ(edges.at<uchar>(29, 20), 0);    // bottom side, falling
  EXPECT_EQ(capture.Texts(), (std::vector<std::string>{"Inpainting_Process: start RGB Sobel",
                                                       "Inpainting_Process: finish RGB Sobel"}));
}

TEST(GetBinaryImg, SplitsOnlyForValidPartitionsAndKeepsDstWithoutOne) {
  const auto patch = DarkTextPatch();  // 160 x 40
  const cv::Mat ref = patch.TextPixels();
  struct Case {
    int v, h;
    bool vertical, horizon;
    bool splits;
  } cases[] = {
      {0, 0, true, false, false},  {160, 0, true, false, false}, {80, 0, false, false, false},
      {0, 40, false, true, false}, {80, 0, true, false, true},   {0, 20, false, true, true},
      {80, 20, true, true, true},
  };
  for (const Case& c : cases) {
    ocr::log::ScopedCapture capture;
    cv::Mat dst = cv::Mat::zeros(patch.rgb.size(), CV_8UC1);
    EXPECT_EQ(GetBinaryImg(patch.rgb, ref, c.v, c.h, c.vertical, c.horizon, kMethodHls, dst), 0);
    // Split: every part binarised, text marked. No split: the empty mask
    // and its full inverse are both implausible, so dst stays empty.
    EXPECT_EQ(CoveredShare(dst, ref), c.splits ? 1.0 : 0.0) << c.v << " " << c.h;
    EXPECT_EQ(capture.Contains("Inpainting_Process: keep init HLS binariztion image", kInfo),
              !c.splits);
    EXPECT_EQ(capture.Contains("INPAINT_TAG : Sperate to four parts", kInfo),
              c.vertical && c.horizon && c.splits);
  }
}

TEST(GetBinaryImg, ClaheWithoutSplitRebinarisesAndNormalisesPolarity) {
  const auto patch = DarkTextPatch();
  cv::Mat dst = cv::Mat::zeros(patch.rgb.size(), CV_8UC1);
  ocr::log::ScopedCapture capture;
  GetBinaryImg(patch.rgb, patch.TextPixels(), 0, 0, false, false, kMethodClahe, dst);
  EXPECT_TRUE(capture.Contains("INPAINT_TAG: obtain clahe binary image", kInfo));
  // CLAHE marks the bright background; the arbiter turns it to the text.
  EXPECT_GT(CoveredShare(dst, patch.TextPixels()), 0.99);
  EXPECT_EQ(CoveredShare(dst, patch.BackgroundPixels()), 0.0);

  capture.Clear();
  GetBinaryImg(patch.rgb, patch.TextPixels(), 80, 0, true, false, 9, dst);
  EXPECT_EQ(capture.Count("Inpainting_Process: No need to get sub binary image", kInfo), 2);
}

}  // namespace
