#pragma once

#include "matrix.h"
#include "node_impl.h"
#include "vexel/Camera.h"

namespace Vexel::internal {

class CameraImpl : public Node::Impl {
 public:
  CameraImpl* AsCamera() override { return this; }
  // Projection for a viewport of this aspect ratio (width over height).
  Matrix4 Projection(float viewport_aspect) const;

  ProjectionMode mode = PROJECTION_PERSPECTIVE;
  float window_width = 2.0f;
  float window_height = 2.0f;
  float field_of_view = 45.0f;
  bool automatic_aspect = true;
  float aspect = 1.0f;
  float near_clip = 1.0f;
  float far_clip = 1000.0f;
};

}  // namespace Vexel::internal
