#pragma once

#include <array>

#include "vexel/Math.h"

namespace Vexel::internal {

// A 4x4 matrix, column-major as GL takes it: m[column * 4 + row]. Vectors
// are columns, so a * b applies b first.
struct Matrix4 {
  std::array<float, 16> m{1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1};

  float& at(int row, int column) { return m[column * 4 + row]; }
  float at(int row, int column) const { return m[column * 4 + row]; }

  static Matrix4 Identity() { return Matrix4(); }
  // Scale, then rotate about z, then translate.
  static Matrix4 Transform(const Vector3& position, const Vector3& scale, float degrees);
  // Maps the box left..right, bottom..top, -near..-far onto clip space.
  static Matrix4 Orthographic(float left, float right, float bottom, float top, float near_clip,
                              float far_clip);
  static Matrix4 Perspective(float vertical_degrees, float aspect, float near_clip, float far_clip);

  // Inverse of an affine matrix (no projective row).
  Matrix4 AffineInverse() const;
  // Transforms (x, y, z, w).
  std::array<float, 4> Apply(float x, float y, float z, float w) const;
};

Matrix4 operator*(const Matrix4& a, const Matrix4& b);

}  // namespace Vexel::internal
