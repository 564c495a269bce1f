#pragma once

#include "renderer/render_records.h"

// Coordinate mapping of the renderer bridge: from the host's camera-image
// pixels (x right, y down, angles in degrees clockwise on screen) through the
// display orientation and the background quad's placement to the
// orthographic camera's space (origin at the window centre, y up).
namespace ocr_ar {

// One rotated rectangle as the host sends it: five doubles, centre x, centre
// y, width, height, angle in degrees.
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

// Where the background quad lies in normalised window units (-1..1 across
// the window, y up), in the order left, top, right, bottom.
struct BackgroundCorners {
  float left = 1.0f;
  float top = 1.0f;
  float right = 1.0f;
  float bottom = 1.0f;

  bool FillsWindow() const {
    return left == -1.0f && top == 1.0f && right == 1.0f && bottom == -1.0f;
  }
};

// Fits a background image of bg_width x bg_height into a window of
// window_width x window_height with its aspect ratio kept: bars on the two
// sides when the window is relatively wider, at top and bottom otherwise.
BackgroundCorners FitBackground(int window_width, int window_height, int bg_width, int bg_height);

// Turns a rectangle given in the pixels of the image the host holds under a
// display orientation (0, 90, 180, 270 degrees) into the pixels of the
// bg_width x bg_height background as shown. Other orientations leave it as
// it is.
ImageRect OrientRect(const ImageRect& rect, int orientation, double bg_width, double bg_height);

// The angle in [0, 360).
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

}  // namespace ocr_ar
