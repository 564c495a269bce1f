#include "inpainting/driver/inpainting_request.h"

#include "common/log.h"
#include "inpainting/driver/color_packing.h"
#include "inpainting/driver/strategy_dispatch.h"

namespace ocr_inpainting {

int RequestRectCount(size_t length) {
  return static_cast<int>(static_cast<double>(length) * 0.2);
}

int AnswerInpaintingRequest(const cv::Mat& image, const std::vector<double>& rect_values,
                            const std::vector<cv::Mat*>& outputs,
                            std::vector<int32_t>& packed_colors) {
  const size_t count = outputs.size();
  std::vector<cv::Mat> overlays;
  std::vector<cv::Scalar> colors;
  const int status = InpaintingRotImg(image, rect_values, overlays, colors);
  OCR_LOGI("Inpainting_Process: num_results %d ", static_cast<int>(count));
  OCR_LOGI("Inpainting_Process: image size %d ", static_cast<int>(overlays.size()));
  if (status != 0) {
    OCR_LOGE("Error in Java call of Inpainting");
    return status;
  }
  // The pipeline answers every rectangle it accepts with one overlay and one
  // colour; another overlay count means it dropped some.
  if (overlays.size() != count) {
    OCR_LOGE("Error in Java call of Inpainting. The number of output images is incorrect");
    return -1;
  }

  OCR_LOGI("Inpainting_Process: return to jObjectArray");
  for (size_t i = 0; i < count; ++i) {
    if (outputs[i] != &overlays[i])
      *outputs[i] = overlays[i];
  }

  OCR_LOGI("Inpainting_Process: begin fontcolor. ");
  packed_colors.resize(count);
  for (size_t i = 0; i < count; ++i)
    packed_colors[i] = PackFontColor(colors[i]);
  OCR_LOGI("Inpainting_Process: finish fontcolor. ");
  return 0;
}

}  // namespace ocr_inpainting
