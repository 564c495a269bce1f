#pragma once

namespace cv {
class Mat;
}

namespace ocr_ar {

// The camera frame as tightly packed RGBA bytes, the layout of the
// background texture: an 8-bit 4-channel frame in one piece as it stands,
// other 8-bit frames (RGB, grey, or not in one piece) converted into
// `scratch`. Null for an empty frame or one of another depth.
const void* BackgroundRgba(const cv::Mat& frame, cv::Mat& scratch);

}  // namespace ocr_ar
