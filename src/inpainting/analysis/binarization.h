#pragma once

#include <opencv2/core/mat.hpp>

// Binarisation of an upright text patch into a font mask (CV_8UC1, 255 =
// text, 0 = background). Three competing methods (HLS lightness, CLAHE grey,
// Lab principal component) run on the whole patch or on two or four parts of
// it; one arbiter decides polarity and which candidate is kept. Patches are
// 8-bit R, G, B. All functions are re-entrant and keep no state.
namespace ocr_inpainting {

// Binarisation method codes for GetSubBinaryImg / GetBinaryImg; any other
// value means "no binarisation".
inline constexpr int kMethodHls = 0;
inline constexpr int kMethodClahe = 1;
inline constexpr int kMethodPca = 2;

// A patch with fewer rows or columns than this is small to the analysis: too
// coarse for the arbiter's outline comparison and for thickening its edges
// before they are traced, and (by rows) too short to dilate its top and
// bottom rows. One threshold, so that the three stay in step.
inline constexpr int kSmallPatchSide = 21;

// Otsu threshold of the HLS lightness: 255 on pixels darker than the level
// (assumes dark text on light; the arbiter fixes polarity).
void HLSThreshold(const cv::Mat& src, cv::Mat* dst);

// Otsu threshold of the grey image after CLAHE (clip 4.0, 8x8 tiles) on the
// Lab lightness: 255 on bright pixels (opposite polarity to HLSThreshold).
void BinarizationByClahe(const cv::Mat& src, cv::Mat* dst);

// Float Lab of an 8-bit RGB patch. *dst must already have the wanted type
// (CV_32FC3); the patch is scaled to 0..1 before the conversion.
void GetLabImage(const cv::Mat& src, cv::Mat* dst);

// Otsu threshold of the projection of every Lab pixel on the first principal
// axis. The sign of that axis is arbitrary, so is the mask's polarity.
void PCAThreshold(const cv::Mat& lab, cv::Mat* dst);

// Edge mask of an 8-bit grey image: Otsu thresholds of the rising x and y
// Sobel gradients (8-bit output, falling edges saturate to 0), OR-ed.
void RGBSobel(const cv::Mat& src, cv::Mat* dst);

// A mask is plausible when its non-zero count n satisfies
// 0.1 * total < n < 0.9 * total.
bool ValidBinaryResultCheck(cv::Mat mask, int total);

// The arbiter. Judges `mask` and `candidate` on the centre crop (10 %..90 %
// of rows and columns of `ref`) and replaces `mask` by a copy of `candidate`
// when only the candidate is plausible, or when both are and the candidate
// differs less from `ref` eroded once (only for a ref of at least 21x21).
void GetBinaryImgNormalized(const cv::Mat& ref, const cv::Mat& candidate, cv::Mat& mask);

// Binarises src(rowRange, colRange) with `method` into dst(rowRange,
// colRange); the PCA method also normalises that part's polarity against
// ref(rowRange, colRange). Other methods leave dst untouched.
void GetSubBinaryImg(const cv::Mat& src, const cv::Mat& ref, const cv::Range& rowRange,
                     const cv::Range& colRange, int method, cv::Mat& dst);

// Binarises the patch with `method`, split into four, two or no parts by the
// partition description, then normalises the polarity of the whole mask
// against its inverse with `ref`. Without a split only the CLAHE method
// rebinarises; otherwise dst keeps what the caller put there. Returns 0.
int GetBinaryImg(const cv::Mat& src, const cv::Mat& ref, int vertical_partition,
                 int horizontal_partition, bool vertical, bool horizon, int method, cv::Mat& dst);

// The cascade HLS -> CLAHE -> PCA through the arbiter, with the contour mask
// as reference; `extra_mask` is OR-ed into the HLS mask before the partition
// search. The caller passes the same matrix as font_mask_in and font_mask.
// Writes the final font mask and the vertical split column. Returns 0.
int GetFontMask(const cv::Mat& src, const cv::Mat& font_mask_in, const cv::Mat& extra_mask,
                const cv::Mat& contour_mask, cv::Mat& font_mask, int& vertical_partition);

// The larger side of a vertical split at column `partition`: all rows, and
// the columns LongestWordColumns gives for the image's width.
void GetLongestWordRange(const cv::Mat& img, int partition, cv::Range& rowRange,
                         cv::Range& colRange);

// The columns of that side in a patch `cols` wide: [0, p) when
// cols / 2 <= p < cols, else [p, cols) for 0 <= p < cols / 2, else all.
cv::Range LongestWordColumns(int partition, int cols);

}  // namespace ocr_inpainting
