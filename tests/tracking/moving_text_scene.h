#pragma once

#include <cstdint>
#include <vector>

#include <opencv2/core.hpp>

namespace tracking_testing {

// A printed page with lines of text of different sizes, filmed by a camera
// that pans, turns a little and zooms in over the sequence, with a few
// blurred frames and sensor noise. Deterministic for a given seed.
//
// The camera motion of frame k is a similarity transform from page to frame
// coordinates; the truth for a text line in frame k is its page rectangle
// moved by it. Angles follow cv::RotatedRect: degrees, clockwise on screen
// (x right, y down).
struct SceneOptions {
  cv::Size frame_size{1280, 720};
  int line_count = 10;
  int frame_count = 31;
  uint64_t seed = 20240611;
  cv::Point2f total_pan{-60.0f, 25.0f};  // pixels, frame 0 to the last frame
  float total_rotation_deg = 4.0f;
  float total_zoom = 1.12f;  // scale of the last frame relative to frame 0
  bool blur = true;          // a few frames blurred as by a moving camera
  double noise_sigma = 2.0;
};

class MovingTextScene {
 public:
  explicit MovingTextScene(const SceneOptions& options = SceneOptions());

  int frame_count() const { return options_.frame_count; }
  // Frame k as 8-bit RGB.
  cv::Mat Frame(int k) const;
  // The text lines' rectangles in frame k, in the order of the lines.
  std::vector<cv::RotatedRect> TruthRects(int k) const;
  // The page-to-frame transform of frame k (2 x 3, CV_64F).
  cv::Mat Motion(int k) const;
  // Gaussian blur sigma applied to frame k (0 for a sharp frame).
  double BlurSigma(int k) const;

 private:
  SceneOptions options_;
  cv::Mat page_;                        // RGB
  std::vector<cv::Rect2f> page_lines_;  // upright text boxes on the page
};

// Mean distance between the centres of `tracked` and `truth` (same order)
// and the largest one.
struct CentreError {
  double mean = 0.0;
  double max = 0.0;
};
CentreError MeasureCentreError(const std::vector<cv::RotatedRect>& tracked,
                               const std::vector<cv::RotatedRect>& truth);

}  // namespace tracking_testing
