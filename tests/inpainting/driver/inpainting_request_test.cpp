#include "inpainting/driver/inpainting_request.h"

#include <gtest/gtest.h>

#include <limits>
#include <vector>

#include <opencv2/core.hpp>

#include "common/log.h"
#include "inpainting/driver/color_packing.h"

namespace ocr_inpainting {
namespace {

// The host unpacks these bits; the packing must not drift.
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

TEST(RequestRectCount, TruncatesAFifthOfTheLength) {
  EXPECT_EQ(RequestRectCount(4), 0);
  EXPECT_EQ(RequestRectCount(7), 1);
  EXPECT_EQ(RequestRectCount(12), 2);
  // Computed in double, 5k never falls short of k.
  for (size_t k = 0; k < 200000; k += 997)
    ASSERT_EQ(RequestRectCount(5 * k), static_cast<int>(k));
}

// Neither a refused request nor a wrong number of overlays may write into the
// host's matrices or colours. (The bridge cannot produce the second case: it
// sizes the outputs from the same rectangle count.)
TEST(AnswerInpaintingRequest, WritesNothingUnlessEveryOutputIsAnswered) {
  const cv::Mat frame(60, 100, CV_8UC3, cv::Scalar(200, 190, 180));
  const std::vector<double> one = {50, 30, 40, 12, 0};
  cv::Mat outputs[2] = {cv::Mat(2, 2, CV_8UC1, cv::Scalar(42)),
                        cv::Mat(2, 2, CV_8UC1, cv::Scalar(42))};
  std::vector<int32_t> packed = {7};
  ocr::log::ScopedCapture capture;
  EXPECT_EQ(AnswerInpaintingRequest(cv::Mat(), one, {&outputs[0]}, packed), -1);
  EXPECT_TRUE(capture.Contains("Error in Java call of Inpainting", ocr::log::kError));
  EXPECT_TRUE(capture.Contains("Inpainting_Process: image size 0 ", ocr::log::kInfo));

  EXPECT_EQ(AnswerInpaintingRequest(frame, one, {&outputs[0], &outputs[1]}, packed), -1);
  EXPECT_TRUE(
      capture.Contains("Error in Java call of Inpainting. The number of output images is incorrect",
                       ocr::log::kError));
  for (const cv::Mat& output : outputs) {
    EXPECT_EQ(output.size(), cv::Size(2, 2));
    EXPECT_EQ(output.at<uchar>(0, 0), 42);
  }
  EXPECT_EQ(packed, std::vector<int32_t>{7});
}

}  // namespace
}  // namespace ocr_inpainting
