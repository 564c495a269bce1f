#pragma once

#include <GLES2/gl2.h>

#include "log.h"
#include "matrix.h"

namespace Vexel::internal {

// What every node's Draw needs from the frame being drawn.
struct DrawContext {
  Matrix4 view_projection;
  int viewport_width = 0;
  int viewport_height = 0;
  KitLog* log = nullptr;
};

// Render state of one draw call.
struct RenderState {
  enum Blend { kNone, kAlpha, kAdditive };
  Blend blend = kNone;
  bool depth_test = true;
  bool depth_write = true;
};

void ApplyRenderState(const RenderState& state);

// Screen pixels covered by one unit of the node's own x and y axes (their
// mean) at the node's origin: how large a text unit appears.
float PixelsPerUnit(const Matrix4& world_view_projection, const DrawContext& context);

}  // namespace Vexel::internal
