#include "draw_context.h"

#include <cmath>

namespace Vexel::internal {

void ApplyRenderState(const RenderState& state) {
  switch (state.blend) {
    case RenderState::kNone:
      glDisable(GL_BLEND);
      break;
    case RenderState::kAlpha:
      glEnable(GL_BLEND);
      glBlendFunc(GL_SRC_ALPHA, GL_ONE_MINUS_SRC_ALPHA);
      break;
    case RenderState::kAdditive:
      glEnable(GL_BLEND);
      glBlendFunc(GL_SRC_ALPHA, GL_ONE);
      break;
  }
  if (state.depth_test) {
    glEnable(GL_DEPTH_TEST);
    glDepthFunc(GL_LEQUAL);
  } else {
    glDisable(GL_DEPTH_TEST);
  }
  glDepthMask(state.depth_write ? GL_TRUE : GL_FALSE);
}

float PixelsPerUnit(const Matrix4& world_view_projection, const DrawContext& context) {
  const auto origin = world_view_projection.Apply(0, 0, 0, 1);
  if (origin[3] == 0.0f)
    return 0.0f;
  auto axis_pixels = [&](float x, float y) {
    const auto tip = world_view_projection.Apply(x, y, 0, 1);
    if (tip[3] == 0.0f)
      return 0.0f;
    const float dx = (tip[0] / tip[3] - origin[0] / origin[3]) * context.viewport_width / 2.0f;
    const float dy = (tip[1] / tip[3] - origin[1] / origin[3]) * context.viewport_height / 2.0f;
    return std::sqrt(dx * dx + dy * dy);
  };
  return (axis_pixels(1, 0) + axis_pixels(0, 1)) / 2.0f;
}

}  // namespace Vexel::internal
