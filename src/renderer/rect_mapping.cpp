#include "renderer/rect_mapping.h"

#include <cstdint>

namespace ocr_ar {

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
  while (angle < 0.0)
    angle += 360.0;
  while (angle >= 360.0)
    angle -= 360.0;
  return angle;
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

}  // namespace ocr_ar
