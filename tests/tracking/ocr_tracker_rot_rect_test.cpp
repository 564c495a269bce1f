#include "tracking/ocr_tracker_rot_rect.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "tracker_test_support.h"

namespace {

using tracking_testing::IsZero;
using tracking_testing::RotRectTrackerProbe;
using tracking_testing::Shifted;
using tracking_testing::TexturedFrame;
using tracking_testing::ZeroRect;
using zeph::OcrTrackerRotRect;

const cv::Size kFrameSize(640, 480);

cv::RotatedRect Rect(float angle, float width = 100.0f, float height = 20.0f) {
  return cv::RotatedRect(cv::Point2f(300.0f, 200.0f), cv::Size2f(width, height), angle);
}

void ExpectRectNear(const cv::RotatedRect& actual, const cv::RotatedRect& expected) {
  EXPECT_NEAR(actual.center.x, expected.center.x, 0.2f);
  EXPECT_NEAR(actual.center.y, expected.center.y, 0.2f);
  EXPECT_NEAR(actual.size.width, expected.size.width, 0.2f);
  EXPECT_NEAR(actual.size.height, expected.size.height, 0.2f);
  EXPECT_NEAR(actual.angle, expected.angle, 0.2f);
}

TEST(CheckTrackingAnglesScales, AnglesDifferPlainlyWithoutWrapping) {
  ocr::log::ScopedCapture log;
  // 170 against -175 is 345 degrees apart, not 15.
  EXPECT_TRUE(OcrTrackerRotRect::CheckTrackingAnglesScales({Rect(170)}, {Rect(-175)}));
  EXPECT_EQ(log.Count("OcrTrackerRotRect::Large angle change detected. ", ocr::log::kInfo), 1);
  EXPECT_TRUE(
      OcrTrackerRotRect::CheckTrackingAnglesScales({Rect(0), Rect(36)}, {Rect(0), Rect(0)}));
  log.Clear();
  EXPECT_FALSE(OcrTrackerRotRect::CheckTrackingAnglesScales({Rect(35)}, {Rect(0)}));
  EXPECT_FALSE(OcrTrackerRotRect::CheckTrackingAnglesScales({Rect(-20)}, {Rect(10)}));
  EXPECT_FALSE(log.Contains("OcrTrackerRotRect::Large angle change detected. "));
}

TEST(CheckTrackingAnglesScales, ScaleBoundsOfTwoPointFourAreStillAccepted) {
  EXPECT_FALSE(
      OcrTrackerRotRect::CheckTrackingAnglesScales({Rect(0, 100, 24)}, {Rect(0, 100, 10)}));
  EXPECT_FALSE(
      OcrTrackerRotRect::CheckTrackingAnglesScales({Rect(0, 100, 10)}, {Rect(0, 100, 24)}));
  EXPECT_FALSE(
      OcrTrackerRotRect::CheckTrackingAnglesScales({Rect(0, 240, 20)}, {Rect(0, 100, 20)}));
  EXPECT_TRUE(
      OcrTrackerRotRect::CheckTrackingAnglesScales({Rect(0, 100, 24.1f)}, {Rect(0, 100, 10)}));
  EXPECT_TRUE(
      OcrTrackerRotRect::CheckTrackingAnglesScales({Rect(0, 100, 9.9f)}, {Rect(0, 100, 24)}));
  EXPECT_TRUE(OcrTrackerRotRect::CheckTrackingAnglesScales({Rect(0, 241, 20)}, {Rect(0, 100, 20)}));
  // A zero size on either side is not compared.
  EXPECT_FALSE(OcrTrackerRotRect::CheckTrackingAnglesScales({Rect(0, 0, 0)}, {Rect(0, 100, 20)}));
  EXPECT_FALSE(OcrTrackerRotRect::CheckTrackingAnglesScales({Rect(0, 500, 90)}, {ZeroRect()}));
}

TEST(CheckTrackingAnglesScales, MoreThanHalfTheRegionsMustBeBadlyScaled) {
  const cv::RotatedRect same = Rect(0);
  const cv::RotatedRect both = Rect(0, 300, 60);  // width and height fail: counts once
  const std::vector<cv::RotatedRect> reference(4, same);
  EXPECT_FALSE(OcrTrackerRotRect::CheckTrackingAnglesScales({both, both, same, same}, reference));
  EXPECT_TRUE(OcrTrackerRotRect::CheckTrackingAnglesScales({both, both, both, same}, reference));
  EXPECT_TRUE(OcrTrackerRotRect::CheckTrackingAnglesScales({both}, {same}));
}

TEST(CheckTrackingAnglesScales, ListsOfDifferentLengthOrEmptyAreAccepted) {
  ocr::log::ScopedCapture log;
  EXPECT_FALSE(OcrTrackerRotRect::CheckTrackingAnglesScales({Rect(90)}, {Rect(0), Rect(0)}));
  EXPECT_EQ(log.Count("OcrTrackerRotRect::check angles are not from the same ocr result",
                      ocr::log::kWarn),
            1);
  EXPECT_FALSE(OcrTrackerRotRect::CheckTrackingAnglesScales({}, {}));
}

// Two regions on a textured frame: a wide one and a tilted one.
struct StartedRotRectTracker {
  cv::Mat frame = TexturedFrame(kFrameSize, 11);
  std::vector<cv::RotatedRect> rects = {
      cv::RotatedRect(cv::Point2f(320, 160), cv::Size2f(260, 50), 0.0f),
      cv::RotatedRect(cv::Point2f(300, 320), cv::Size2f(200, 40), 20.0f)};
  RotRectTrackerProbe tracker;

  StartedRotRectTracker() { tracker.StartTracker(frame, rects); }
};

TEST(OcrTrackerRotRect, StartTurnsEachRectangleIntoItsFourCorners) {
  StartedRotRectTracker started;
  ASSERT_EQ(started.tracker.corner_points_.size(), 8u);
  for (size_t i = 0; i < 2; ++i) {
    cv::Point2f points[4];
    started.rects[i].points(points);
    for (size_t k = 0; k < 4; ++k)
      EXPECT_EQ(started.tracker.corner_points_[4 * i + k], points[k]);
    EXPECT_EQ(started.tracker.ref_sizes_[i], started.rects[i].size);
  }
  ASSERT_EQ(started.tracker.ref_rects_.size(), 2u);
  EXPECT_EQ(started.tracker.ref_rects_[1].angle, 20.0f);
}

TEST(OcrTrackerRotRect, StillFrameGivesTheRectanglesBack) {
  StartedRotRectTracker started;
  std::vector<cv::RotatedRect> out;
  started.tracker.UpdateTracker(started.frame, &out);
  ASSERT_EQ(out.size(), 2u);
  ExpectRectNear(out[0], started.rects[0]);
  ExpectRectNear(out[1], started.rects[1]);
  EXPECT_EQ(started.tracker.ref_sizes_[1], out[1].size);
  EXPECT_EQ(started.tracker.ref_rects_[1].center, out[1].center);
}

TEST(OcrTrackerRotRect, HeightFollowsTheWidthWithTheReferenceAspectRatio) {
  StartedRotRectTracker started;
  const cv::Mat zoom = cv::getRotationMatrix2D(cv::Point2f(320, 240), 0.0, 1.2);
  cv::Mat zoomed;
  cv::warpAffine(started.frame, zoomed, zoom, kFrameSize, cv::INTER_LINEAR, cv::BORDER_REFLECT_101);
  std::vector<cv::RotatedRect> out;
  started.tracker.UpdateTracker(zoomed, &out);
  ASSERT_EQ(out.size(), 2u);
  for (size_t i = 0; i < 2; ++i) {
    EXPECT_NEAR(out[i].size.width, started.rects[i].size.width * 1.2f, 0.5f);
    EXPECT_FLOAT_EQ(out[i].size.height,
                    out[i].size.width * started.rects[i].size.height / started.rects[i].size.width);
  }
}

TEST(OcrTrackerRotRect, LostRegionStaysZero) {
  const cv::Mat frame = TexturedFrame(kFrameSize, 5);
  const std::vector<cv::RotatedRect> rects = {
      cv::RotatedRect(cv::Point2f(380, 240), cv::Size2f(300, 120), 0.0f),
      cv::RotatedRect(cv::Point2f(25, 240), cv::Size2f(30, 30), 0.0f)};
  RotRectTrackerProbe tracker;
  tracker.StartTracker(frame, rects);

  // The content moves left in steps until the small region is off the picture.
  std::vector<cv::RotatedRect> out;
  for (int step = 1; step <= 3; ++step)
    tracker.UpdateTracker(Shifted(frame, -20.0 * step, 0.0), &out);
  ASSERT_EQ(out.size(), 2u);
  EXPECT_NEAR(out[0].center.x, 320.0f, 0.5f);
  EXPECT_TRUE(IsZero(out[1]));
  EXPECT_EQ(tracker.ref_sizes_[1], cv::Size2f(0, 0));

  // Back in view of the camera, it stays lost.
  tracker.UpdateTracker(Shifted(frame, -40.0, 0.0), &out);
  ASSERT_EQ(out.size(), 2u);
  EXPECT_NEAR(out[0].center.x, 340.0f, 0.5f);
  EXPECT_TRUE(IsZero(out[1]));
  EXPECT_EQ(tracker.ref_sizes_[1], cv::Size2f(0, 0));
}

TEST(OcrTrackerRotRect, RejectedFrameBecomesTheNextReference) {
  const cv::Mat frame = TexturedFrame(kFrameSize, 13);
  const std::vector<cv::RotatedRect> rects = {
      cv::RotatedRect(cv::Point2f(320, 240), cv::Size2f(240, 60), 40.0f)};
  RotRectTrackerProbe tracker;
  tracker.StartTracker(frame, rects);
  std::vector<cv::RotatedRect> out;
  tracker.UpdateTracker(frame, &out);
  ASSERT_EQ(out.size(), 1u);
  EXPECT_NEAR(out[0].angle, 40.0f, 0.2f);

  // A reference far from the tracked angle rejects the frame...
  tracker.ref_rects_[0].angle = -10.0f;
  ocr::log::ScopedCapture log;
  tracker.UpdateTracker(frame, &out);
  ASSERT_EQ(out.size(), 1u);
  EXPECT_TRUE(IsZero(out[0]));
  EXPECT_EQ(log.Count("OcrTrackerRotRect::detect large angle/scale change. ", ocr::log::kInfo), 1);
  EXPECT_TRUE(IsZero(tracker.ref_rects_[0]));
  EXPECT_NEAR(tracker.ref_sizes_[0].width, 240.0f, 0.3f);  // updated before the check

  // ...and the zero rectangle it stored rejects the next one again (40 > 35 degrees).
  log.Clear();
  tracker.UpdateTracker(frame, &out);
  EXPECT_TRUE(IsZero(out[0]));
  EXPECT_EQ(log.Count("OcrTrackerRotRect::Large angle change detected. "), 1);
}

TEST(OcrTrackerRotRect, FailedPointUpdateGivesZeroRectangles) {
  StartedRotRectTracker started;
  started.tracker.min_tracked_points_ = 1 << 20;
  const std::vector<cv::RotatedRect> references = started.tracker.ref_rects_;
  ocr::log::ScopedCapture log;
  std::vector<cv::RotatedRect> out = {started.rects[0]};
  started.tracker.UpdateTracker(started.frame, &out);
  ASSERT_EQ(out.size(), 2u);
  EXPECT_TRUE(IsZero(out[0]));
  EXPECT_TRUE(IsZero(out[1]));
  EXPECT_EQ(log.Count("OcrTrackerRotRect::UpdateTracker ERROR: There should be four points for "
                      "each rect: 0 != 2 * 4",
                      ocr::log::kWarn),
            1);
  EXPECT_EQ(started.tracker.ref_rects_[0].center, references[0].center);
  EXPECT_EQ(started.tracker.ref_sizes_[0], started.rects[0].size);

  // Latched: the same answer on every later frame.
  started.tracker.UpdateTracker(started.frame, &out);
  ASSERT_EQ(out.size(), 2u);
  EXPECT_TRUE(IsZero(out[1]));
}

TEST(OcrTrackerRotRect, EmptyStartTracksNothing) {
  const cv::Mat frame = TexturedFrame(kFrameSize, 17);
  ocr::log::ScopedCapture log;
  RotRectTrackerProbe tracker;
  tracker.StartTracker(frame, {});
  EXPECT_EQ(log.Count("OcrTrackerRotRect::StartTracker: Input array is empty", ocr::log::kWarn), 1);
  for (int update = 0; update < 2; ++update) {
    log.Clear();
    std::vector<cv::RotatedRect> out = {ZeroRect()};
    tracker.UpdateTracker(frame, &out);
    EXPECT_TRUE(out.empty());
    EXPECT_TRUE(log.Contains("OcrTracker::UpdateTracker Failure: Nothing to track"));
    EXPECT_FALSE(log.Contains("OcrTrackerRotRect::detect large angle/scale change. "));
    EXPECT_FALSE(tracker.tracking_failed_);
  }
}

}  // namespace
