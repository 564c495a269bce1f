#pragma once

#include <cstdint>

// Value types shared by the kit's interfaces. Scene units are whatever the
// caller chooses (the orthographic camera's window is given in them); y runs
// upwards, z towards the viewer, and angles are counter-clockwise in degrees.
namespace Vexel {

struct Vector2 {
  float x = 0.0f;
  float y = 0.0f;

  Vector2() = default;
  Vector2(float x_value, float y_value) : x(x_value), y(y_value) {}
};

struct Vector3 {
  float x = 0.0f;
  float y = 0.0f;
  float z = 0.0f;

  Vector3() = default;
  Vector3(float x_value, float y_value, float z_value) : x(x_value), y(y_value), z(z_value) {}
};

inline bool operator==(const Vector2& a, const Vector2& b) {
  return a.x == b.x && a.y == b.y;
}
inline bool operator!=(const Vector2& a, const Vector2& b) {
  return !(a == b);
}
inline bool operator==(const Vector3& a, const Vector3& b) {
  return a.x == b.x && a.y == b.y && a.z == b.z;
}
inline bool operator!=(const Vector3& a, const Vector3& b) {
  return !(a == b);
}

// Red, green, blue and alpha in 0..1, not premultiplied.
struct Color {
  float r = 0.0f;
  float g = 0.0f;
  float b = 0.0f;
  float a = 1.0f;

  Color() = default;
  Color(float red, float green, float blue, float alpha = 1.0f)
      : r(red), g(green), b(blue), a(alpha) {}

  // From 8-bit channels (0..255 each).
  static Color fromBytes(std::uint8_t red, std::uint8_t green, std::uint8_t blue,
                         std::uint8_t alpha = 255) {
    return Color(red / 255.0f, green / 255.0f, blue / 255.0f, alpha / 255.0f);
  }
};

inline bool operator==(const Color& a, const Color& b) {
  return a.r == b.r && a.g == b.g && a.b == b.b && a.a == b.a;
}
inline bool operator!=(const Color& a, const Color& b) {
  return !(a == b);
}

// An angle in degrees, counter-clockwise seen from the camera.
class Degrees {
 public:
  Degrees() = default;
  explicit Degrees(float degrees) : value_(degrees) {}

  float valueDegrees() const { return value_; }
  float valueRadians() const { return value_ * 0.017453292519943295f; }

 private:
  float value_ = 0.0f;
};

inline bool operator==(const Degrees& a, const Degrees& b) {
  return a.valueDegrees() == b.valueDegrees();
}
inline bool operator!=(const Degrees& a, const Degrees& b) {
  return !(a == b);
}

// An axis-aligned rectangle in a node's own units, y upwards: left <= right
// and bottom <= top for a non-empty one.
struct Rect {
  float left = 0.0f;
  float top = 0.0f;
  float right = 0.0f;
  float bottom = 0.0f;

  Rect() = default;
  Rect(float left_edge, float top_edge, float right_edge, float bottom_edge)
      : left(left_edge), top(top_edge), right(right_edge), bottom(bottom_edge) {}

  float width() const { return right - left; }
  float height() const { return top - bottom; }
  bool isEmpty() const { return !(right > left) || !(top > bottom); }
};

inline bool operator==(const Rect& a, const Rect& b) {
  return a.left == b.left && a.top == b.top && a.right == b.right && a.bottom == b.bottom;
}
inline bool operator!=(const Rect& a, const Rect& b) {
  return !(a == b);
}

}  // namespace Vexel
