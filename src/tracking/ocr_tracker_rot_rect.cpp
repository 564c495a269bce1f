// The rotated-rectangle tracker over the point tracker.
#include "tracking/ocr_tracker_rot_rect.h"

#include <cmath>

#include "common/log.h"

namespace zeph {
namespace {

constexpr double kDegreesPerRadian = 57.29577951308232;
constexpr float kMaxAngleChange = 35.0f;
constexpr double kMaxScaleChange = 2.4;
constexpr double kMinScaleChange = 0.4166666666666667;  // 1 / 2.4

// All fields 0: how a lost region, and every region of a failed or rejected
// frame, reaches the host.
cv::RotatedRect LostRect() {
  return cv::RotatedRect(cv::Point2f(0.0f, 0.0f), cv::Size2f(0.0f, 0.0f), 0.0f);
}

// Ratio of two non-zero lengths outside [1/2.4, 2.4]; the bounds themselves are accepted.
bool BadlyScaled(float current, float reference) {
  if (current == 0.0f || reference == 0.0f)
    return false;
  // In double: a ratio of 24 to 10 is then exactly the bound and still accepted.
  const double ratio = static_cast<double>(current) / static_cast<double>(reference);
  return ratio < kMinScaleChange || ratio > kMaxScaleChange;
}

}  // namespace

void OcrTrackerRotRect::StartTracker(const cv::Mat& frame,
                                     const std::vector<cv::RotatedRect>& rects) {
  OCR_LOGD("OcrTrackerRotRect::StartTracker %lu", Address(this));
  if (rects.empty())
    OCR_LOGW("OcrTrackerRotRect::StartTracker: Input array is empty");
  std::vector<cv::Point2f> corners;
  AppendReferences(rects, corners);
  OcrTracker::StartTracker(frame, corners);
}

void OcrTrackerRotRect::AppendReferences(const std::vector<cv::RotatedRect>& rects,
                                         std::vector<cv::Point2f>& corners) {
  // On a fresh object both lists are empty here, so ref_rects_ starts empty.
  ref_sizes_.reserve(rects.size());
  ref_rects_.resize(ref_sizes_.size());
  corners.reserve(4 * ref_sizes_.size());
  for (const cv::RotatedRect& rect : rects) {
    ref_sizes_.push_back(rect.size);
    cv::Point2f points[4];
    rect.points(points);
    corners.insert(corners.end(), points, points + 4);
    ref_rects_.push_back(rect);
  }
}

void OcrTrackerRotRect::UpdateTracker(const cv::Mat& frame, std::vector<cv::RotatedRect>* rects) {
  OCR_LOGI("OcrTrackerRotRect::UpdateTracker start %lu", Address(this));
  std::vector<cv::Point2f> pts;
  OcrTracker::UpdateTracker(frame, &pts);

  const size_t n = ref_sizes_.size();
  rects->clear();
  rects->resize(n, LostRect());
  if (pts.size() != 4 * n) {
    OCR_LOGW(
        "OcrTrackerRotRect::UpdateTracker ERROR: There should be four points for each rect: %d != "
        "%d * 4",
        static_cast<int>(pts.size()), static_cast<int>(n));
    return;
  }

  OCR_LOGD("OcrTrackerRotRect::UpdateTracker Estimate each polygon with a rotated rect");
  for (size_t i = 0; i < n; ++i) {
    const cv::Point2f* p = &pts[4 * i];
    const cv::Point2f centre((p[0].x + p[1].x + p[2].x + p[3].x) * 0.25f,
                             (p[0].y + p[1].y + p[2].y + p[3].y) * 0.25f);
    // From the midpoint of edge p0p1 to the midpoint of edge p2p3: the width direction.
    const cv::Point2f d = ((p[2] + p[3]) - (p[0] + p[1])) * 0.5f;
    const float angle = static_cast<float>(std::atan2(d.y, d.x) * kDegreesPerRadian);
    const double len = std::sqrt(static_cast<double>(d.x) * d.x + static_cast<double>(d.y) * d.y);
    cv::RotatedRect& out = (*rects)[i];
    if (len == 0.0) {
      // A quadrilateral collapsed to one point stays lost for good.
      ref_sizes_[i] = cv::Size2f(0.0f, 0.0f);
      out = LostRect();
      continue;
    }
    // The height follows the width with the region's reference aspect ratio.
    const cv::Size2f size(static_cast<float>(len),
                          static_cast<float>(len * ref_sizes_[i].height / ref_sizes_[i].width));
    ref_sizes_[i] = size;
    out = cv::RotatedRect(centre, size, angle);
  }

  if (CheckTrackingAnglesScales(*rects, ref_rects_)) {
    OCR_LOGI("OcrTrackerRotRect::detect large angle/scale change. ");
    for (cv::RotatedRect& rect : *rects)
      rect = LostRect();
  }
  // Even a zeroed result becomes the reference for the next frame.
  ref_rects_ = *rects;
  OCR_LOGI("OcrTrackerRotRect::UpdateTracker end %lu", Address(this));
}

bool OcrTrackerRotRect::CheckTrackingAnglesScales(const std::vector<cv::RotatedRect>& current,
                                                  const std::vector<cv::RotatedRect>& reference) {
  if (current.size() != reference.size()) {
    OCR_LOGW("OcrTrackerRotRect::check angles are not from the same ocr result");
    return false;
  }
  size_t badly_scaled = 0;
  for (size_t i = 0; i < current.size(); ++i) {
    // A plain difference: 170 against -175 counts as 345 degrees.
    if (std::fabs(current[i].angle - reference[i].angle) > kMaxAngleChange) {
      OCR_LOGI("OcrTrackerRotRect::Large angle change detected. ");
      return true;
    }
    if (BadlyScaled(current[i].size.height, reference[i].size.height) ||
        BadlyScaled(current[i].size.width, reference[i].size.width))
      ++badly_scaled;
  }
  return static_cast<double>(badly_scaled) > 0.5 * static_cast<double>(current.size());
}

}  // namespace zeph
