#include "tracking/tracker_release.h"

#include <gtest/gtest.h>

#include "tracker_test_support.h"
#include "tracking/ocr_tracker_rot_rect.h"

namespace {

// Under the sanitizer build this also checks that destroying through the
// base is not reported as a mismatched deallocation.
TEST(ReleaseTracker, DestroysAStartedRotatedRectangleTracker) {
  const cv::Mat frame = tracking_testing::TexturedFrame(cv::Size(320, 240), 23);
  auto* tracker = new zeph::OcrTrackerRotRect();
  tracker->StartTracker(frame, {cv::RotatedRect(cv::Point2f(160, 120), cv::Size2f(120, 40), 5.0f),
                                cv::RotatedRect(cv::Point2f(160, 60), cv::Size2f(80, 20), 0.0f)});
  std::vector<cv::RotatedRect> out;
  tracker->UpdateTracker(frame, &out);
  ASSERT_EQ(out.size(), 2u);
  zeph::ReleaseTracker(tracker);
}

TEST(ReleaseTracker, IgnoresNull) {
  zeph::ReleaseTracker(nullptr);
}

}  // namespace
