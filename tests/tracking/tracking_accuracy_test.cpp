// The rotated-rectangle tracker on printed text lines filmed under a smooth,
// known camera motion: pan, a small rotation, zoom, a few blurred frames.
#include <gtest/gtest.h>

#include <vector>

#include "moving_text_scene.h"
#include "tracker_test_support.h"
#include "tracking/ocr_tracker_rot_rect.h"

namespace {

using tracking_testing::MeasureCentreError;
using tracking_testing::MovingTextScene;

TEST(TrackingAccuracy, CentresStayWithinThreePixelsOverThirtyFrames) {
  const MovingTextScene scene;
  ASSERT_EQ(scene.frame_count(), 31);
  zeph::OcrTrackerRotRect tracker;
  tracker.StartTracker(scene.Frame(0), scene.TruthRects(0));

  std::vector<cv::RotatedRect> tracked;
  for (int k = 1; k < scene.frame_count(); ++k) {
    tracker.UpdateTracker(scene.Frame(k), &tracked);
    const std::vector<cv::RotatedRect> truth = scene.TruthRects(k);
    ASSERT_EQ(tracked.size(), truth.size());
    for (size_t i = 0; i < tracked.size(); ++i)
      ASSERT_FALSE(tracking_testing::IsZero(tracked[i])) << "frame " << k << ", line " << i;
    EXPECT_LT(MeasureCentreError(tracked, truth).max, 3.0) << "frame " << k;
  }

  const std::vector<cv::RotatedRect> truth = scene.TruthRects(scene.frame_count() - 1);
  for (size_t i = 0; i < tracked.size(); ++i) {
    EXPECT_NEAR(tracked[i].angle, truth[i].angle, 0.5f) << "line " << i;
    EXPECT_NEAR(tracked[i].size.width / truth[i].size.width, 1.0f, 0.02f) << "line " << i;
    EXPECT_NEAR(tracked[i].size.height / truth[i].size.height, 1.0f, 0.02f) << "line " << i;
  }
  // The text grew with the zoom: more than the initial spread is covered.
  EXPECT_NEAR(tracker.GetCoverageLeft(), 1.12, 0.05);
}

}  // namespace
