// A tracking run as the host drives it through its bridge: start on a frame
// with rectangles read the way the bridge reads them, then a few updates on
// moved, turned and noisier copies of the frame (now and then one of another
// size or layout). Frames stay small so that a run costs little. OpenCV
// errors may leave the tracker; nothing else may, and every update answers
// one rectangle per region.
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <vector>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "support/fuzz_input.h"
#include "support/synthetic_image.h"
#include "tracking/ocr_tracker_rot_rect.h"

namespace {

constexpr int kMaxSide = 96;

// As the bridge reads the host's array: centre and angle narrowed to float,
// width and height truncated toward zero first. (The bridge's reader is
// private to it, so it is repeated here.)
cv::RotatedRect HostRect(ocr_fuzz::FuzzInput& in) {
  const double x = in.Double();
  const double y = in.Double();
  const double w = in.Double();
  const double h = in.Double();
  const double angle = in.Double();
  return cv::RotatedRect(
      cv::Point2f(static_cast<float>(x), static_cast<float>(y)),
      cv::Size2f(static_cast<float>(std::trunc(w)), static_cast<float>(std::trunc(h))),
      static_cast<float>(angle));
}

// The next camera frame: the first one shifted, turned and scaled a little,
// with fresh noise.
cv::Mat MovedFrame(ocr_fuzz::FuzzInput& in, const cv::Mat& first) {
  const cv::Point2f centre(first.cols / 2.0f, first.rows / 2.0f);
  const double angle = static_cast<std::int8_t>(in.Byte()) / 8.0;
  const double scale = 1.0 + static_cast<std::int8_t>(in.Byte()) / 512.0;
  cv::Mat warp = cv::getRotationMatrix2D(centre, angle, scale);
  warp.at<double>(0, 2) += static_cast<std::int8_t>(in.Byte()) / 16.0;
  warp.at<double>(1, 2) += static_cast<std::int8_t>(in.Byte()) / 16.0;
  cv::Mat moved;
  cv::warpAffine(first, moved, warp, first.size(), cv::INTER_LINEAR, cv::BORDER_REPLICATE);
  const int noise = in.Byte() % 24;
  if (noise > 0) {
    cv::Mat grain(moved.size(), moved.type());
    cv::randn(grain, cv::Scalar::all(0), cv::Scalar::all(noise));
    moved += grain;
  }
  return moved;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  ocr_fuzz::FuzzInput in(data, size);
  const int rows = in.Range(0, kMaxSide);
  const int cols = in.Range(0, kMaxSide);
  // The host's frames are RGB; a grey or RGBA one is its mistake, which
  // OpenCV reports.
  const std::uint8_t layout = in.Byte();
  const int channels = layout < 240 ? 3 : layout % 2 == 0 ? 1 : 4;
  std::vector<cv::RotatedRect> start(in.Byte() % 5);
  for (cv::RotatedRect& rect : start)
    rect = HostRect(in);
  const int updates = 1 + in.Byte() % 4;
  const cv::Mat first = ocr_fuzz::SyntheticImage(in, rows, cols, channels);

  zeph::OcrTrackerRotRect tracker;
  try {
    tracker.StartTracker(first, start);
    for (int i = 0; i < updates; ++i) {
      const std::uint8_t kind = in.Byte();
      cv::Mat frame;
      if (kind < 8)
        frame = ocr_fuzz::SyntheticImage(in, in.Range(0, kMaxSide), in.Range(0, kMaxSide), 3);
      else if (!first.empty())
        frame = MovedFrame(in, first);
      else
        frame = first;
      std::vector<cv::RotatedRect> rects;
      tracker.UpdateTracker(frame, &rects);
      if (rects.size() != start.size())
        std::abort();
      const double coverage = tracker.GetCoverageLeft();
      (void)coverage;
    }
  } catch (const cv::Exception&) {
  }
  return 0;
}
