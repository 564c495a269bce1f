#include "tracking/ocr_tracker.h"

#include <gtest/gtest.h>

#include <climits>
#include <string>
#include <vector>

#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "tracker_test_support.h"

namespace {

using tracking_testing::PointTrackerProbe;
using tracking_testing::Quad;
using tracking_testing::Shifted;
using tracking_testing::TexturedFrame;
using zeph::OcrTracker;

const cv::Size kFrameSize(640, 480);

// A tracker started on a textured frame with two quadrilaterals in the middle.
struct StartedTracker {
  cv::Mat frame = TexturedFrame(kFrameSize, 7);
  std::vector<cv::Point2f> corners;
  PointTrackerProbe tracker;

  StartedTracker() {
    corners = Quad(200, 150, 420, 210);
    const std::vector<cv::Point2f> second = Quad(180, 260, 460, 330);
    corners.insert(corners.end(), second.begin(), second.end());
    tracker.StartTracker(frame, corners);
  }
};

void ExpectPointsNear(const std::vector<cv::Point2f>& actual,
                      const std::vector<cv::Point2f>& expected, float tolerance) {
  ASSERT_EQ(actual.size(), expected.size());
  for (size_t i = 0; i < actual.size(); ++i) {
    EXPECT_NEAR(actual[i].x, expected[i].x, tolerance) << "corner " << i;
    EXPECT_NEAR(actual[i].y, expected[i].y, tolerance) << "corner " << i;
  }
}

TEST(OcrTrackerHelpers, BoundingRectKeepsItsStartValues) {
  const cv::Rect2f empty = OcrTracker::ComputeBoundingRect({});
  EXPECT_EQ(empty, cv::Rect2f(10000.0f, 10000.0f, -10000.0f, -10000.0f));
  // The maxima start at 0: points above and left of the picture still reach it.
  EXPECT_EQ(OcrTracker::ComputeBoundingRect({cv::Point2f(-5.0f, -3.0f)}),
            cv::Rect2f(-5.0f, -3.0f, 5.0f, 3.0f));
  EXPECT_EQ(OcrTracker::ComputeBoundingRect({cv::Point2f(30.5f, 12.0f), cv::Point2f(10.0f, 40.0f)}),
            cv::Rect2f(10.0f, 12.0f, 20.5f, 28.0f));
}

TEST(OcrTrackerHelpers, SafeRoiGrowsByTheMarginAndClipsToThePicture) {
  EXPECT_EQ(OcrTracker::GetSafeRoi(cv::Rect(100, 100, 50, 40), kFrameSize, 50),
            cv::Rect(50, 50, 150, 140));
  EXPECT_EQ(OcrTracker::GetSafeRoi(cv::Rect(10, 20, 30, 30), kFrameSize, 50),
            cv::Rect(0, 0, 90, 100));
  EXPECT_EQ(OcrTracker::GetSafeRoi(cv::Rect(600, 450, 30, 20), kFrameSize, 50),
            cv::Rect(550, 400, 90, 80));
  // Nothing of the grown rectangle left on the picture: the empty rectangle.
  EXPECT_EQ(OcrTracker::GetSafeRoi(cv::Rect(700, 10, 5, 5), kFrameSize, 50), cv::Rect());
  EXPECT_EQ(OcrTracker::GetSafeRoi(cv::Rect(10, -80, 5, 5), kFrameSize, 50), cv::Rect());
}

TEST(OcrTrackerHelpers, FilterPointsInVectorsCompactsStably) {
  std::vector<unsigned char> flags = {1, 0, 1, 1, 0};
  std::vector<cv::Point2f> a = {{0, 0}, {1, 1}, {2, 2}, {3, 3}, {4, 4}};
  std::vector<cv::Point2f> b = {{10, 0}, {11, 1}, {12, 2}, {13, 3}, {14, 4}};
  EXPECT_EQ(OcrTracker::FilterPointsInVectors<unsigned char>(flags, a, b, 1), 3u);
  EXPECT_EQ(flags, (std::vector<unsigned char>{1, 1, 1}));
  EXPECT_EQ(a, (std::vector<cv::Point2f>{{0, 0}, {2, 2}, {3, 3}}));
  EXPECT_EQ(b, (std::vector<cv::Point2f>{{10, 0}, {12, 2}, {13, 3}}));

  std::vector<unsigned char> zeros = {0, 0};
  std::vector<cv::Point2f> c = {{5, 5}, {6, 6}}, d = {{7, 7}, {8, 8}};
  EXPECT_EQ(OcrTracker::FilterPointsInVectors<unsigned char>(zeros, c, d, 0), 2u);
  EXPECT_EQ(c, (std::vector<cv::Point2f>{{5, 5}, {6, 6}}));
}

TEST(OcrTrackerHelpers, FilterPointsInVectorsRefusesUnequalLengths) {
  std::vector<unsigned char> flags = {1, 0, 1};
  std::vector<cv::Point2f> a = {{0, 0}, {1, 1}, {2, 2}};
  std::vector<cv::Point2f> b = {{0, 0}, {1, 1}};
  EXPECT_EQ(OcrTracker::FilterPointsInVectors<unsigned char>(flags, a, b, 1), UINT_MAX);
  EXPECT_EQ(flags.size(), 3u);
  EXPECT_EQ(a.size(), 3u);
  EXPECT_EQ(a[1], cv::Point2f(1, 1));
  EXPECT_EQ(b.size(), 2u);
}

TEST(OcrTrackerHelpers, CheckInputParametersCountsFloatPoints) {
  EXPECT_EQ(OcrTracker::checkInputParameters(std::vector<cv::Point2f>(3)), 3);
  EXPECT_LT(OcrTracker::checkInputParameters(std::vector<cv::Point2f>()), 1);
  EXPECT_LT(OcrTracker::checkInputParameters(std::vector<cv::Point2i>(3)), 0);
}

TEST(OcrTrackerStart, ThresholdIsFivePercentOfThePointsButAtLeastTen) {
  const std::vector<cv::Point2f> whole = Quad(0, 0, 639, 399);
  struct Case {
    int squares;
    size_t points;
    int threshold;
  };
  for (const Case& c : {Case{10, 40, 10}, Case{50, 200, 10}, Case{55, 220, 11}}) {
    PointTrackerProbe tracker;
    tracker.StartTracker(tracking_testing::SquaresFrame(c.squares), whole);
    EXPECT_EQ(tracker.tracking_points_.size(), c.points) << c.squares << " squares";
    EXPECT_EQ(tracker.min_tracked_points_, c.threshold) << c.squares << " squares";
  }
}

TEST(OcrTrackerStart, FeaturesComeOnlyFromInsideTheQuadrilaterals) {
  StartedTracker started;
  const auto& points = started.tracker.tracking_points_;
  ASSERT_GT(points.size(), 100u);
  // Sub-pixel refinement may move a corner by up to its 5 px search half-window.
  for (const cv::Point2f& p : points) {
    const bool in_first = p.x >= 195 && p.x <= 425 && p.y >= 145 && p.y <= 215;
    const bool in_second = p.x >= 175 && p.x <= 465 && p.y >= 255 && p.y <= 335;
    EXPECT_TRUE(in_first || in_second) << p;
  }
  const cv::Rect2f extent = OcrTracker::ComputeBoundingRect(points);
  EXPECT_FLOAT_EQ(started.tracker.initial_width_, extent.width);
  EXPECT_FLOAT_EQ(started.tracker.initial_height_, extent.height);
  EXPECT_EQ(started.tracker.coverage_left_, 0.0);
  EXPECT_FALSE(started.tracker.tracking_failed_);
}

TEST(OcrTrackerStart, NothingToTrackEndsEachUpdateWithoutLatching) {
  const cv::Mat frame = TexturedFrame(kFrameSize, 3);
  // Three corners: no complete quadrilateral, so no area.
  const std::vector<cv::Point2f> corners = {{10, 10}, {100, 10}, {100, 100}};
  ocr::log::ScopedCapture log;
  PointTrackerProbe tracker;
  tracker.StartTracker(frame, corners);
  EXPECT_TRUE(log.Contains("OcrTracker::GetTrackingPoints Total area 0.0", ocr::log::kDebug));
  EXPECT_TRUE(
      log.Contains("OcrTracker::GetTrackingPoints No areas to track currently", ocr::log::kWarn));
  EXPECT_TRUE(tracker.tracking_points_.empty());
  EXPECT_EQ(tracker.min_tracked_points_, 10);
  EXPECT_EQ(tracker.initial_width_, -10000.0f);
  EXPECT_EQ(tracker.initial_height_, -10000.0f);

  for (int update = 0; update < 2; ++update) {
    log.Clear();
    std::vector<cv::Point2f> out;
    tracker.UpdateTracker(frame, &out);
    EXPECT_TRUE(out.empty());
    EXPECT_EQ(log.Count("OcrTracker::UpdateTracker Failure: Nothing to track", ocr::log::kWarn), 1);
    EXPECT_FALSE(
        log.Contains("OcrTracker::UpdateTracker Failure: Previous tracking failed already. "));
    EXPECT_FALSE(tracker.tracking_failed_);
  }
}

TEST(OcrTrackerUpdate, StillFrameKeepsTheCornersAndFullCoverage) {
  StartedTracker started;
  std::vector<cv::Point2f> out;
  testing::internal::CaptureStdout();
  started.tracker.UpdateTracker(started.frame, &out);
  const std::string printed = testing::internal::GetCapturedStdout();
  ExpectPointsNear(out, started.corners, 0.05f);
  EXPECT_NEAR(started.tracker.GetCoverageLeft(), 1.0, 1e-3);
  EXPECT_EQ(started.tracker.corner_points_, out);
  // The homography goes to standard output as a word and OpenCV's matrix text.
  EXPECT_EQ(printed.rfind("homography\n[1", 0), 0u) << printed;
  EXPECT_EQ(printed.substr(printed.size() - 3), "1]\n") << printed;
}

TEST(OcrTrackerUpdate, FollowsATranslation) {
  StartedTracker started;
  std::vector<cv::Point2f> out;
  started.tracker.UpdateTracker(Shifted(started.frame, 12.0, -7.0), &out);
  std::vector<cv::Point2f> expected = started.corners;
  for (cv::Point2f& p : expected)
    p += cv::Point2f(12.0f, -7.0f);
  ExpectPointsNear(out, expected, 0.2f);

  // The next update starts from the moved frame and corners.
  started.tracker.UpdateTracker(Shifted(started.frame, 20.0, -7.0), &out);
  for (cv::Point2f& p : expected)
    p += cv::Point2f(8.0f, 0.0f);
  ExpectPointsNear(out, expected, 0.3f);
}

TEST(OcrTrackerUpdate, CoverageIsNotClampedWhenTheTextGrows) {
  StartedTracker started;
  const cv::Mat zoom = cv::getRotationMatrix2D(cv::Point2f(320, 240), 0.0, 1.15);
  cv::Mat zoomed;
  cv::warpAffine(started.frame, zoomed, zoom, kFrameSize, cv::INTER_LINEAR, cv::BORDER_REFLECT_101);
  std::vector<cv::Point2f> out;
  started.tracker.UpdateTracker(zoomed, &out);
  EXPECT_NEAR(started.tracker.GetCoverageLeft(), 1.15, 0.02);
}

TEST(OcrTrackerUpdate, ZeroInitialWidthGivesZeroCoverage) {
  StartedTracker started;
  started.tracker.initial_width_ = 0.0f;
  std::vector<cv::Point2f> out;
  started.tracker.UpdateTracker(started.frame, &out);
  EXPECT_EQ(out.size(), started.corners.size());
  EXPECT_EQ(started.tracker.GetCoverageLeft(), 0.0);
}

TEST(OcrTrackerUpdate, ZeroesQuadrilateralsThrownFarOrWhollyOffThePicture) {
  StartedTracker started;
  const float cols = static_cast<float>(kFrameSize.width);
  std::vector<cv::Point2f> corners = started.corners;
  const std::vector<cv::Point2f> extreme = {{300, 100}, {300, 50}, {2 * cols + 1, 50}, {400, 100}};
  const std::vector<cv::Point2f> left_of_picture = Quad(-200, 100, -20, 140);
  const std::vector<cv::Point2f> straddling = Quad(-50, 100, 30, 140);
  for (const auto* quad : {&extreme, &left_of_picture, &straddling})
    corners.insert(corners.end(), quad->begin(), quad->end());
  started.tracker.corner_points_ = corners;

  ocr::log::ScopedCapture log;
  std::vector<cv::Point2f> out;
  started.tracker.UpdateTracker(started.frame, &out);
  ASSERT_EQ(out.size(), corners.size());
  ExpectPointsNear(std::vector<cv::Point2f>(out.begin(), out.begin() + 8),
                   std::vector<cv::Point2f>(corners.begin(), corners.begin() + 8), 0.05f);
  for (size_t i = 8; i < 16; ++i)
    EXPECT_EQ(out[i], cv::Point2f(0, 0)) << "corner " << i;
  ExpectPointsNear(std::vector<cv::Point2f>(out.begin() + 16, out.end()), straddling, 0.05f);
  // Only the far quadrilateral is logged; the one off the picture goes silently.
  EXPECT_EQ(log.Count("OcrTracker::Corner points are extreme large. ", ocr::log::kDebug), 1);
  // Zeroed quadrilaterals are carried on as four points at one spot.
  EXPECT_EQ(started.tracker.corner_points_, out);
}

TEST(OcrTrackerUpdate, TooFewTrackedPointsLatchTheFailure) {
  StartedTracker started;
  const size_t points = started.tracker.tracking_points_.size();
  started.tracker.min_tracked_points_ = static_cast<int>(points) + 1;

  ocr::log::ScopedCapture log;
  std::vector<cv::Point2f> out = {{1, 2}};
  started.tracker.UpdateTracker(started.frame, &out);
  const std::string too_few =
      "OcrTracker::UpdateTracker Failure: Too few points tracked: " + std::to_string(points) + "/" +
      std::to_string(points);
  EXPECT_EQ(log.Count(too_few, ocr::log::kWarn), 1);
  EXPECT_TRUE(started.tracker.tracking_failed_);
  EXPECT_EQ(out, (std::vector<cv::Point2f>{{1, 2}}));
  EXPECT_EQ(started.tracker.tracking_points_.size(), points);

  // From now on every update logs one line and changes nothing.
  for (int update = 0; update < 2; ++update) {
    log.Clear();
    started.tracker.UpdateTracker(Shifted(started.frame, 3.0, 0.0), &out);
    EXPECT_EQ(log.Texts(),
              (std::vector<std::string>{
                  "OcrTracker::UpdateTracker Failure: Previous tracking failed already. "}));
    EXPECT_EQ(out, (std::vector<cv::Point2f>{{1, 2}}));
  }

  // Only a new start clears the flag.
  started.tracker.StartTracker(started.frame, started.corners);
  EXPECT_FALSE(started.tracker.tracking_failed_);
  started.tracker.UpdateTracker(started.frame, &out);
  ExpectPointsNear(out, started.corners, 0.05f);
}

TEST(OcrTrackerUpdate, FailedHomographyEndsTheUpdateWithoutLatching) {
  StartedTracker started;
  // Points on one line cannot give a homography; on an unchanged frame the
  // flow leaves them exactly where they are.
  std::vector<cv::Point2f> line;
  for (int i = 0; i < 40; ++i)
    line.emplace_back(210.0f + 5.0f * static_cast<float>(i), 180.0f);
  started.tracker.tracking_points_ = line;
  started.tracker.min_tracked_points_ = 10;
  const double coverage = started.tracker.GetCoverageLeft();

  for (int update = 0; update < 2; ++update) {
    ocr::log::ScopedCapture log;
    std::vector<cv::Point2f> out;
    testing::internal::CaptureStdout();
    started.tracker.UpdateTracker(started.frame, &out);
    EXPECT_EQ(testing::internal::GetCapturedStdout(), "homography\n[]\n");
    EXPECT_EQ(
        log.Count("OcrTracker::UpdateTracker Failure: findHomography failed", ocr::log::kWarn), 1);
    EXPECT_TRUE(log.Contains("OcrTracker::UpdateTracker 0/40 points valid", ocr::log::kInfo));
    EXPECT_TRUE(out.empty());
    EXPECT_FALSE(started.tracker.tracking_failed_);
    EXPECT_EQ(started.tracker.tracking_points_, line);
    EXPECT_EQ(started.tracker.GetCoverageLeft(), coverage);
  }
}

TEST(OcrTrackerUpdate, NoCornersEndTheUpdateAfterTheCoverage) {
  StartedTracker started;
  started.tracker.corner_points_.clear();
  const std::vector<cv::Point2f> points = started.tracker.tracking_points_;
  const cv::Mat reference = started.tracker.prev_gray_;

  ocr::log::ScopedCapture log;
  std::vector<cv::Point2f> out = {{1, 1}, {2, 2}};
  started.tracker.UpdateTracker(Shifted(started.frame, 5.0, 0.0), &out);
  EXPECT_EQ(
      log.Count("OcrTracker::UpdateTracker Failure: corner_points_ is empty", ocr::log::kWarn), 1);
  EXPECT_TRUE(out.empty());
  EXPECT_NEAR(started.tracker.GetCoverageLeft(), 1.0, 0.02);
  EXPECT_EQ(started.tracker.tracking_points_, points);
  EXPECT_EQ(started.tracker.prev_gray_.data, reference.data);
  EXPECT_FALSE(started.tracker.tracking_failed_);
}

TEST(OcrTrackerUpdate, LogsStartAndEndWithTheObjectAddress) {
  StartedTracker started;
  ocr::log::ScopedCapture log;
  std::vector<cv::Point2f> out;
  started.tracker.UpdateTracker(started.frame, &out);
  const std::string address = std::to_string(reinterpret_cast<unsigned long>(&started.tracker));
  EXPECT_TRUE(log.Contains("OcrTracker::UpdateTracker start " + address, ocr::log::kInfo));
  EXPECT_TRUE(log.Contains("OcrTracker::UpdateTracker end " + address, ocr::log::kInfo));
  const size_t n = started.tracker.tracking_points_.size();
  EXPECT_TRUE(log.Contains(
      "OcrTracker::UpdateTracker Points tracked: " + std::to_string(n) + "/" + std::to_string(n),
      ocr::log::kDebug));
}

TEST(OcrTrackerUpdate, OpenCvErrorsPropagate) {
  StartedTracker started;
  cv::Mat gray;
  cv::cvtColor(started.frame, gray, cv::COLOR_RGB2GRAY);
  std::vector<cv::Point2f> out;
  EXPECT_THROW(started.tracker.UpdateTracker(gray, &out), cv::Exception);
  // Points wholly past the picture leave an empty search region.
  started.tracker.tracking_points_.assign(20, cv::Point2f(5000.0f, 5000.0f));
  EXPECT_THROW(started.tracker.UpdateTracker(started.frame, &out), cv::Exception);
}

}  // namespace
