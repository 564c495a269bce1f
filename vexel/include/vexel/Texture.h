#pragma once

#include <memory>
#include <string>

#include "vexel/Exception.h"

namespace Vexel {

class ResourceManager;

// A 2D image on the graphics device. Texture coordinates (0, 0) address the
// first pixel of the data given to setImage, u along a row, v down the rows.
class Texture {
 public:
  enum Type {
    TYPE_2D = 0,
  };
  // Rows are tightly packed, the first row first.
  enum PixelFormat {
    PIXEL_FORMAT_L8 = 0,        // luminance, 8 bits
    PIXEL_FORMAT_A8 = 1,        // alpha, 8 bits
    PIXEL_FORMAT_LA8 = 2,       // luminance and alpha, 8 bits each
    PIXEL_FORMAT_RGB565 = 3,    // one native-endian 16-bit word per pixel
    PIXEL_FORMAT_RGBA4444 = 4,  // one native-endian 16-bit word per pixel
    PIXEL_FORMAT_RGBA5551 = 5,  // one native-endian 16-bit word per pixel
    PIXEL_FORMAT_RGB8 = 6,      // red, green, blue, 8 bits each
    PIXEL_FORMAT_BGRA8 = 7,     // blue, green, red, alpha, 8 bits each
    PIXEL_FORMAT_RGBA8 = 8,     // red, green, blue, alpha, 8 bits each
  };
  // The mipmap variants apply to minification only; as a magnification
  // filter they mean their plain counterpart.
  enum FilterMode {
    FILTER_NEAREST = 0,
    FILTER_NEAREST_MIPMAP = 1,
    FILTER_LINEAR = 2,
    FILTER_LINEAR_MIPMAP = 3,
  };
  enum WrapMode {
    WRAP_CLAMP = 0,  // clamp to edge
    WRAP_REPEAT = 1,
    WRAP_MIRROR = 2,
  };

  // Defaults: linear filtering, clamp to edge. With `mipmaps`, setImage builds
  // mipmaps when the image's sides are powers of two.
  Texture(ResourceManager& resources, const char* name, Type type, bool mipmaps);
  ~Texture();
  Texture(const Texture&) = delete;
  Texture& operator=(const Texture&) = delete;

  const std::string& getName() const;

  // Copies the image to the device. Null data allocates an image of that
  // size with undefined content. Sizes below 0 throw Vexel::Exception.
  void setImage(const unsigned char* data, int width, int height, PixelFormat format);
  int getWidth() const;
  int getHeight() const;

  void setMinFilterMode(FilterMode mode);
  void setMagFilterMode(FilterMode mode);
  void setUWrapMode(WrapMode mode);
  void setVWrapMode(WrapMode mode);
  FilterMode getMinFilterMode() const;
  FilterMode getMagFilterMode() const;
  WrapMode getUWrapMode() const;
  WrapMode getVWrapMode() const;

  class Impl;

 private:
  friend struct detail::Access;
  std::shared_ptr<Impl> impl_;
};

}  // namespace Vexel
