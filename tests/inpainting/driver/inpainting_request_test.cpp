#include "inpainting/driver/inpainting_request.h"

#include <gtest/gtest.h>

#include <limits>
#include <vector>

#include <opencv2/core.hpp>

#include "common/log.h"
#include "inpainting/driver/color_packing.h"
#include "inpainting/driver/rect_decoding.h"
#include "text_scene_support.h"

namespace ocr_inpainting {
namespace {

TEST(PackFontColor, RoundsHalfToEvenAndClamps) {
  EXPECT_EQ(static_cast<uint32_t>(PackFontColor({300.4, -2, 127.5})), 0xFF8000FFu);
  EXPECT_EQ(static_cast<uint32_t>(PackFontColor({10, 20, 30})), 0xFF1E140Au);
  EXPECT_EQ(static_cast<uint32_t>(PackFontColor({0.5, 1.5, 2.5})), 0xFF020200u);
  EXPECT_EQ(static_cast<uint32_t>(PackFontColor({254.5, 255.5, -0.5})), 0xFF00FFFEu);
  EXPECT_EQ(static_cast<uint32_t>(PackFontColor({253.49, 0.51, 99.999, 77})), 0xFF6401FDu);
  const double nan = std::numeric_limits<double>::quiet_NaN();
  const double inf = std::numeric_limits<double>::infinity();
  EXPECT_EQ(static_cast<uint32_t>(PackFontColor({nan, inf, -inf})), 0xFF00FF00u);
}

TEST(TransformVector2RotatedRect, DecodesCompleteGroupsOfFive) {
  const std::vector<cv::RotatedRect> rects =
      TransformVector2RotatedRect({1.5, 2.5, 30, 40, -12.25, 7, 8, 9, 10, 11, 99, 98});
  ASSERT_EQ(rects.size(), 2u);
  EXPECT_EQ(rects[0].center, cv::Point2f(1.5f, 2.5f));
  EXPECT_EQ(rects[0].size, cv::Size2f(30, 40));
  EXPECT_EQ(rects[0].angle, -12.25f);
  EXPECT_EQ(rects[1].center, cv::Point2f(7, 8));
  EXPECT_EQ(rects[1].angle, 11.0f);
  EXPECT_TRUE(TransformVector2RotatedRect({1, 2, 3, 4}).empty());
  // Values beyond float range narrow to infinity.
  EXPECT_EQ(TransformVector2RotatedRect({1e300, 0, 0, 0, 0})[0].center.x,
            std::numeric_limits<float>::infinity());
}

TEST(RequestRectCount, TruncatesAFifthOfTheLength) {
  EXPECT_EQ(RequestRectCount(0), 0);
  EXPECT_EQ(RequestRectCount(4), 0);
  EXPECT_EQ(RequestRectCount(5), 1);
  EXPECT_EQ(RequestRectCount(7), 1);
  EXPECT_EQ(RequestRectCount(10), 2);
  EXPECT_EQ(RequestRectCount(12), 2);
  for (size_t k = 1; k < 200000; k += 997)
    ASSERT_EQ(RequestRectCount(5 * k), static_cast<int>(k));
}

class AnswerInpaintingRequestTest : public testing::Test {
 protected:
  AnswerInpaintingRequestTest()
      : scene_(ocr_testing::MakeRandomTextScene(ocr_testing::Background::kGradient, {480, 320}, 3,
                                                5)) {
    for (cv::Mat& output : outputs_)
      output = cv::Mat(2, 2, CV_8UC1, cv::Scalar(42));
  }

  std::vector<cv::Mat*> OutputPointers(size_t count) {
    std::vector<cv::Mat*> pointers;
    for (size_t i = 0; i < count; ++i)
      pointers.push_back(&outputs_[i]);
    return pointers;
  }

  bool OutputsUntouched() const {
    for (const cv::Mat& output : outputs_) {
      if (output.size() != cv::Size(2, 2) || output.at<uchar>(0, 0) != 42)
        return false;
    }
    return true;
  }

  ocr_testing::TextScene scene_;
  cv::Mat outputs_[3];
  std::vector<int32_t> packed_ = {7};
};

TEST_F(AnswerInpaintingRequestTest, AssignsOverlaysAndPacksColours) {
  ocr::log::ScopedCapture capture;
  ASSERT_EQ(AnswerInpaintingRequest(scene_.frame, scene_.values, OutputPointers(3), packed_), 0);
  ASSERT_EQ(packed_.size(), 3u);
  for (size_t i = 0; i < 3; ++i) {
    EXPECT_EQ(outputs_[i].type(), CV_8UC4) << i;
    EXPECT_EQ(static_cast<uint32_t>(packed_[i]) >> 24, 0xFFu) << i;
  }
  const std::vector<std::string> expected = {
      "Inpainting_Process: num_results 3 ", "Inpainting_Process: image size 3 ",
      "Inpainting_Process: return to jObjectArray", "Inpainting_Process: begin fontcolor. ",
      "Inpainting_Process: finish fontcolor. "};
  for (const std::string& text : expected)
    EXPECT_TRUE(capture.Contains(text, ocr::log::kInfo)) << text;
}

TEST_F(AnswerInpaintingRequestTest, PassesThePipelineStatusThroughAndWritesNothing) {
  ocr::log::ScopedCapture capture;
  EXPECT_EQ(AnswerInpaintingRequest(cv::Mat(), scene_.values, OutputPointers(3), packed_), -1);
  EXPECT_TRUE(capture.Contains("Error in Java call of Inpainting", ocr::log::kError));
  EXPECT_TRUE(capture.Contains("Inpainting_Process: image size 0 ", ocr::log::kInfo));
  EXPECT_TRUE(OutputsUntouched());
  EXPECT_EQ(packed_, std::vector<int32_t>{7});

  // Seven values: one rectangle for the host, refused by the pipeline.
  std::vector<double> seven(scene_.values.begin(), scene_.values.begin() + 7);
  capture.Clear();
  EXPECT_EQ(AnswerInpaintingRequest(scene_.frame, seven, OutputPointers(1), packed_), -1);
  EXPECT_TRUE(capture.Contains(" Inpainting_Process: Error in rotate_recs.size 7"));
  EXPECT_TRUE(OutputsUntouched());
}

TEST_F(AnswerInpaintingRequestTest, RefusesAWrongNumberOfOverlays) {
  ocr::log::ScopedCapture capture;
  EXPECT_EQ(AnswerInpaintingRequest(scene_.frame, scene_.values, OutputPointers(2), packed_), -1);
  EXPECT_TRUE(
      capture.Contains("Error in Java call of Inpainting. The number of output images is incorrect",
                       ocr::log::kError));
  EXPECT_TRUE(OutputsUntouched());
  EXPECT_EQ(packed_, std::vector<int32_t>{7});
}

TEST_F(AnswerInpaintingRequestTest, TinyImageSucceedsWithEmptyOverlaysAndBlack) {
  const cv::Mat tiny(3, 3, CV_8UC3, cv::Scalar::all(100));
  EXPECT_EQ(AnswerInpaintingRequest(tiny, {1, 1, 2, 2, 0}, OutputPointers(1), packed_), 0);
  EXPECT_TRUE(outputs_[0].empty());
  EXPECT_EQ(packed_, std::vector<int32_t>{static_cast<int32_t>(0xFF000000u)});
}

}  // namespace
}  // namespace ocr_inpainting
