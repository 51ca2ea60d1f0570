#include "layer_textures.h"

#include <GL/glew.h>

#include <vector>

namespace vtpl::host {
namespace {

constexpr uint32_t kFormatRgba = 0x1908;     // GL_RGBA
constexpr uint32_t kFormatRgba32F = 0x881A;  // GL_RGBA32F

uint32_t nextPowerOfTwo(uint32_t value) {
  uint32_t power = 1;
  while (power < value) {
    power <<= 1;
  }
  return power;
}

}  // namespace

HostTexture allocateLayerTexture(uint32_t width, uint32_t height, bool asFloat, bool pad) {
  HostTexture texture{};
  texture.pixelType = asFloat ? GL_FLOAT : GL_UNSIGNED_BYTE;
  texture.format = asFloat ? kFormatRgba32F : kFormatRgba;
  texture.width = width;
  texture.height = height;
  texture.allocatedWidth = pad ? nextPowerOfTwo(width) : width;
  texture.allocatedHeight = pad ? nextPowerOfTwo(height) : height;
  texture.uMax = static_cast<float>(width) / texture.allocatedWidth;
  texture.vMax = static_cast<float>(height) / texture.allocatedHeight;
  texture.factor1 = texture.factor2 = 1.0f;
  glGenTextures(1, &texture.name);
  glBindTexture(GL_TEXTURE_2D, texture.name);
  glTexImage2D(GL_TEXTURE_2D, 0, asFloat ? GL_RGBA32F : GL_RGBA8,
               static_cast<GLsizei>(texture.allocatedWidth),
               static_cast<GLsizei>(texture.allocatedHeight), 0, GL_RGBA, GL_FLOAT, nullptr);
  glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_NEAREST);
  glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER, GL_NEAREST);
  glBindTexture(GL_TEXTURE_2D, 0);
  return texture;
}

HostTexture uploadLayer(const Image& picture, bool asFloat, bool pad) {
  HostTexture texture = allocateLayerTexture(static_cast<uint32_t>(picture.width),
                                             static_cast<uint32_t>(picture.height), asFloat, pad);
  std::vector<float> premultiplied(picture.rgba.size());
  for (int y = 0; y < picture.height; ++y) {
    // GL's first row is the bottom of the picture.
    float* out = &premultiplied[4 * static_cast<size_t>(picture.height - 1 - y) * picture.width];
    for (int x = 0; x < picture.width; ++x, out += 4) {
      const float* in = picture.pixel(x, y);
      out[0] = in[0] * in[3];
      out[1] = in[1] * in[3];
      out[2] = in[2] * in[3];
      out[3] = in[3];
    }
  }
  glBindTexture(GL_TEXTURE_2D, texture.name);
  glPixelStorei(GL_UNPACK_ALIGNMENT, 1);
  glTexSubImage2D(GL_TEXTURE_2D, 0, 0, 0, picture.width, picture.height, GL_RGBA, GL_FLOAT,
                  premultiplied.data());
  glBindTexture(GL_TEXTURE_2D, 0);
  return texture;
}

Image readLayer(const HostTexture& texture, int bitDepth) {
  Image picture;
  picture.width = static_cast<int>(texture.width);
  picture.height = static_cast<int>(texture.height);
  picture.bitDepth = bitDepth;
  std::vector<float> premultiplied(4 * static_cast<size_t>(picture.width) * picture.height);
  GLuint framebuffer = 0;
  GLint previous = 0;
  glGetIntegerv(GL_READ_FRAMEBUFFER_BINDING, &previous);
  glGenFramebuffers(1, &framebuffer);
  glBindFramebuffer(GL_READ_FRAMEBUFFER, framebuffer);
  glFramebufferTexture2D(GL_READ_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, texture.name, 0);
  glPixelStorei(GL_PACK_ALIGNMENT, 1);
  glReadPixels(0, 0, picture.width, picture.height, GL_RGBA, GL_FLOAT, premultiplied.data());
  glBindFramebuffer(GL_READ_FRAMEBUFFER, static_cast<GLuint>(previous));
  glDeleteFramebuffers(1, &framebuffer);

  picture.rgba.resize(premultiplied.size());
  for (int y = 0; y < picture.height; ++y) {
    const float* in =
        &premultiplied[4 * static_cast<size_t>(picture.height - 1 - y) * picture.width];
    for (int x = 0; x < picture.width; ++x, in += 4) {
      float* out = picture.pixel(x, y);
      const float alpha = in[3];
      for (int c = 0; c < 3; ++c) {
        out[c] = alpha > 0 ? in[c] / alpha : 0.0f;
      }
      out[3] = alpha;
    }
  }
  return picture;
}

void deleteLayerTexture(HostTexture& texture) {
  if (texture.name != 0) {
    glDeleteTextures(1, &texture.name);
    texture.name = 0;
  }
}

}  // namespace vtpl::host
