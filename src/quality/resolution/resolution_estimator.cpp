#include "quality/resolution/resolution_estimator.h"

#include <array>
#include <string>

#include <tbb/blocked_range.h>
#include <tbb/parallel_for.h>
#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "common/nanotime.h"
#include "quality/resolution/radial_spectrum.h"
#include "quality/resolution/window_grid.h"

namespace image_resolution {
namespace {

// Checks what the estimator can read; logs why not and returns false.
bool IsMeasurable(const cv::Mat* frame) {
  if (frame == nullptr) {
    OCR_LOGE("ImgResEstimate: null image address");
    return false;
  }
  if (frame->empty()) {
    OCR_LOGE("ImgResEstimate: empty image");
    return false;
  }
  if (frame->dims != 2) {
    OCR_LOGE("ImgResEstimate: unsupported image with %d dimensions (need 2)", frame->dims);
    return false;
  }
  const int type = frame->type();
  if (type != CV_8UC4 && type != CV_8UC3 && type != CV_8UC1) {
    OCR_LOGE("ImgResEstimate: unsupported image type %s (need 8-bit RGBA, RGB or grey)",
             cv::typeToString(type).c_str());
    return false;
  }
  if (ChooseWindowSide(frame->size()) == 0) {
    OCR_LOGE("ImgResEstimate: image %dx%d is too small (needs at least %d pixels on each side)",
             frame->cols, frame->rows, kGridCells * kMinWindowSide);
    return false;
  }
  return true;
}

// The grey of one window; only the windows are converted, not the frame.
cv::Mat GreyWindow(const cv::Mat& frame, const cv::Rect& window) {
  const cv::Mat region = frame(window);
  cv::Mat grey;
  switch (frame.channels()) {
    case 4:
      cv::cvtColor(region, grey, cv::COLOR_RGBA2GRAY);
      break;
    case 3:
      cv::cvtColor(region, grey, cv::COLOR_RGB2GRAY);
      break;
    default:
      grey = region;
      break;
  }
  return grey;
}

}  // namespace

double EstimateResolution(const cv::Mat* frame) {
  if (!IsMeasurable(frame))
    return kNotMeasured;
  const uint64_t start = get_nanotime();
  const int side = ChooseWindowSide(frame->size());
  const WindowGrid windows = LayOutWindows(frame->size(), side);
  const SpectrumPlan plan = MakeSpectrumPlan(side);

  std::array<double, kWindowCount> cutoffs{};
  tbb::parallel_for(
      tbb::blocked_range<int>(0, kWindowCount), [&](const tbb::blocked_range<int>& r) {
        for (int i = r.begin(); i != r.end(); ++i)
          cutoffs[i] = WindowCutoff(RadialPowerProfile(GreyWindow(*frame, windows[i]), plan));
      });
  const double estimate = CombineWindowCutoffs(cutoffs);

  int with_detail = 0;
  for (double cutoff : cutoffs)
    with_detail += cutoff > kNoDetail ? 1 : 0;
  OCR_LOGD(
      "ImgResEstimate: %dx%d, %d of %d windows of %d px with detail, estimate %.3f of Nyquist, "
      "%.2f ms",
      frame->cols, frame->rows, with_detail, kWindowCount, side, estimate,
      (get_nanotime() - start) / 1e6);
  return estimate;
}

}  // namespace image_resolution
