#include "renderer/vexel_utils.h"

#include <opencv2/core/mat.hpp>

namespace ocr_ar::vexel_utils {

const void* GetOpenCVMatDataPointer(long long matAddress, int* width, int* height) {
  if (matAddress == 0) {
    *width = 0;
    *height = 0;
    return nullptr;
  }
  const auto* mat = reinterpret_cast<const cv::Mat*>(matAddress);
  *width = mat->cols;
  *height = mat->rows;
  return mat->data;
}

}  // namespace ocr_ar::vexel_utils
