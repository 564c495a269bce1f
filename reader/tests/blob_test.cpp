// Network input from the caller's pixels: the models were trained on B, G, R.
#include <vector>

#include <gtest/gtest.h>

#include "blob.h"

namespace textreader {
namespace {

TEST(WriteBlob, PutsBlueFirstNormalisesAndLeavesThePaddingAlone) {
  // One red R G B A pixel and one grey one, into planes 1 x 3 wide.
  cv::Mat rgba(1, 2, CV_8UC4);
  rgba.at<cv::Vec4b>(0, 0) = {255, 0, 0, 7};
  rgba.at<cv::Vec4b>(0, 1) = {51, 51, 51, 255};
  std::vector<float> planes(3 * 3, -9.0F);
  WriteBlob(rgba, LineNormalisation(), 1, 3, planes.data());
  // B plane, G plane, R plane; (x / 255 - 0.5) / 0.5.
  const std::vector<float> expected{-1.0F, -0.6F, -9.0F, -1.0F, -0.6F, -9.0F, 1.0F, -0.6F, -9.0F};
  for (std::size_t i = 0; i < planes.size(); ++i)
    EXPECT_NEAR(planes[i], expected[i], 1e-6) << i;
  const Normalisation imagenet = DetectorNormalisation();
  cv::Mat red(1, 1, CV_8UC3, cv::Scalar(255, 0, 0));
  WriteBlob(red, imagenet, 1, 1, planes.data());
  EXPECT_FLOAT_EQ(planes[0], -0.406F / 0.225F);
  EXPECT_FLOAT_EQ(planes[2], (1.0F - 0.485F) / 0.229F);
}

}  // namespace
}  // namespace textreader
