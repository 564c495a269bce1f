#include "access.h"
#include "camera_impl.h"

namespace Vexel {
namespace internal {

Matrix4 CameraImpl::Projection(float viewport_aspect) const {
  if (mode == PROJECTION_ORTHOGRAPHIC) {
    const float height = window_height;
    const float width = automatic_aspect ? height * viewport_aspect : window_width;
    return Matrix4::Orthographic(-width / 2, width / 2, -height / 2, height / 2, near_clip,
                                 far_clip);
  }
  return Matrix4::Perspective(field_of_view, automatic_aspect ? viewport_aspect : aspect, near_clip,
                              far_clip);
}

}  // namespace internal

namespace {
internal::CameraImpl& Of(const Camera& camera) {
  return static_cast<internal::CameraImpl&>(internal::Access::ImplOf<Node>(camera));
}
}  // namespace

Camera::Camera() : Node(std::make_unique<internal::CameraImpl>()) {}
Camera::~Camera() = default;

void Camera::setProjectionMode(ProjectionMode mode) {
  Of(*this).mode = mode;
}
ProjectionMode Camera::getProjectionMode() const {
  return Of(*this).mode;
}
void Camera::setOrthographicWindowSize(float width, float height) {
  Of(*this).window_width = width;
  Of(*this).window_height = height;
}
float Camera::getOrthographicWindowWidth() const {
  return Of(*this).window_width;
}
float Camera::getOrthographicWindowHeight() const {
  return Of(*this).window_height;
}
void Camera::setFieldOfView(const Degrees& vertical) {
  Of(*this).field_of_view = vertical.valueDegrees();
}
Degrees Camera::getFieldOfView() const {
  return Degrees(Of(*this).field_of_view);
}
void Camera::setAutomaticAspectRatio(bool automatic) {
  Of(*this).automatic_aspect = automatic;
}
bool Camera::isAutomaticAspectRatio() const {
  return Of(*this).automatic_aspect;
}
void Camera::setAspectRatio(float aspect) {
  Of(*this).aspect = aspect;
}
float Camera::getAspectRatio() const {
  return Of(*this).aspect;
}
void Camera::setNearClipDistance(float distance) {
  Of(*this).near_clip = distance;
}
float Camera::getNearClipDistance() const {
  return Of(*this).near_clip;
}
void Camera::setFarClipDistance(float distance) {
  Of(*this).far_clip = distance;
}
float Camera::getFarClipDistance() const {
  return Of(*this).far_clip;
}

}  // namespace Vexel
