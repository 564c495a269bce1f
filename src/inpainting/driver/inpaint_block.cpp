#include "inpainting/driver/inpaint_block.h"

#include <tbb/blocked_range.h>
#include <tbb/parallel_for.h>

#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "inpainting/analysis/font_color.h"
#include "inpainting/analysis/text_mask.h"
#include "inpainting/driver/font_color_columns.h"
#include "inpainting/driver/part_mask.h"
#include "inpainting/driver/patch_fill.h"
#include "inpainting/driver/rect_clipping.h"
#include "inpainting/driver/region_geometry.h"
#include "inpainting/inpainting_constants.h"

namespace ocr_inpainting {
namespace {

// Every line of a block: its rectangle in block coordinates, the region of
// the block patch it covers, its masks (zeros until the analysis writes them,
// which it does not for a line too small to analyse) and its vertical split.
struct BlockLines {
  std::vector<cv::RotatedRect> rects;
  std::vector<cv::Rect> regions;
  std::vector<cv::Mat> masks;
  std::vector<cv::Mat> font_masks;
  std::vector<int> partitions;
};

BlockLines LocateLines(const std::vector<cv::RotatedRect>& block_rects,
                       const cv::Size& block_size) {
  BlockLines lines;
  lines.rects = block_rects;
  const size_t count = block_rects.size();
  lines.regions.resize(count);
  lines.masks.resize(count);
  lines.font_masks.resize(count);
  lines.partitions.assign(count, -1);  // no split until the analysis finds one
  for (size_t i = 0; i < count; ++i) {
    const cv::Rect box = block_rects[i].boundingRect();
    OCR_LOGI("sep_roi: (%d,%d) %dx%d", box.x, box.y, box.width, box.height);
    const cv::Rect region = ClipToImage(box, block_size);
    if (RectArea(region) != RectArea(box)) {
      OCR_LOGE("sep_roi != line_roi[%d]: (%d,%d) %dx%d", static_cast<int>(i), region.x, region.y,
               region.width, region.height);
    }
    lines.regions[i] = region;
    lines.masks[i] = cv::Mat::zeros(region.size(), CV_8UC1);
    lines.font_masks[i] = cv::Mat::zeros(region.size(), CV_8UC1);
  }
  return lines;
}

// Text masks of all lines, in parallel; each line works on its own region of
// the block patch and of the block's edge mask.
void FindLineMasks(const cv::Mat& block_patch, const cv::Mat& edge_mask, BlockLines& lines) {
  tbb::parallel_for(
      tbb::blocked_range<size_t>(0, lines.rects.size()),
      [&](const tbb::blocked_range<size_t>& range) {
        for (size_t i = range.begin(); i != range.end(); ++i) {
          const cv::Rect& region = lines.regions[i];
          if (region.empty())
            continue;
          GetInpaintingMask(block_patch(region), edge_mask(region), lines.masks[i],
                            lines.font_masks[i], lines.partitions[i]);
          OCR_LOGI("Inpainting vertical_pt[i] %d", lines.partitions[i]);
        }
      },
      tbb::auto_partitioner());
}

// Line masks pasted into the block masks in index order: where regions
// overlap, the later line wins.
void PasteLineMasks(const BlockLines& lines, cv::Mat& block_mask, cv::Mat& block_font_mask) {
  for (size_t i = 0; i < lines.rects.size(); ++i) {
    const cv::Rect& region = lines.regions[i];
    if (region.empty())
      continue;
    if (lines.masks[i].size() == region.size())
      lines.masks[i].copyTo(block_mask(region));
    if (lines.font_masks[i].size() == region.size())
      lines.font_masks[i].copyTo(block_font_mask(region));
  }
}

}  // namespace

int InpaintImgBlockVersion(const cv::Mat& image, const std::vector<cv::RotatedRect>& rects,
                           std::vector<cv::Mat>& overlays, std::vector<cv::Scalar>& colors) {
  if (rects.empty())
    return -1;

  const cv::RotatedRect block = ComputeBoundingRect(rects);
  cv::Size block_size;
  cv::Mat transform;
  GetSizeAndTransform(block, block_size, transform, kBlockPatchCap);
  std::vector<cv::RotatedRect> block_rects;
  WarpPositions(transform, rects, block_rects);

  // warpAffine would take the image's size for an empty target size, so a
  // block without positive sides is not cut at all.
  cv::Mat block_patch;
  if (HasPositiveSides(block_size)) {
    cv::warpAffine(image, block_patch, transform, block_size,
                   cv::INTER_CUBIC | cv::WARP_INVERSE_MAP, cv::BORDER_REPLICATE);
  }
  if (block_patch.cols < kMinInpaintSize || block_patch.rows < kMinInpaintSize) {
    OCR_LOGE("Inpainting_Process: block_roi is too small: %dx%d", block_patch.rows,
             block_patch.cols);
    return -1;
  }

  cv::Mat block_mask = cv::Mat::zeros(block_patch.size(), CV_8UC1);
  cv::Mat block_font_mask = cv::Mat::zeros(block_patch.size(), CV_8UC1);
  OCR_LOGI("kMinSizeKernel");
  cv::Mat edge_mask;
  GetPartMask(block_patch, edge_mask);

  BlockLines lines = LocateLines(block_rects, block_patch.size());
  FindLineMasks(block_patch, edge_mask, lines);
  PasteLineMasks(lines, block_mask, block_font_mask);

  OCR_LOGI("InpaintingThreshold enter");
  cv::Mat filled;
  InpaintingThreshold(block_patch, block_mask, filled);
  cv::Mat block_overlay;
  AddAlphaChannel(filled, block_mask, &block_overlay);

  // Every line's overlay and colour, cut from the block-level images along
  // the line's rectangle so that patch and masks stay aligned.
  const std::vector<cv::Mat> block_images = {block_overlay, block_patch, filled, block_mask,
                                             block_font_mask};
  tbb::parallel_for(
      tbb::blocked_range<size_t>(0, rects.size()),
      [&](const tbb::blocked_range<size_t>& range) {
        for (size_t i = range.begin(); i != range.end(); ++i) {
          std::vector<cv::Mat> cut;
          GetWarpedImageVector(block_images, lines.rects[i], cut);
          overlays[i] = cut[0];
          const cv::Mat& patch = cut[1];
          if (patch.empty())
            continue;
          const cv::Range columns = FontColorColumns(lines.partitions[i], patch.cols);
          GetFontColor(patch.colRange(columns), cut[3].colRange(columns), cut[2].colRange(columns),
                       cut[4].colRange(columns), colors[i]);
        }
      },
      tbb::auto_partitioner());

  OCR_LOGW("InpaintImgBlockVersion end");
  return 0;
}

}  // namespace ocr_inpainting
