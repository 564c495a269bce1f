#include <cstdint>
#include <vector>

#include "access.h"
#include "texture_impl.h"

namespace Vexel {
namespace {

struct UploadFormat {
  GLenum format;
  GLenum type;
  int bytes_per_pixel;
};

UploadFormat FormatOf(Texture::PixelFormat format) {
  switch (format) {
    case Texture::PIXEL_FORMAT_L8:
      return {GL_LUMINANCE, GL_UNSIGNED_BYTE, 1};
    case Texture::PIXEL_FORMAT_A8:
      return {GL_ALPHA, GL_UNSIGNED_BYTE, 1};
    case Texture::PIXEL_FORMAT_LA8:
      return {GL_LUMINANCE_ALPHA, GL_UNSIGNED_BYTE, 2};
    case Texture::PIXEL_FORMAT_RGB565:
      return {GL_RGB, GL_UNSIGNED_SHORT_5_6_5, 2};
    case Texture::PIXEL_FORMAT_RGBA4444:
      return {GL_RGBA, GL_UNSIGNED_SHORT_4_4_4_4, 2};
    case Texture::PIXEL_FORMAT_RGBA5551:
      return {GL_RGBA, GL_UNSIGNED_SHORT_5_5_5_1, 2};
    case Texture::PIXEL_FORMAT_RGB8:
      return {GL_RGB, GL_UNSIGNED_BYTE, 3};
    case Texture::PIXEL_FORMAT_BGRA8:  // swizzled to RGBA on upload
    case Texture::PIXEL_FORMAT_RGBA8:
      return {GL_RGBA, GL_UNSIGNED_BYTE, 4};
  }
  throw Exception("Vexel: unknown pixel format " + std::to_string(static_cast<int>(format)));
}

bool IsPowerOfTwo(int value) {
  return value > 0 && (value & (value - 1)) == 0;
}

GLenum FilterOf(Texture::FilterMode mode, bool minifying, bool has_mipmaps) {
  const bool mip = minifying && has_mipmaps;
  switch (mode) {
    case Texture::FILTER_NEAREST:
      return GL_NEAREST;
    case Texture::FILTER_NEAREST_MIPMAP:
      return mip ? GL_NEAREST_MIPMAP_NEAREST : GL_NEAREST;
    case Texture::FILTER_LINEAR:
      return GL_LINEAR;
    case Texture::FILTER_LINEAR_MIPMAP:
      return mip ? GL_LINEAR_MIPMAP_LINEAR : GL_LINEAR;
  }
  return GL_LINEAR;
}

GLenum WrapOf(Texture::WrapMode mode, bool power_of_two) {
  // Repeating wraps need power-of-two sides in OpenGL ES 2; other images
  // clamp rather than read as black.
  if (!power_of_two)
    return GL_CLAMP_TO_EDGE;
  switch (mode) {
    case Texture::WRAP_CLAMP:
      return GL_CLAMP_TO_EDGE;
    case Texture::WRAP_REPEAT:
      return GL_REPEAT;
    case Texture::WRAP_MIRROR:
      return GL_MIRRORED_REPEAT;
  }
  return GL_CLAMP_TO_EDGE;
}

}  // namespace

void Texture::Impl::Bind(GLuint unit) {
  glActiveTexture(GL_TEXTURE0 + unit);
  glBindTexture(GL_TEXTURE_2D, texture ? texture->id() : 0);
  if (!texture || !parameters_dirty)
    return;
  const bool pot = IsPowerOfTwo(width) && IsPowerOfTwo(height);
  glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER,
                  static_cast<GLint>(FilterOf(min_filter, true, has_mipmaps)));
  glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER,
                  static_cast<GLint>(FilterOf(mag_filter, false, has_mipmaps)));
  glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_WRAP_S, static_cast<GLint>(WrapOf(wrap_u, pot)));
  glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_WRAP_T, static_cast<GLint>(WrapOf(wrap_v, pot)));
  parameters_dirty = false;
}

Texture::Texture(ResourceManager& resources, const char* name, Type type, bool mipmaps)
    : impl_(std::make_shared<Impl>()) {
  if (type != TYPE_2D)
    throw Exception("Vexel: unknown texture type " + std::to_string(static_cast<int>(type)));
  impl_->resources = internal::Access::SharedImplOf(resources);
  impl_->name = name != nullptr ? name : "";
  impl_->mipmaps_wanted = mipmaps;
}

Texture::~Texture() = default;

const std::string& Texture::getName() const {
  return impl_->name;
}

void Texture::setImage(const unsigned char* data, int width, int height, PixelFormat format) {
  Impl& t = *impl_;
  if (width < 0 || height < 0) {
    throw Exception("Vexel: texture \"" + t.name + "\": image size " + std::to_string(width) + "x" +
                    std::to_string(height) + " is negative");
  }
  const UploadFormat upload = FormatOf(format);
  std::vector<unsigned char> swizzled;
  if (format == PIXEL_FORMAT_BGRA8 && data != nullptr) {
    swizzled.assign(data, data + static_cast<std::size_t>(width) * height * 4);
    for (std::size_t i = 0; i < swizzled.size(); i += 4)
      std::swap(swizzled[i], swizzled[i + 2]);
    data = swizzled.data();
  }
  if (!t.texture) {
    t.texture = std::make_shared<internal::GlObject>(internal::Gpu::Acquire(),
                                                     internal::GlObject::kTexture);
  }
  t.texture->gpu().MakeCurrent();
  glActiveTexture(GL_TEXTURE0);
  glBindTexture(GL_TEXTURE_2D, t.texture->id());
  glPixelStorei(GL_UNPACK_ALIGNMENT, 1);
  const bool same_storage = width == t.width && height == t.height &&
                            FormatOf(t.format).format == upload.format &&
                            FormatOf(t.format).type == upload.type && !t.has_mipmaps;
  if (same_storage && data != nullptr && width > 0 && height > 0) {
    glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, width, height, upload.format, upload.type, data);
  } else if (!same_storage) {
    glTexImage2D(GL_TEXTURE_2D, 0, static_cast<GLint>(upload.format), width, height, 0,
                 upload.format, upload.type, data);
  }
  t.has_mipmaps = t.mipmaps_wanted && IsPowerOfTwo(width) && IsPowerOfTwo(height);
  if (t.has_mipmaps)
    glGenerateMipmap(GL_TEXTURE_2D);
  t.width = width;
  t.height = height;
  t.format = format;
  t.parameters_dirty = true;
  glBindTexture(GL_TEXTURE_2D, 0);
}

int Texture::getWidth() const {
  return impl_->width;
}
int Texture::getHeight() const {
  return impl_->height;
}

void Texture::setMinFilterMode(FilterMode mode) {
  impl_->min_filter = mode;
  impl_->parameters_dirty = true;
}
void Texture::setMagFilterMode(FilterMode mode) {
  impl_->mag_filter = mode;
  impl_->parameters_dirty = true;
}
void Texture::setUWrapMode(WrapMode mode) {
  impl_->wrap_u = mode;
  impl_->parameters_dirty = true;
}
void Texture::setVWrapMode(WrapMode mode) {
  impl_->wrap_v = mode;
  impl_->parameters_dirty = true;
}
Texture::FilterMode Texture::getMinFilterMode() const {
  return impl_->min_filter;
}
Texture::FilterMode Texture::getMagFilterMode() const {
  return impl_->mag_filter;
}
Texture::WrapMode Texture::getUWrapMode() const {
  return impl_->wrap_u;
}
Texture::WrapMode Texture::getVWrapMode() const {
  return impl_->wrap_v;
}

}  // namespace Vexel
