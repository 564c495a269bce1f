#pragma once

#include "vexel/Node.h"

namespace Vexel {

enum ProjectionMode {
  PROJECTION_PERSPECTIVE = 0,
  PROJECTION_ORTHOGRAPHIC = 1,
};

// A camera is a node that looks down its own -z axis with +y up. What it sees
// lies between the near and far clip distances in front of it, that is at
// z = -near .. -far in its own frame: a camera left at the origin sees content
// placed at z = -1 .. -1000 with the default clip distances of 1 and 1000.
//
// Orthographic: the window is width x height scene units centred on the
// camera's axis and fills the whole viewport. With the automatic aspect ratio
// on (the default), the width is instead derived from the height and the
// viewport's aspect ratio. Perspective: vertical field of view and aspect
// ratio (automatic or set).
//
// A renderer draws its scene through the first visible camera found in the
// scene graph (parents before children, children in order).
class Camera : public Node {
 public:
  Camera();
  ~Camera() override;

  void setProjectionMode(ProjectionMode mode);
  ProjectionMode getProjectionMode() const;

  void setOrthographicWindowSize(float width, float height);
  float getOrthographicWindowWidth() const;
  float getOrthographicWindowHeight() const;

  void setFieldOfView(const Degrees& vertical);
  Degrees getFieldOfView() const;

  void setAutomaticAspectRatio(bool automatic);
  bool isAutomaticAspectRatio() const;
  // Width over height, used when the automatic aspect ratio is off.
  void setAspectRatio(float aspect);
  float getAspectRatio() const;

  void setNearClipDistance(float distance);
  float getNearClipDistance() const;
  void setFarClipDistance(float distance);
  float getFarClipDistance() const;
};

}  // namespace Vexel
