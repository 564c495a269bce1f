#include "matrix.h"

#include <cmath>

namespace Vexel::internal {

Matrix4 Matrix4::Transform(const Vector3& position, const Vector3& scale, float degrees) {
  const float radians = Degrees(degrees).valueRadians();
  const float c = std::cos(radians);
  const float s = std::sin(radians);
  Matrix4 t;
  t.at(0, 0) = c * scale.x;
  t.at(1, 0) = s * scale.x;
  t.at(0, 1) = -s * scale.y;
  t.at(1, 1) = c * scale.y;
  t.at(2, 2) = scale.z;
  t.at(0, 3) = position.x;
  t.at(1, 3) = position.y;
  t.at(2, 3) = position.z;
  return t;
}

Matrix4 Matrix4::Orthographic(float left, float right, float bottom, float top, float near_clip,
                              float far_clip) {
  Matrix4 p;
  p.at(0, 0) = 2.0f / (right - left);
  p.at(1, 1) = 2.0f / (top - bottom);
  p.at(2, 2) = -2.0f / (far_clip - near_clip);
  p.at(0, 3) = -(right + left) / (right - left);
  p.at(1, 3) = -(top + bottom) / (top - bottom);
  p.at(2, 3) = -(far_clip + near_clip) / (far_clip - near_clip);
  return p;
}

Matrix4 Matrix4::Perspective(float vertical_degrees, float aspect, float near_clip,
                             float far_clip) {
  const float f = 1.0f / std::tan(Degrees(vertical_degrees).valueRadians() / 2.0f);
  Matrix4 p;
  p.at(0, 0) = f / aspect;
  p.at(1, 1) = f;
  p.at(2, 2) = (far_clip + near_clip) / (near_clip - far_clip);
  p.at(2, 3) = 2.0f * far_clip * near_clip / (near_clip - far_clip);
  p.at(3, 2) = -1.0f;
  p.at(3, 3) = 0.0f;
  return p;
}

Matrix4 Matrix4::AffineInverse() const {
  // Inverse of the upper 3x3 by cofactors, then the translation.
  const float a = at(0, 0), b = at(0, 1), c = at(0, 2);
  const float d = at(1, 0), e = at(1, 1), f = at(1, 2);
  const float g = at(2, 0), h = at(2, 1), i = at(2, 2);
  const float det = a * (e * i - f * h) - b * (d * i - f * g) + c * (d * h - e * g);
  Matrix4 r;
  if (det == 0.0f)
    return r;
  const float k = 1.0f / det;
  r.at(0, 0) = (e * i - f * h) * k;
  r.at(0, 1) = (c * h - b * i) * k;
  r.at(0, 2) = (b * f - c * e) * k;
  r.at(1, 0) = (f * g - d * i) * k;
  r.at(1, 1) = (a * i - c * g) * k;
  r.at(1, 2) = (c * d - a * f) * k;
  r.at(2, 0) = (d * h - e * g) * k;
  r.at(2, 1) = (b * g - a * h) * k;
  r.at(2, 2) = (a * e - b * d) * k;
  for (int row = 0; row < 3; ++row) {
    r.at(row, 3) = -(r.at(row, 0) * at(0, 3) + r.at(row, 1) * at(1, 3) + r.at(row, 2) * at(2, 3));
  }
  return r;
}

std::array<float, 4> Matrix4::Apply(float x, float y, float z, float w) const {
  std::array<float, 4> out{};
  for (int row = 0; row < 4; ++row)
    out[row] = at(row, 0) * x + at(row, 1) * y + at(row, 2) * z + at(row, 3) * w;
  return out;
}

Matrix4 operator*(const Matrix4& a, const Matrix4& b) {
  Matrix4 r;
  for (int column = 0; column < 4; ++column) {
    for (int row = 0; row < 4; ++row) {
      float sum = 0.0f;
      for (int k = 0; k < 4; ++k)
        sum += a.at(row, k) * b.at(k, column);
      r.at(row, column) = sum;
    }
  }
  return r;
}

}  // namespace Vexel::internal
