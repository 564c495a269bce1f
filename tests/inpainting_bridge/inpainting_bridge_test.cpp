#include <gtest/gtest.h>
#include <jni.h>

#include <vector>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "fake_jni.h"

extern "C" {
jint Java_com_quenda_tessel_inpainting_InpaintingJNI_InpaintingRotRectImg(JNIEnv*, jclass, jlong,
                                                                          jlongArray, jdoubleArray,
                                                                          jintArray);
jint Java_com_quenda_tessel_inpainting_InpaintingJNI_CalculateMeansStdDevs(JNIEnv*, jclass, jlong,
                                                                           jdoubleArray,
                                                                           jdoubleArray,
                                                                           jdoubleArray);
}

namespace {

using ocr_testing::FakeArray;
using ocr_testing::FakeJni;

constexpr jint kSentinel = 7;

class InpaintingBridgeTest : public testing::Test {
 protected:
  InpaintingBridgeTest() : frame_(120, 200, CV_8UC3, cv::Scalar(220, 220, 215)) {
    cv::putText(frame_, "Kaffee", cv::Point(40, 70), cv::FONT_HERSHEY_SIMPLEX, 1.0,
                cv::Scalar(20, 20, 20), 2, cv::LINE_AA);
    for (cv::Mat& output : outputs_)
      output = cv::Mat(2, 2, CV_8UC1, cv::Scalar(42));
  }

  jint Inpaint(FakeArray& addresses, FakeArray& rects, FakeArray& colors) {
    return Java_com_quenda_tessel_inpainting_InpaintingJNI_InpaintingRotRectImg(
        jni_.env(), nullptr, reinterpret_cast<jlong>(&frame_), FakeJni::AsLongArray(addresses),
        FakeJni::AsDoubleArray(rects), FakeJni::AsIntArray(colors));
  }

  std::vector<jlong> OutputAddresses(size_t count) {
    std::vector<jlong> addresses;
    for (size_t i = 0; i < count; ++i)
      addresses.push_back(reinterpret_cast<jlong>(&outputs_[i]));
    return addresses;
  }

  bool OutputsUntouched() const {
    for (const cv::Mat& output : outputs_) {
      if (output.size() != cv::Size(2, 2) || output.at<uchar>(0, 0) != 42)
        return false;
    }
    return true;
  }

  FakeJni jni_;
  cv::Mat frame_;
  cv::Mat outputs_[2];
  const std::vector<double> one_rect_ = {100, 60, 130, 40, 0};
};

TEST_F(InpaintingBridgeTest, AnswersIntoTheHostsMatsAndColourArray) {
  FakeArray& rects = jni_.Doubles(one_rect_);
  FakeArray& addresses = jni_.Longs(OutputAddresses(1));
  FakeArray& colors = jni_.Ints({kSentinel});
  ASSERT_EQ(Inpaint(addresses, rects, colors), 0);
  EXPECT_EQ(outputs_[0].type(), CV_8UC4);
  EXPECT_EQ(outputs_[0].size(), cv::Size(130, 40));
  EXPECT_EQ(colors.region_writes, 1);
  EXPECT_EQ(static_cast<uint32_t>(colors.ints[0]) >> 24, 0xFFu);
  EXPECT_EQ(rects.release_modes, std::vector<jint>{0});
  EXPECT_EQ(addresses.release_modes, std::vector<jint>{0});
  EXPECT_TRUE(jni_.Balanced());
}

TEST_F(InpaintingBridgeTest, RefusesRectanglesHandedOutInPlace) {
  FakeArray& rects = jni_.Doubles(one_rect_);
  rects.hand_out_copy = false;
  FakeArray& addresses = jni_.Longs(OutputAddresses(1));
  FakeArray& colors = jni_.Ints({kSentinel});
  ocr::log::ScopedCapture capture;
  EXPECT_EQ(Inpaint(addresses, rects, colors), -1);
  EXPECT_TRUE(capture.Contains(" Inpainting_Process: Error in copy rectangles in Java call",
                               ocr::log::kError));
  EXPECT_EQ(addresses.gets, 0);
  EXPECT_EQ(colors.region_writes, 0);
  EXPECT_TRUE(OutputsUntouched());
  EXPECT_TRUE(jni_.Balanced());
}

TEST_F(InpaintingBridgeTest, RefusesRectanglesThatCannotBeRead) {
  FakeArray& rects = jni_.Doubles(one_rect_);
  rects.fail_elements = true;
  FakeArray& addresses = jni_.Longs(OutputAddresses(1));
  FakeArray& colors = jni_.Ints({kSentinel});
  ocr::log::ScopedCapture capture;
  EXPECT_EQ(Inpaint(addresses, rects, colors), -1);
  EXPECT_TRUE(capture.Contains(" Inpainting_Process: Error in copy rectangles in Java call"));
  EXPECT_TRUE(rects.release_modes.empty());
}

TEST_F(InpaintingBridgeTest, RefusesOutputAddressesHandedOutInPlace) {
  FakeArray& rects = jni_.Doubles(one_rect_);
  FakeArray& addresses = jni_.Longs(OutputAddresses(1));
  addresses.hand_out_copy = false;
  FakeArray& colors = jni_.Ints({kSentinel});
  ocr::log::ScopedCapture capture;
  EXPECT_EQ(Inpaint(addresses, rects, colors), -1);
  EXPECT_TRUE(capture.Contains(
      " Inpainting_Process: Error in copy output matrix addresses in Java call", ocr::log::kError));
  // The rectangles were copied and released before the addresses were read.
  EXPECT_EQ(rects.release_modes, std::vector<jint>{0});
  EXPECT_EQ(colors.ints, std::vector<jint>{kSentinel});
  EXPECT_TRUE(OutputsUntouched());
  EXPECT_TRUE(jni_.Balanced());
}

TEST_F(InpaintingBridgeTest, ChecksTheColourArrayBeforeTheAddresses) {
  FakeArray& rects = jni_.Doubles(one_rect_);
  FakeArray& addresses = jni_.Longs(OutputAddresses(2));
  FakeArray& colors = jni_.Ints({kSentinel, kSentinel});
  ocr::log::ScopedCapture capture;
  EXPECT_EQ(Inpaint(addresses, rects, colors), -1);
  EXPECT_TRUE(capture.Contains(
      " Inpainting_Process: number of rectangles doesn't match number of font color values"));
  EXPECT_FALSE(capture.Contains(
      " Inpainting_Process: output matrices array is null or the number of output matrices "
      "doesn't match the number of rectangles"));
  EXPECT_EQ(addresses.gets, 0);
  EXPECT_TRUE(jni_.Balanced());
}

TEST_F(InpaintingBridgeTest, AnEmptyRequestReachesThePipelineAndIsRefusedThere) {
  // A VM that copies even an empty array lets the call through to the
  // strategies, which refuse an empty rectangle list.
  FakeArray& rects = jni_.Doubles({});
  FakeArray& addresses = jni_.Longs({});
  FakeArray& colors = jni_.Ints({});
  ocr::log::ScopedCapture capture;
  EXPECT_EQ(Inpaint(addresses, rects, colors), -1);
  EXPECT_TRUE(capture.Contains(" Inpainting_Process: Error in rotate_recs.size 0"));
  EXPECT_TRUE(capture.Contains("Error in Java call of Inpainting", ocr::log::kError));
  EXPECT_EQ(colors.region_writes, 0);
  EXPECT_TRUE(jni_.Balanced());
}

TEST_F(InpaintingBridgeTest, ColourStatisticsAcceptArraysInPlaceAndWriteThrough) {
  FakeArray& rects = jni_.Doubles({100, 100, 40, 20, 0});
  FakeArray& means = jni_.Doubles({-1, -1, -1});
  FakeArray& deviations = jni_.Doubles({-1, -1, -1});
  rects.hand_out_copy = means.hand_out_copy = deviations.hand_out_copy = false;
  const cv::Mat image(120, 200, CV_8UC3, cv::Scalar(10, 20, 30));
  EXPECT_EQ(Java_com_quenda_tessel_inpainting_InpaintingJNI_CalculateMeansStdDevs(
                jni_.env(), nullptr, reinterpret_cast<jlong>(&image), FakeJni::AsDoubleArray(rects),
                FakeJni::AsDoubleArray(means), FakeJni::AsDoubleArray(deviations)),
            0);
  EXPECT_EQ(means.doubles, (std::vector<double>{10, 20, 30}));
  EXPECT_EQ(deviations.doubles, (std::vector<double>{0, 0, 0}));
  EXPECT_TRUE(jni_.Balanced());
}

TEST_F(InpaintingBridgeTest, ColourStatisticsDropTheirArraysUnwrittenOnAMismatch) {
  FakeArray& rects = jni_.Doubles({100, 100, 40, 20, 0});
  FakeArray& means = jni_.Doubles({-1, -1, -1, -1});
  FakeArray& deviations = jni_.Doubles({-1, -1, -1, -1});
  const cv::Mat image(120, 200, CV_8UC3, cv::Scalar(10, 20, 30));
  EXPECT_EQ(Java_com_quenda_tessel_inpainting_InpaintingJNI_CalculateMeansStdDevs(
                jni_.env(), nullptr, reinterpret_cast<jlong>(&image), FakeJni::AsDoubleArray(rects),
                FakeJni::AsDoubleArray(means), FakeJni::AsDoubleArray(deviations)),
            -1);
  EXPECT_EQ(means.release_modes, std::vector<jint>{JNI_ABORT});
  EXPECT_EQ(deviations.release_modes, std::vector<jint>{JNI_ABORT});
  EXPECT_TRUE(jni_.Balanced());

  FakeArray& unreadable = jni_.Doubles({-1, -1, -1});
  unreadable.fail_elements = true;
  ocr::log::ScopedCapture capture;
  EXPECT_EQ(Java_com_quenda_tessel_inpainting_InpaintingJNI_CalculateMeansStdDevs(
                jni_.env(), nullptr, reinterpret_cast<jlong>(&image), FakeJni::AsDoubleArray(rects),
                FakeJni::AsDoubleArray(unreadable), FakeJni::AsDoubleArray(unreadable)),
            -1);
  EXPECT_TRUE(capture.Contains("Color_Adjustment: Error in copy arrays in Java call"));
}

}  // namespace
