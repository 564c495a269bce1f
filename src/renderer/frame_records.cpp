#include "renderer/frame_records.h"

#include <opencv2/core/mat.hpp>

#include "common/log.h"
#include "renderer/vexel_utils.h"

namespace ocr_ar {
namespace {

constexpr std::size_t kValuesPerRect = 5;
constexpr std::size_t kValuesPerColorCorrection = 3;

ImageRect RectAt(const HostArray<double>& rects, std::size_t index) {
  const double* values = rects.At(kValuesPerRect * index, kValuesPerRect);
  return values != nullptr ? ImageRect::FromValues(values) : ImageRect{};
}

// The texture takes the patch as tightly packed RGBA bytes; a matrix of any
// other layout would be read past its end.
bool IsUploadablePatch(long long address) {
  const auto* mat = reinterpret_cast<const cv::Mat*>(address);
  return mat->empty() || (mat->type() == CV_8UC4 && mat->isContinuous());
}

PatchRecord PatchAt(const FrameArrays& arrays, std::size_t index) {
  PatchRecord patch;
  const std::int64_t* id = arrays.ids.At(index, 1);
  const std::int64_t* address = arrays.patch_mat_addrs.At(index, 1);
  if (arrays.ids.data == nullptr || arrays.patch_mat_addrs.data == nullptr)
    return patch;
  // Only the low 32 bits of the host's id identify the patch.
  if (id != nullptr)
    patch.id = static_cast<std::int32_t>(static_cast<std::uint32_t>(*id & 0xFFFFFFFF));
  if (address != nullptr && *address != 0) {
    if (IsUploadablePatch(*address)) {
      patch.data = vexel_utils::GetOpenCVMatDataPointer(*address, &patch.width, &patch.height);
    } else {
      OCR_LOGE("Vexel: patch matrix of text %zu is not 8-bit RGBA in one piece; not drawn.", index);
    }
  }
  patch.color_scale =
      arrays.color_scales.At(kValuesPerColorCorrection * index, kValuesPerColorCorrection);
  patch.color_shift =
      arrays.color_shifts.At(kValuesPerColorCorrection * index, kValuesPerColorCorrection);
  return patch;
}

}  // namespace

TextRecord UnpackTextRecord(const FrameArrays& arrays, std::size_t index, std::string text) {
  TextRecord record;
  record.text = std::move(text);
  record.patch = PatchAt(arrays, index);
  record.patch_rect = RectAt(arrays.patch_rects, index);
  record.text_rect = RectAt(arrays.text_rects, index);
  if (const std::int32_t* color = arrays.colors.At(index, 1))
    record.color = Color::FromPacked(*color);
  return record;
}

TextRecord UnreadableTextRecord() {
  return TextRecord{};
}

bool HasAllRects(const FrameArrays& arrays, std::size_t count) {
  const std::size_t needed = kValuesPerRect * count;
  return count == 0 || (arrays.patch_rects.At(0, needed) != nullptr &&
                        arrays.text_rects.At(0, needed) != nullptr);
}

}  // namespace ocr_ar
