#include "renderer/background_frame.h"

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

namespace ocr_ar {

const void* BackgroundRgba(const cv::Mat& frame, cv::Mat& scratch) {
  if (frame.empty() || frame.depth() != CV_8U)
    return nullptr;
  switch (frame.channels()) {
    case 4:
      if (frame.isContinuous())
        return frame.data;
      frame.copyTo(scratch);
      return scratch.data;
    case 3:
      cv::cvtColor(frame, scratch, cv::COLOR_RGB2RGBA);
      return scratch.data;
    case 1:
      cv::cvtColor(frame, scratch, cv::COLOR_GRAY2RGBA);
      return scratch.data;
    default:
      return nullptr;
  }
}

}  // namespace ocr_ar
