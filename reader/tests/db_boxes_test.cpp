// Boxes from the detector's probability map.
#include <gtest/gtest.h>
#include <opencv2/imgproc.hpp>

#include "db_boxes.h"

namespace textreader {
namespace {

TEST(BoxesFromMap, GrowsTheCoreAndScalesItToTheImage) {
  // A 100 x 10 core on a 320 x 160 map of a 640 x 480 image.
  cv::Mat map(160, 320, CV_32F, cv::Scalar(0));
  map(cv::Rect(50, 40, 100, 10)).setTo(0.9F);
  const std::vector<cv::RotatedRect> boxes = BoxesFromMap(map, DbParameters{}, {640, 480});
  ASSERT_EQ(boxes.size(), 1U);
  // The contour runs through the pixel centres (99 x 9); 1.5 * 891 / 216 on
  // every side, then 2 and 3 times larger.
  const float d = 1.5F * 99 * 9 / 216;
  const float w = std::max(boxes[0].size.width, boxes[0].size.height);
  const float h = std::min(boxes[0].size.width, boxes[0].size.height);
  EXPECT_NEAR(w, 2 * (99 + 2 * d), 0.5);
  EXPECT_NEAR(h, 3 * (9 + 2 * d), 0.5);
  EXPECT_NEAR(boxes[0].center.x, 2 * 99.5F, 0.5);
  EXPECT_NEAR(boxes[0].center.y, 3 * 44.5F, 0.5);
}

TEST(BoxesFromMap, DropsFaintAndThinRegions) {
  cv::Mat map(200, 300, CV_32F, cv::Scalar(0));
  map(cv::Rect(20, 20, 100, 12)).setTo(0.9F);  // a line
  map(cv::Rect(20, 80, 100, 12)).setTo(0.5F);  // text, but faint on average
  map(cv::Rect(20, 120, 100, 2)).setTo(0.9F);  // a rule, too thin for text
  const std::vector<cv::RotatedRect> boxes = BoxesFromMap(map, DbParameters{}, {300, 200});
  ASSERT_EQ(boxes.size(), 1U);
  EXPECT_NEAR(boxes[0].center.y, 25.5F, 0.5);
  DbParameters lenient;
  lenient.box_threshold = 0.4F;
  EXPECT_EQ(BoxesFromMap(map, lenient, {300, 200}).size(), 2U);
}

}  // namespace
}  // namespace textreader
