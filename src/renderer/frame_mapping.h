#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

#include "renderer/render_records.h"

namespace cv {
class Mat;
}

// The renderer bridge's per-frame work on plain values, in the order a frame
// uses it: the camera frame as texture bytes, the host's arrays unpacked into
// one record per text, each rectangle carried from the host's camera-image
// pixels (x right, y down, angles in degrees clockwise on screen) through
// the display orientation and the background quad's placement into the
// orthographic camera's space (origin at the window centre, y up), and the
// text colour matched to the live frame. Nothing here draws.
namespace ocr_ar {

// ---- The host's arrays -------------------------------------------------

// One of the host's arrays: null when the host passed none.
template <typename T>
struct HostArray {
  const T* data = nullptr;
  std::size_t size = 0;

  // The `count` elements from `offset` on, or null when the array is absent
  // or too short to hold them. The only bounds rule of the unpacking.
  const T* At(std::size_t offset, std::size_t count) const {
    return data != nullptr && offset + count <= size ? data + offset : nullptr;
  }
};

// The per-text arrays of one renderOneFrame call (layout per text i:
// rectangles 5 values at 5*i, colour scales and shifts 3 at 3*i, the others
// one value at i).
struct FrameArrays {
  HostArray<double> patch_rects;
  HostArray<double> text_rects;
  HostArray<std::int64_t> ids;
  HostArray<std::int64_t> patch_mat_addrs;
  HostArray<double> color_scales;
  HostArray<double> color_shifts;
  HostArray<std::int32_t> colors;
};

// One rotated rectangle as the host sends it: five doubles, centre x, centre
// y, width, height, angle in degrees, in camera-image pixels. Kept apart from
// PositionScaleAngle on purpose: that one is the float record in camera
// units, y up, that the scene handler takes.
struct ImageRect {
  double center_x = 0.0;
  double center_y = 0.0;
  double width = 0.0;
  double height = 0.0;
  double angle = 0.0;

  static ImageRect FromValues(const double* values) {
    return {values[0], values[1], values[2], values[3], values[4]};
  }
};

// Everything the bridge draws for one text.
struct TextRecord {
  std::string text;
  ImageRect patch_rect;
  ImageRect text_rect;
  PatchRecord patch;
  Color color = Color::FromPacked(kDefaultTextColor);
};

// ---- Background --------------------------------------------------------

// The camera frame as tightly packed RGBA bytes, the layout of the
// background texture: an 8-bit 4-channel frame in one piece as it stands,
// other 8-bit frames (RGB, grey, or not in one piece) converted into
// `scratch`. Null for an empty frame or one of another depth.
//
// Unlike a patch (see UnpackTextRecord), the camera frame is converted: the
// host's camera path legitimately delivers RGBA, RGB or grey, whereas the
// inpainting pipeline only ever produces RGBA patches, so a patch of another
// layout is the host's mistake and is refused.
const void* BackgroundRgba(const cv::Mat& frame, cv::Mat& scratch);

// Fits a background image of bg_width x bg_height into a window of
// window_width x window_height with its aspect ratio kept: bars on the two
// sides when the window is relatively wider, at top and bottom otherwise.
BackgroundCorners FitBackground(int window_width, int window_height, int bg_width, int bg_height);

// ---- Per-text records --------------------------------------------------

// Whether both rectangle arrays hold five values for each of `count` texts
// (checked once per frame, so that a short array is reported once; the
// texts past its end then get zero rectangles from UnpackTextRecord).
bool HasAllRects(const FrameArrays& arrays, std::size_t count);

// The record of text `index`. The patch record is built only when both the
// ids and the patch matrix addresses are given; a patch matrix that is not
// 8-bit RGBA in one piece contributes no pixels. A missing rectangle is all
// zero, a missing colour opaque black.
TextRecord UnpackTextRecord(const FrameArrays& arrays, std::size_t index, std::string text);

// The record of a text whose string could not be read: empty text, zero
// rectangles, no patch (id -1), opaque black.
TextRecord UnreadableTextRecord();

// ---- Rectangles into camera space --------------------------------------

// Turns a rectangle given in the pixels of the image the host holds under a
// display orientation (0, 90, 180, 270 degrees) into the pixels of the
// bg_width x bg_height background as shown. Other orientations leave it as
// it is.
ImageRect OrientRect(const ImageRect& rect, int orientation, double bg_width, double bg_height);

// The angle in [0, 360); NaN for a non-finite angle.
double NormalizeDegrees(double angle);

// Whether a rectangle at this angle stands upright on screen, so that its
// width runs along the screen's y axis: 45..135 or 225..315 degrees after
// normalisation, bounds included.
bool IsUpright(double angle);

// What the mapping from background pixels to camera space needs to know.
struct CameraView {
  float camera_width = 0.0f;  // orthographic window, screen pixels
  float camera_height = 0.0f;
  float bg_width = 0.0f;  // background image as given, not swapped
  float bg_height = 0.0f;
  BackgroundCorners corners;
};

// The camera record of an oriented rectangle. `width_factor` enlarges the
// rectangle's width before its scale is computed (the patch margin).
PositionScaleAngle ToCameraRecord(const ImageRect& oriented, const CameraView& view,
                                  double width_factor = 1.0);

// Patches are drawn 5% wider than the rectangle the inpainting cut them
// along, so that their faded side edges fall outside the original text.
inline constexpr double kPatchWidthMargin = 1.05;

// ---- Text colour -------------------------------------------------------

// The text colour matched to the live frame the way its patch is: channels
// 0, 1 and 2 become scale[k] * channel + shift[k], clamped to 0..255 (NaN
// counts as 0) and truncated; the fourth byte (alpha) is kept. Without both
// a scale and a shift the colour is returned unchanged.
Color CorrectColor(const Color& color, const double* scale, const double* shift);

}  // namespace ocr_ar

// Small helpers between the host's OpenCV matrices and the scene kit.
namespace ocr_ar::vexel_utils {

// The data pointer of the cv::Mat at `matAddress` (a host-owned matrix
// passed by its native address); writes its columns and rows. Address 0
// yields null, 0 and 0.
const void* GetOpenCVMatDataPointer(long long matAddress, int* width, int* height);

}  // namespace ocr_ar::vexel_utils
