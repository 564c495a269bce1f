#include "inpainting/driver/inpaint_line.h"

#include "common/log.h"
#include "inpainting/analysis/font_color.h"
#include "inpainting/analysis/text_mask.h"
#include "inpainting/driver/font_color_columns.h"
#include "inpainting/driver/patch_fill.h"

namespace ocr_inpainting {

int InpaintImg(const cv::Mat& patch, cv::Mat* overlay, cv::Scalar& color) {
  cv::Mat mask;
  cv::Mat font_mask;
  // Stays -1 (no split: all columns) when the patch has no word gap.
  int vertical_partition = -1;
  GetMask(patch, mask, font_mask, vertical_partition);
  OCR_LOGI("Inpainting_Process: detect vertical partition for fontcolor mask: %d",
           vertical_partition);

  cv::Mat filled;
  InpaintingThreshold(patch, mask, filled);
  AddAlphaChannel(filled, mask, overlay);

  const cv::Range columns = FontColorColumns(vertical_partition, patch.cols);
  GetFontColor(patch.colRange(columns), mask.colRange(columns), filled.colRange(columns),
               font_mask.colRange(columns), color);
  return 0;
}

}  // namespace ocr_inpainting
