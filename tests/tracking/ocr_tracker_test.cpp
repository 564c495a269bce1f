// The point tracker, the rotated-rectangle tracker over it, and their release.
#include "tracking/ocr_tracker.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <cmath>
#include <iterator>
#include <string>
#include <utility>
#include <vector>

#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "moving_text_scene.h"
#include "tracking/ocr_tracker_rot_rect.h"
#include "tracking/tracker_release.h"

namespace {

using ocr::log::kInfo;
using ocr::log::kWarn;
using zeph::OcrTracker;
using zeph::OcrTrackerRotRect;
using Points = std::vector<cv::Point2f>;
using Rects = std::vector<cv::RotatedRect>;

// Opens the trackers' state to the tests.
class PointTrackerProbe : public OcrTracker {
 public:
  using OcrTracker::corner_points_;
  using OcrTracker::min_tracked_points_;
  using OcrTracker::tracking_failed_;
  using OcrTracker::tracking_points_;
};

class RotRectTrackerProbe : public OcrTrackerRotRect {
 public:
  using OcrTracker::initial_height_;
  using OcrTracker::initial_width_;
  using OcrTracker::min_tracked_points_;
  using OcrTracker::tracking_failed_;
  using OcrTrackerRotRect::ref_rects_;
  using OcrTrackerRotRect::ref_sizes_;
};

// 640 x 480 RGB frame of smoothed random noise: strong texture everywhere.
cv::Mat TexturedFrame(uint64_t seed) {
  cv::Mat frame(480, 640, CV_8UC3);
  cv::RNG(seed).fill(frame, cv::RNG::UNIFORM, 0, 256);
  cv::GaussianBlur(frame, frame, cv::Size(0, 0), 1.5);
  cv::normalize(frame, frame, 0, 255, cv::NORM_MINMAX);
  return frame;
}

// `frame` with its content moved right by dx, the uncovered border reflected.
cv::Mat ShiftedX(const cv::Mat& frame, double dx) {
  const cv::Mat shift = (cv::Mat_<double>(2, 3) << 1, 0, dx, 0, 1, 0);
  cv::Mat moved;
  cv::warpAffine(frame, moved, shift, frame.size(), cv::INTER_LINEAR, cv::BORDER_REFLECT_101);
  return moved;
}

// The corners of an upright quadrilateral, in the order of cv::RotatedRect::points.
Points Quad(float left, float top, float right, float bottom) {
  return {{left, bottom}, {left, top}, {right, top}, {right, bottom}};
}

bool IsZero(const cv::RotatedRect& rect) {
  return rect.center == cv::Point2f() && rect.size == cv::Size2f() && rect.angle == 0.0f;
}

// Largest distance between corresponding points (infinite for lists of different lengths).
float MaxDistance(const Points& a, const Points& b) {
  float max = a.size() == b.size() ? 0.0f : INFINITY;
  for (size_t i = 0; i < std::min(a.size(), b.size()); ++i)
    max = std::max(max, static_cast<float>(cv::norm(a[i] - b[i])));
  return max;
}

// A tracker started on a textured frame with two quadrilaterals in the middle.
struct StartedTracker {
  cv::Mat frame = TexturedFrame(7);
  Points corners = Quad(200, 150, 420, 210);
  PointTrackerProbe tracker;

  StartedTracker() {
    const Points second = Quad(180, 260, 460, 330);
    corners.insert(corners.end(), second.begin(), second.end());
    tracker.StartTracker(frame, corners);
  }
};

TEST(OcrTrackerStart, ThresholdIsFivePercentOfThePointsButAtLeastTen) {
  for (const auto& [squares, threshold] :
       {std::pair{10, 10}, std::pair{50, 10}, std::pair{55, 11}}) {
    // White 12 px squares on black, ten to a row: four good features each.
    cv::Mat frame(400, 640, CV_8UC3, cv::Scalar::all(0));
    for (int i = 0; i < squares; ++i)
      cv::rectangle(frame, cv::Rect(20 + (i % 10) * 30, 20 + (i / 10) * 30, 12, 12),
                    cv::Scalar::all(255), cv::FILLED);
    PointTrackerProbe tracker;
    tracker.StartTracker(frame, Quad(0, 0, 639, 399));
    EXPECT_EQ(tracker.tracking_points_.size(), 4u * squares);
    EXPECT_EQ(tracker.min_tracked_points_, threshold) << squares << " squares";
  }
}

TEST(OcrTrackerHelpers, FilterPointsInVectorsRefusesUnequalLengths) {
  std::vector<unsigned char> flags = {1, 0, 1};
  Points a = {{0, 0}, {1, 1}, {2, 2}}, b = {{0, 0}, {1, 1}};
  EXPECT_EQ(OcrTracker::FilterPointsInVectors<unsigned char>(flags, a, b, 1), UINT_MAX);
  EXPECT_EQ(flags, (std::vector<unsigned char>{1, 0, 1}));
  EXPECT_EQ(a, (Points{{0, 0}, {1, 1}, {2, 2}}));
  EXPECT_EQ(b.size(), 2u);
}

TEST(OcrTrackerUpdate, ZeroesQuadrilateralsThrownFarOrWhollyOffThePicture) {
  StartedTracker started;
  Points corners = started.corners;
  const Points extreme = {{300, 100}, {300, 50}, {2 * 640 + 1, 50}, {400, 100}};
  const Points left_of_picture = Quad(-200, 100, -20, 140), straddling = Quad(-50, 100, 30, 140);
  for (const Points* quad : {&extreme, &left_of_picture, &straddling})
    corners.insert(corners.end(), quad->begin(), quad->end());
  started.tracker.corner_points_ = corners;

  ocr::log::ScopedCapture log;
  Points out;
  started.tracker.UpdateTracker(started.frame, &out);
  ASSERT_EQ(out.size(), corners.size());
  EXPECT_LT(MaxDistance(Points(out.begin(), out.begin() + 8), started.corners), 0.05f);
  EXPECT_EQ(Points(out.begin() + 8, out.begin() + 16), Points(8));
  EXPECT_LT(MaxDistance(Points(out.begin() + 16, out.end()), straddling), 0.05f);
  // Only the far quadrilateral is logged; the one off the picture goes silently.
  EXPECT_EQ(log.Count("OcrTracker::Corner points are extreme large. ", ocr::log::kDebug), 1);
  // Zeroed quadrilaterals are carried on as four points at one spot.
  EXPECT_EQ(started.tracker.corner_points_, out);
}

TEST(OcrTrackerUpdate, TooFewTrackedPointsLatchTheFailureUntilTheNextStart) {
  StartedTracker started;
  const size_t points = started.tracker.tracking_points_.size();
  started.tracker.min_tracked_points_ = static_cast<int>(points) + 1;
  ocr::log::ScopedCapture log;
  Points out = {{1, 2}};
  started.tracker.UpdateTracker(started.frame, &out);
  const std::string count = std::to_string(points);
  EXPECT_EQ(
      log.Count("OcrTracker::UpdateTracker Failure: Too few points tracked: " + count + "/" + count,
                kWarn),
      1);
  EXPECT_TRUE(started.tracker.tracking_failed_);
  // From now on every update logs one line and changes nothing.
  for (int update = 0; update < 2; ++update) {
    log.Clear();
    started.tracker.UpdateTracker(ShiftedX(started.frame, 3.0), &out);
    EXPECT_EQ(log.Texts(),
              (std::vector<std::string>{
                  "OcrTracker::UpdateTracker Failure: Previous tracking failed already. "}));
    EXPECT_EQ(out, (Points{{1, 2}}));
  }
  started.tracker.StartTracker(started.frame, started.corners);
  started.tracker.UpdateTracker(started.frame, &out);
  EXPECT_LT(MaxDistance(out, started.corners), 0.05f);
}

TEST(OcrTrackerUpdate, FailedHomographyEndsTheUpdateWithoutLatching) {
  StartedTracker started;
  // Points on one line cannot give a homography.
  Points line;
  for (int i = 0; i < 40; ++i)
    line.emplace_back(210.0f + 5.0f * static_cast<float>(i), 180.0f);
  started.tracker.tracking_points_ = line;
  started.tracker.min_tracked_points_ = 10;
  ocr::log::ScopedCapture log;
  Points out;
  for (int update = 1; update <= 2; ++update) {
    started.tracker.UpdateTracker(started.frame, &out);
    EXPECT_EQ(log.Count("OcrTracker::UpdateTracker Failure: findHomography failed", kWarn), update);
    EXPECT_TRUE(out.empty());
  }
}

TEST(OcrTrackerUpdate, EmptySearchRegionIsAnOpenCvErrorNotAHang) {
  StartedTracker started;
  started.tracker.tracking_points_.assign(20, cv::Point2f(5000.0f, 5000.0f));
  Points out;
  EXPECT_THROW(started.tracker.UpdateTracker(started.frame, &out), cv::Exception);
}

cv::RotatedRect Rect(float angle, float width = 100.0f, float height = 20.0f) {
  return cv::RotatedRect(cv::Point2f(300.0f, 200.0f), cv::Size2f(width, height), angle);
}

TEST(CheckTrackingAnglesScales, LargeTurnOrMostRegionsBadlyScaledRejectTheFrame) {
  const cv::RotatedRect same = Rect(0), both = Rect(0, 300, 60);  // both fail: counts once
  const Rects four(4, same);
  const struct {
    Rects current, reference;
    bool rejected;
  } cases[] = {
      // Plain differences: 170 against -175 is 345 degrees apart, not 15.
      {{Rect(170)}, {Rect(-175)}, true},
      {{same, Rect(36)}, {same, same}, true},
      {{Rect(35)}, {same}, false},
      // Ratios of exactly 2.4 either way are still accepted.
      {{Rect(0, 100, 24)}, {Rect(0, 100, 10)}, false},
      {{Rect(0, 100, 10)}, {Rect(0, 100, 24)}, false},
      {{Rect(0, 100, 24.1f)}, {Rect(0, 100, 10)}, true},
      {{Rect(0, 100, 9.9f)}, {Rect(0, 100, 24)}, true},
      {{Rect(0, 241, 20)}, {same}, true},
      {{Rect(0, 0, 0)}, {same}, false},  // a zero size is not compared
      {{both, both, same, same}, four, false},
      {{both, both, both, same}, four, true},
      {{Rect(90)}, {same, same}, false},  // not from the same OCR result
      {{}, {}, false},
  };
  for (size_t i = 0; i < std::size(cases); ++i) {
    ocr::log::ScopedCapture log;
    EXPECT_EQ(OcrTrackerRotRect::CheckTrackingAnglesScales(cases[i].current, cases[i].reference),
              cases[i].rejected)
        << "case " << i;
    EXPECT_EQ(log.Contains("OcrTrackerRotRect::Large angle change detected. ", kInfo), i < 2);
  }
}

TEST(OcrTrackerRotRect, LostRegionStaysZero) {
  const cv::Mat frame = TexturedFrame(5);
  RotRectTrackerProbe tracker;
  tracker.StartTracker(frame, {cv::RotatedRect(cv::Point2f(380, 240), cv::Size2f(300, 120), 0.0f),
                               cv::RotatedRect(cv::Point2f(25, 240), cv::Size2f(30, 30), 0.0f)});
  // The content moves left in steps until the small region is off the
  // picture, then back into view of the camera: it stays lost.
  const double steps[] = {-20.0, -40.0, -60.0, -40.0};
  Rects out;
  for (int k = 0; k < 4; ++k) {
    tracker.UpdateTracker(ShiftedX(frame, steps[k]), &out);
    ASSERT_EQ(out.size(), 2u);
    EXPECT_NEAR(out[0].center.x, 380.0 + steps[k], 0.5) << "step " << k;
    EXPECT_TRUE(k < 2 || (IsZero(out[1]) && tracker.ref_sizes_[1] == cv::Size2f())) << k;
  }
}

TEST(OcrTrackerRotRect, RejectedFrameIsZeroAndBecomesTheNextReference) {
  const cv::Mat frame = TexturedFrame(13);
  RotRectTrackerProbe tracker;
  tracker.StartTracker(frame, {cv::RotatedRect(cv::Point2f(320, 240), cv::Size2f(240, 60), 40.0f)});
  tracker.ref_rects_[0].angle = -10.0f;  // far from the tracked angle: rejected...
  ocr::log::ScopedCapture log;
  Rects out;
  for (int update = 1; update <= 2; ++update) {
    tracker.UpdateTracker(frame, &out);
    ASSERT_EQ(out.size(), 1u);
    EXPECT_TRUE(IsZero(out[0]));
    // ...and so is the next frame, against the zero rectangle then stored.
    EXPECT_EQ(log.Count("OcrTrackerRotRect::detect large angle/scale change. ", kInfo), update);
  }
}

TEST(OcrTrackerRotRect, EmptyStartTracksNothingWithoutLatching) {
  const cv::Mat frame = TexturedFrame(17);
  ocr::log::ScopedCapture log;
  RotRectTrackerProbe tracker;
  tracker.StartTracker(frame, {});
  EXPECT_EQ(log.Count("OcrTrackerRotRect::StartTracker: Input array is empty", kWarn), 1);
  EXPECT_TRUE(log.Contains("OcrTracker::GetTrackingPoints No areas to track currently", kWarn));
  EXPECT_EQ(tracker.min_tracked_points_, 10);
  EXPECT_EQ(tracker.initial_width_, -10000.0f);
  EXPECT_EQ(tracker.initial_height_, -10000.0f);
  Rects out = {cv::RotatedRect()};
  for (int update = 1; update <= 2; ++update) {
    tracker.UpdateTracker(frame, &out);
    EXPECT_TRUE(out.empty());
    EXPECT_EQ(log.Count("OcrTracker::UpdateTracker Failure: Nothing to track", kWarn), update);
    EXPECT_FALSE(tracker.tracking_failed_);
  }
  EXPECT_FALSE(log.Contains("OcrTrackerRotRect::detect large angle/scale change. "));
}

// Under the sanitizer build this also checks that destroying through the
// base is not reported as a mismatched deallocation.
TEST(ReleaseTracker, DestroysAStartedRotatedRectangleTrackerAndIgnoresNull) {
  const cv::Mat frame = TexturedFrame(23);
  auto* tracker = new OcrTrackerRotRect();
  tracker->StartTracker(frame, {cv::RotatedRect(cv::Point2f(160, 120), cv::Size2f(120, 40), 5.0f),
                                cv::RotatedRect(cv::Point2f(160, 60), cv::Size2f(80, 20), 0.0f)});
  Rects out;
  tracker->UpdateTracker(frame, &out);
  ASSERT_EQ(out.size(), 2u);
  zeph::ReleaseTracker(tracker);
  zeph::ReleaseTracker(nullptr);
}

// Printed text lines filmed under a smooth, known camera motion: pan, a
// small rotation, zoom, a few blurred frames.
TEST(TrackingAccuracy, CentresStayWithinThreePixelsOverThirtyFrames) {
  const tracking_testing::MovingTextScene scene;
  ASSERT_EQ(scene.frame_count(), 31);
  OcrTrackerRotRect tracker;
  tracker.StartTracker(scene.Frame(0), scene.TruthRects(0));
  Rects tracked, truth;
  for (int k = 1; k < scene.frame_count(); ++k) {
    tracker.UpdateTracker(scene.Frame(k), &tracked);
    truth = scene.TruthRects(k);
    ASSERT_EQ(tracked.size(), truth.size());
    for (size_t i = 0; i < tracked.size(); ++i)
      ASSERT_FALSE(IsZero(tracked[i])) << "frame " << k << ", line " << i;
    EXPECT_LT(tracking_testing::MeasureCentreError(tracked, truth).max, 3.0) << "frame " << k;
  }
  for (size_t i = 0; i < tracked.size(); ++i) {
    EXPECT_NEAR(tracked[i].angle, truth[i].angle, 0.5f) << "line " << i;
    EXPECT_NEAR(tracked[i].size.width / truth[i].size.width, 1.0f, 0.02f) << "line " << i;
    EXPECT_NEAR(tracked[i].size.height / truth[i].size.height, 1.0f, 0.02f) << "line " << i;
  }
  // The text grew with the zoom: more than the initial spread is covered.
  EXPECT_NEAR(tracker.GetCoverageLeft(), 1.12, 0.05);
}

}  // namespace
