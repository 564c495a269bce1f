#include "inpainting/driver/strategy_dispatch.h"

#include <atomic>
#include <optional>

#include <tbb/blocked_range.h>
#include <tbb/parallel_for.h>

#include <opencv2/imgproc.hpp>

#include "common/log.h"
#include "inpainting/driver/inpaint_block.h"
#include "inpainting/driver/inpaint_line.h"
#include "inpainting/driver/line_block_separation.h"
#include "inpainting/driver/rect_decoding.h"
#include "inpainting/driver/region_geometry.h"
#include "inpainting/inpainting_constants.h"

namespace ocr_inpainting {
namespace {

enum class RequestCheck { kAccepted, kRefused, kImageTooSmall };

// What a check logs besides its refusals. Each strategy checks the request
// it is given and logs its progress (the value count) and the too-small
// notice. InpaintingRotImg checks the whole request once before the
// strategies, only to turn a refusal into its -1 (the smart version reports
// success whatever its strategies return); the strategies then check again
// and log those two lines, so the early check leaves them out.
enum class CheckLog { kProgress, kRefusalsOnly };

// The checks every strategy makes before it decodes the rectangles.
RequestCheck CheckRequest(const cv::Mat& image, const std::vector<double>& values, CheckLog log) {
  const bool announce = log == CheckLog::kProgress;
  if (image.data == nullptr || image.empty()) {
    OCR_LOGE(" Inpainting_Process: Error in input of inpainting. Empty data.");
    return RequestCheck::kRefused;
  }
  const int value_count = static_cast<int>(values.size());
  if (announce)
    OCR_LOGI("  Inpainting_Process: rotate_rects.size = %d", value_count);
  if (values.empty() || values.size() % kValsPerRect != 0) {
    OCR_LOGE(" Inpainting_Process: Error in rotate_recs.size %d", value_count);
    return RequestCheck::kRefused;
  }
  if (image.type() != CV_8UC3) {
    OCR_LOGE(" Inpainting_Process: Error in type of convert RGBA to RGB.");
    return RequestCheck::kRefused;
  }
  // Too small to work on is not a failed request: the outputs stay as they are.
  if (image.rows < kMinInpaintSize || image.cols < kMinInpaintSize) {
    if (announce)
      OCR_LOGE(" Inpainting_Process: input image size is too small ");
    return RequestCheck::kImageTooSmall;
  }
  return RequestCheck::kAccepted;
}

// Front shared by the block and line strategies: announce, check, decode the
// rectangles and size the outputs. Gives the status to return at once, or
// nothing when the strategy goes on with `rects`.
std::optional<int> BeginStrategy(const char* banner, const cv::Mat& image,
                                 const std::vector<double>& values, std::vector<cv::Mat>& overlays,
                                 std::vector<cv::Scalar>& colors,
                                 std::vector<cv::RotatedRect>& rects) {
  OCR_LOGI("%s", banner);
  switch (CheckRequest(image, values, CheckLog::kProgress)) {
    case RequestCheck::kRefused:
      return -1;
    case RequestCheck::kImageTooSmall:
      return 0;
    case RequestCheck::kAccepted:
      break;
  }
  rects = TransformVector2RotatedRect(values);
  overlays.resize(rects.size());
  colors.assign(rects.size(), cv::Scalar::all(0));
  return std::nullopt;
}

// Overlay of a cut patch too small to erase: the patch itself, transparent,
// so that nothing is drawn over the camera image there.
cv::Mat TransparentOverlay(const cv::Mat& patch) {
  cv::Mat overlay;
  cv::cvtColor(patch, overlay, cv::COLOR_RGB2RGBA);
  const cv::Mat alpha = cv::Mat::zeros(patch.size(), CV_8UC1);
  const int alpha_to_fourth[] = {0, 3};
  cv::mixChannels(&alpha, 1, &overlay, 1, alpha_to_fourth, 1);
  return overlay;
}

}  // namespace

int InpaintingRotImg(const cv::Mat& image, const std::vector<double>& values,
                     std::vector<cv::Mat>& overlays, std::vector<cv::Scalar>& colors) {
  if (CheckRequest(image, values, CheckLog::kRefusalsOnly) == RequestCheck::kRefused)
    return -1;
  InpaintingRotImgSmartVersion(image, values, overlays, colors);
  return 0;
}

int InpaintingRotImgSmartVersion(const cv::Mat& image, const std::vector<double>& values,
                                 std::vector<cv::Mat>& overlays, std::vector<cv::Scalar>& colors) {
  std::vector<std::vector<double>> block_values;
  std::vector<double> line_values;
  std::vector<std::vector<unsigned int>> block_indices;
  std::vector<unsigned int> line_indices;
  SmartSepLineAndBlock(image, values, block_values, line_values, block_indices, line_indices);

  // Result slots are sized before the loops, down to every block's members,
  // and each iteration writes only its own. The strategies size them the
  // same way (one per rectangle they are given), and a strategy that stops
  // early leaves them as they are, so the copy back below needs no checks.
  const size_t block_count = block_values.size();
  std::vector<std::vector<cv::Mat>> block_overlays(block_count);
  std::vector<std::vector<cv::Scalar>> block_colors(block_count);
  for (size_t b = 0; b < block_count; ++b) {
    block_overlays[b].resize(block_indices[b].size());
    block_colors[b].assign(block_indices[b].size(), cv::Scalar::all(0));
  }
  std::vector<int> block_status(block_count, 0);
  std::vector<cv::Mat> line_overlays(line_indices.size());
  std::vector<cv::Scalar> line_colors(line_indices.size(), cv::Scalar::all(0));

  const auto run_blocks = [&] {
    if (block_count == 0)
      return;
    tbb::parallel_for(
        tbb::blocked_range<unsigned int>(0, static_cast<unsigned int>(block_count)),
        [&](const tbb::blocked_range<unsigned int>& range) {
          for (unsigned int b = range.begin(); b != range.end(); ++b) {
            block_status[b] = InpaintingRotImgBlockVersion(image, block_values[b],
                                                           block_overlays[b], block_colors[b]);
          }
        },
        tbb::auto_partitioner());
  };
  if (line_indices.empty()) {
    run_blocks();
  } else {
    tbb::parallel_for(
        tbb::blocked_range<int>(0, 2),
        [&](const tbb::blocked_range<int>& range) {
          for (int branch = range.begin(); branch != range.end(); ++branch) {
            if (branch == 0)
              run_blocks();
            else
              InpaintingRotImgLineVersion(image, line_values, line_overlays, line_colors);
          }
        },
        tbb::auto_partitioner());
  }

  const size_t count = values.size() / kValsPerRect;
  overlays.resize(count);
  colors.resize(count);
  for (size_t k = 0; k < line_indices.size(); ++k) {
    overlays[line_indices[k]] = line_overlays[k];
    colors[line_indices[k]] = line_colors[k];
  }
  for (size_t b = 0; b < block_count; ++b) {
    OCR_LOGD("kavoSmart block_result idx %d size %d", static_cast<int>(b),
             static_cast<int>(block_indices[b].size()));
    for (size_t m = 0; m < block_indices[b].size(); ++m) {
      OCR_LOGD("kavoSmart block_result idx %d copyIndex %d", static_cast<int>(b),
               static_cast<int>(m));
      overlays[block_indices[b][m]] = block_overlays[b][m];
      colors[block_indices[b][m]] = block_colors[b][m];
    }
  }
  return 0;
}

int InpaintingRotImgBlockVersion(const cv::Mat& image, const std::vector<double>& values,
                                 std::vector<cv::Mat>& overlays, std::vector<cv::Scalar>& colors) {
  std::vector<cv::RotatedRect> rects;
  if (const auto status =
          BeginStrategy(" Start Inpainting Block Version", image, values, overlays, colors, rects))
    return *status;
  return InpaintImgBlockVersion(image, rects, overlays, colors);
}

int InpaintingRotImgLineVersion(const cv::Mat& image, const std::vector<double>& values,
                                std::vector<cv::Mat>& overlays, std::vector<cv::Scalar>& colors) {
  std::vector<cv::RotatedRect> rects;
  if (const auto status =
          BeginStrategy(" Start Inpainting Line Version", image, values, overlays, colors, rects))
    return *status;

  // Every failing line stores the same -1; no lock is needed.
  std::atomic<int> result{0};
  tbb::parallel_for(
      tbb::blocked_range<unsigned int>(0, static_cast<unsigned int>(rects.size())),
      [&](const tbb::blocked_range<unsigned int>& range) {
        for (unsigned int i = range.begin(); i != range.end(); ++i) {
          cv::Mat patch;
          GetWarpedImage(image, rects[i], patch);
          if (patch.empty())
            continue;
          if (patch.rows < kMinInpaintSize || patch.cols < kMinInpaintSize) {
            overlays[i] = TransparentOverlay(patch);
            OCR_LOGW("Inpainting_Process: Rect too small");
            continue;
          }
          if (InpaintImg(patch, &overlays[i], colors[i]) != 0)
            result.store(-1, std::memory_order_relaxed);
        }
      },
      tbb::auto_partitioner());
  return result.load();
}

}  // namespace ocr_inpainting
