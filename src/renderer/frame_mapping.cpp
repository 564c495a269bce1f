#include "renderer/frame_mapping.h"

#include <cmath>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

#include "common/log.h"

namespace ocr_ar {
namespace {

constexpr std::size_t kValuesPerRect = 5;
constexpr std::size_t kValuesPerColorCorrection = 3;

// The host owns its matrices and passes them by native address; the renderer
// only reads them.
const cv::Mat& HostMatAt(long long address) {
  return *reinterpret_cast<const cv::Mat*>(address);
}

ImageRect RectAt(const HostArray<double>& rects, std::size_t index) {
  const double* values = rects.At(kValuesPerRect * index, kValuesPerRect);
  return values != nullptr ? ImageRect::FromValues(values) : ImageRect{};
}

// The texture takes the patch as tightly packed RGBA bytes; a matrix of any
// other layout would be read past its end.
bool IsUploadablePatch(const cv::Mat& mat) {
  return mat.empty() || (mat.type() == CV_8UC4 && mat.isContinuous());
}

PatchRecord PatchAt(const FrameArrays& arrays, std::size_t index) {
  PatchRecord patch;
  if (arrays.ids.data == nullptr || arrays.patch_mat_addrs.data == nullptr)
    return patch;
  // Only the low 32 bits of the host's id identify the patch.
  if (const std::int64_t* id = arrays.ids.At(index, 1))
    patch.id = static_cast<std::int32_t>(static_cast<std::uint32_t>(*id & 0xFFFFFFFF));
  const std::int64_t* address = arrays.patch_mat_addrs.At(index, 1);
  if (address != nullptr && *address != 0) {
    if (IsUploadablePatch(HostMatAt(*address))) {
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

std::uint8_t ClampToByte(double value) {
  if (std::isnan(value) || value <= 0.0)
    return 0;
  if (value >= 255.0)
    return 255;
  return static_cast<std::uint8_t>(value);
}

}  // namespace

// ---- Background --------------------------------------------------------

const void* BackgroundRgba(const cv::Mat& frame, cv::Mat& scratch) {
  if (frame.empty() || frame.depth() != CV_8U)
    return nullptr;
  switch (frame.channels()) {
    case 4:
      if (frame.isContinuous())
        return frame.data;
      frame.copyTo(scratch);
      return scratch.data;
    case 3:
      cv::cvtColor(frame, scratch, cv::COLOR_RGB2RGBA);
      return scratch.data;
    case 1:
      cv::cvtColor(frame, scratch, cv::COLOR_GRAY2RGBA);
      return scratch.data;
    default:
      return nullptr;
  }
}

BackgroundCorners FitBackground(int window_width, int window_height, int bg_width, int bg_height) {
  // Integer products, then one float division. 64-bit products keep large
  // sizes from overflowing.
  const float r = static_cast<float>(static_cast<std::int64_t>(window_width) * bg_height) /
                  static_cast<float>(static_cast<std::int64_t>(window_height) * bg_width);
  if (r > 1.0f) {
    const float q = 1.0f / r;
    if (2.0f * q < 2.0f)
      return {-q, 1.0f, q, -1.0f};
    return {-1.0f, 1.0f, 1.0f, -1.0f};
  }
  if (2.0f * r < 2.0f)
    return {-1.0f, r, 1.0f, -r};
  return {-1.0f, 1.0f, 1.0f, -1.0f};
}

// ---- Per-text records --------------------------------------------------

bool HasAllRects(const FrameArrays& arrays, std::size_t count) {
  const std::size_t needed = kValuesPerRect * count;
  return count == 0 || (arrays.patch_rects.At(0, needed) != nullptr &&
                        arrays.text_rects.At(0, needed) != nullptr);
}

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

// ---- Rectangles into camera space --------------------------------------

ImageRect OrientRect(const ImageRect& rect, int orientation, double bg_width, double bg_height) {
  ImageRect oriented = rect;
  const double x = rect.center_x;
  const double y = rect.center_y;
  switch (orientation) {
    case 270:
      oriented.center_x = bg_width - y;
      oriented.center_y = x;
      oriented.angle = rect.angle + 90.0;
      break;
    case 180:
      oriented.center_x = bg_width - x;
      oriented.center_y = bg_height - y;
      oriented.angle = rect.angle + 180.0;
      break;
    case 90:
      oriented.center_x = y;
      oriented.center_y = bg_height - x;
      oriented.angle = rect.angle - 90.0;
      break;
    default:
      break;
  }
  return oriented;
}

double NormalizeDegrees(double angle) {
  // The same value as stepping by 360 until the angle lies in [0, 360): the
  // remainder is exact, and so is every step of that walk for any angle it
  // finishes on. Unlike the walk, it ends for huge and infinite angles; a
  // non-finite angle gives NaN, which is neither upright nor in range.
  double reduced = std::fmod(angle, 360.0);
  if (reduced < 0.0)
    reduced += 360.0;
  // A tiny negative remainder rounds up to 360 when shifted.
  if (reduced >= 360.0)
    reduced -= 360.0;
  return reduced;
}

bool IsUpright(double angle) {
  const double a = NormalizeDegrees(angle);
  return (a >= 45.0 && a <= 135.0) || (a >= 225.0 && a <= 315.0);
}

PositionScaleAngle ToCameraRecord(const ImageRect& oriented, const CameraView& view,
                                  double width_factor) {
  const double cam_w = view.camera_width;
  const double cam_h = view.camera_height;
  double frame_w = view.bg_width;
  double frame_h = view.bg_height;
  double x = oriented.center_x;
  double y = oriented.center_y;
  double width = oriented.width * width_factor;
  double height = oriented.height;
  // The upright/lying rule is symmetric under negation, so the image angle
  // decides it as well as the camera angle does.
  const bool upright = IsUpright(oriented.angle);

  // A background that does not fill the window: go through its corners into
  // camera pixels measured from the window's top-left corner.
  const BackgroundCorners& c = view.corners;
  if (!c.FillsWindow()) {
    const double along_x = (c.right - c.left) * cam_w / 2.0 / view.bg_width;
    const double along_y = (c.top - c.bottom) * cam_h / 2.0 / view.bg_height;
    x = ((x / view.bg_width) * (c.right - c.left) + c.left + 1.0) * cam_w / 2.0;
    y = ((y / view.bg_height) * (c.top - c.bottom) - c.top + 1.0) * cam_h / 2.0;
    width *= upright ? along_y : along_x;
    height *= upright ? along_x : along_y;
    frame_w = cam_w;
    frame_h = cam_h;
  }

  const double sx = cam_w / frame_w;
  const double sy = cam_h / frame_h;
  PositionScaleAngle record;
  record.x = static_cast<float>((x - frame_w / 2.0) * sx);
  record.y = static_cast<float>((frame_h / 2.0 - y) * sy);
  record.angle = static_cast<float>(-oriented.angle);
  record.scale_x = static_cast<float>(width * (upright ? sy : sx));
  record.scale_y = static_cast<float>(height * (upright ? sx : sy));
  return record;
}

// ---- Text colour -------------------------------------------------------

Color CorrectColor(const Color& color, const double* scale, const double* shift) {
  if (scale == nullptr || shift == nullptr)
    return color;
  Color corrected = color;
  for (int k = 0; k < 3; ++k)
    corrected.channel[k] = ClampToByte(scale[k] * color.channel[k] + shift[k]);
  return corrected;
}

}  // namespace ocr_ar

namespace ocr_ar::vexel_utils {

const void* GetOpenCVMatDataPointer(long long matAddress, int* width, int* height) {
  if (matAddress == 0) {
    *width = 0;
    *height = 0;
    return nullptr;
  }
  const cv::Mat& mat = HostMatAt(matAddress);
  *width = mat.cols;
  *height = mat.rows;
  return mat.data;
}

}  // namespace ocr_ar::vexel_utils
