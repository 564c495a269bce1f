#pragma once

// Small helpers between the host's OpenCV matrices and the scene kit.
namespace ocr_ar::vexel_utils {

// The data pointer of the cv::Mat at `matAddress` (a host-owned matrix
// passed by its native address); writes its columns and rows. Address 0
// yields null, 0 and 0.
const void* GetOpenCVMatDataPointer(long long matAddress, int* width, int* height);

}  // namespace ocr_ar::vexel_utils
