#include "common/log.h"
#include "inpainting/analysis/binarization.h"
#include "inpainting/analysis/text_mask.h"

#include <opencv2/core.hpp>

namespace ocr_inpainting {
namespace {

// dst must be a CV_8UC1 mask of the patch size before parts are written
// into it; a caller that hands in anything else gets a zero mask.
void EnsureMaskOfSize(const cv::Mat& src, cv::Mat& dst) {
  if (dst.size() != src.size() || dst.type() != CV_8UC1)
    dst = cv::Mat::zeros(src.size(), CV_8UC1);
}

}  // namespace

void GetSubBinaryImg(const cv::Mat& src, const cv::Mat& ref, const cv::Range& rowRange,
                     const cv::Range& colRange, int method, cv::Mat& dst) {
  const cv::Mat part_src = src(rowRange, colRange);
  cv::Mat part;
  switch (method) {
    case kMethodHls:
      HLSThreshold(part_src, &part);
      break;
    case kMethodClahe:
      BinarizationByClahe(part_src, &part);
      break;
    case kMethodPca: {
      cv::Mat lab(part_src.size(), CV_32FC3);
      GetLabImage(part_src, &lab);
      PCAThreshold(lab, &part);
      // The principal axis has no sign: each part settles its own polarity.
      const cv::Mat inverse = 255 - part;
      GetBinaryImgNormalized(ref(rowRange, colRange), inverse, part);
      break;
    }
    default:
      OCR_LOGI("Inpainting_Process: No need to get sub binary image");
      return;
  }
  part.copyTo(dst(rowRange, colRange));
}

int GetBinaryImg(const cv::Mat& src, const cv::Mat& ref, int vertical_partition,
                 int horizontal_partition, bool vertical, bool horizon, int method, cv::Mat& dst) {
  OCR_LOGI(
      "INPAINT_TAG: Image size in binaryImg: %d * %d. vertical_partition: %d ; "
      "horizontal_partition: %d; vertical: %d, horizon: %d",
      src.rows, src.cols, vertical_partition, horizontal_partition, vertical ? 1 : 0,
      horizon ? 1 : 0);
  EnsureMaskOfSize(src, dst);
  const int v = vertical_partition;
  const int h = horizontal_partition;
  const bool use_vertical = vertical && v >= 1 && src.cols > v;
  const bool use_horizontal = horizon && h > 0;
  const cv::Range all_rows(0, src.rows);
  const cv::Range all_cols(0, src.cols);
  const cv::Range left(0, use_vertical ? v : 0);
  const cv::Range right(use_vertical ? v : 0, src.cols);
  const cv::Range top(0, use_horizontal ? h : 0);
  const cv::Range bottom(use_horizontal ? h : 0, src.rows);

  if (use_vertical && use_horizontal && src.rows > h) {
    GetSubBinaryImg(src, ref, top, left, method, dst);
    GetSubBinaryImg(src, ref, top, right, method, dst);
    GetSubBinaryImg(src, ref, bottom, left, method, dst);
    GetSubBinaryImg(src, ref, bottom, right, method, dst);
    OCR_LOGI("INPAINT_TAG : Sperate to four parts");
  } else if (use_horizontal && src.rows > h) {
    GetSubBinaryImg(src, ref, top, all_cols, method, dst);
    GetSubBinaryImg(src, ref, bottom, all_cols, method, dst);
  } else if (use_vertical) {
    GetSubBinaryImg(src, ref, all_rows, left, method, dst);
    GetSubBinaryImg(src, ref, all_rows, right, method, dst);
  } else if (method == kMethodClahe) {
    BinarizationByClahe(src, &dst);
    OCR_LOGI("INPAINT_TAG: obtain clahe binary image");
  } else {
    // Without a split the HLS mask the caller put into dst is kept; a PCA
    // request then only normalises it, on purpose.
    OCR_LOGI("Inpainting_Process: keep init HLS binariztion image");
  }

  // Polarity: the mask competes with its own inverse, judged against ref.
  const cv::Mat inverse = 255 - dst;
  GetBinaryImgNormalized(ref, inverse, dst);
  return 0;
}

int GetFontMask(const cv::Mat& src, const cv::Mat& /*font_mask_in*/, const cv::Mat& extra_mask,
                const cv::Mat& contour_mask, cv::Mat& font_mask, int& vertical_partition) {
  // The HLS mask is the default font mask.
  cv::Mat tmp = cv::Mat::zeros(src.size(), CV_8UC1);
  HLSThreshold(src, &tmp);
  tmp.copyTo(font_mask);

  // Same matrix as candidate and mask: only computes and logs the checks.
  GetBinaryImgNormalized(contour_mask, tmp, tmp);
  cv::bitwise_or(tmp, extra_mask, tmp);

  int horizontal_partition = 0;
  const bool horizon = GetHorizontalPartition(tmp, &horizontal_partition);
  const bool vertical = GetVerticalPartition(tmp, &vertical_partition);

  GetBinaryImg(src, contour_mask, vertical_partition, horizontal_partition, vertical, horizon,
               kMethodHls, font_mask);
  // Later methods displace the kept mask only through the arbiter.
  GetBinaryImg(src, contour_mask, vertical_partition, horizontal_partition, vertical, horizon,
               kMethodClahe, tmp);
  GetBinaryImgNormalized(contour_mask, tmp, font_mask);
  GetBinaryImg(src, contour_mask, vertical_partition, horizontal_partition, vertical, horizon,
               kMethodPca, tmp);
  GetBinaryImgNormalized(contour_mask, tmp, font_mask);
  return 0;
}

void GetLongestWordRange(const cv::Mat& img, int partition, cv::Range& rowRange,
                         cv::Range& colRange) {
  rowRange = cv::Range(0, img.rows);
  colRange = LongestWordColumns(partition, img.cols);
}

cv::Range LongestWordColumns(int partition, int cols) {
  const int half = cols / 2;
  if (half <= partition && partition < cols)
    return cv::Range(0, partition);
  if (0 <= partition && partition < half)
    return cv::Range(partition, cols);
  return cv::Range(0, cols);
}

}  // namespace ocr_inpainting
