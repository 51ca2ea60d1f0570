#include "gl/host_textures.h"

namespace Plugin::gl {
namespace {

constexpr uint32_t kModeRenderDestination = 0;

vtpl::HostTexture defaultTexture() {
  vtpl::HostTexture texture{};
  texture.pixelType = GL_FLOAT;
  texture.format = GL_RGBA;
  texture.factor1 = 1.0f;
  texture.factor2 = 1.0f;
  return texture;
}

// The record a working texture copies its format and pixel type from: the render's output in
// mode 0, the defaults otherwise. (The render record has no room for a texture record of its own:
// its texture scale sits four bytes after the place such a record would start.)
vtpl::HostTexture workingTemplate(const vtpl::HostEffectRecord& record) {
  const auto* render = static_cast<const vtpl::HostRenderRecord*>(record.messageRecord);
  if (record.modeValue == kModeRenderDestination && render != nullptr &&
      render->destination != nullptr) {
    return *render->destination;
  }
  return defaultTexture();
}

void clampToEdge(GLenum target) {
  glTexParameteri(target, GL_TEXTURE_WRAP_S, GL_CLAMP_TO_EDGE);
  glTexParameteri(target, GL_TEXTURE_WRAP_T, GL_CLAMP_TO_EDGE);
}

void filter(GLenum target, GLint mode) {
  glTexParameteri(target, GL_TEXTURE_MAG_FILTER, mode);
  glTexParameteri(target, GL_TEXTURE_MIN_FILTER, mode);
}

}  // namespace

void attachTexture(const vtpl::HostTexture& texture, GLuint level, GLenum attachment,
                   GLenum target) {
  glFramebufferTexture2D(GL_FRAMEBUFFER, attachment, target, texture.name,
                         static_cast<GLint>(level));
  glViewport(0, 0, static_cast<GLsizei>(texture.width >> level),
             static_cast<GLsizei>(texture.height >> level));
}

void bindTextureUnit(GLenum unit, GLenum target, GLuint name, bool linear) {
  glActiveTexture(unit);
  glBindTexture(target, name);
  clampToEdge(target);
  if (linear) {
    filter(target, GL_LINEAR);
  }
}

void resetTextureUnit(GLenum unit, GLenum target, bool nearest) {
  glActiveTexture(unit);
  clampToEdge(target);
  if (nearest) {
    filter(target, GL_NEAREST);
  }
}

void unbindTextureUnit(GLenum unit, GLenum target, bool nearest) {
  resetTextureUnit(unit, target, nearest);
  glBindTexture(target, 0);
}

QuadVertices textureQuad(const vtpl::HostTexture& t, GLuint width, GLuint height) {
  const auto w = static_cast<float>(width);
  const auto h = static_cast<float>(height);
  return {0, 0, t.uMin, t.vMin, w, 0, t.uMax, t.vMin, 0, h, t.uMin, t.vMax, w, h, t.uMax, t.vMax};
}

QuadVertices rectangleQuad(float left, float bottom, float right, float top) {
  return {left, bottom, 0, 0, right, bottom, 1, 0, left, top, 0, 1, right, top, 1, 1};
}

Matrix4 multiplyMatrices(const Matrix4& a, const Matrix4& b) {
  Matrix4 product{};
  for (int column = 0; column < 4; ++column) {
    for (int row = 0; row < 4; ++row) {
      float sum = 0;
      for (int k = 0; k < 4; ++k) {
        sum += b[k * 4 + row] * a[column * 4 + k];
      }
      product[column * 4 + row] = sum;
    }
  }
  return product;
}

Matrix4 orthographicMatrix(float width, float height) {
  return orthographicMatrix(0, width, 0, height);
}

Matrix4 orthographicMatrix(float left, float right, float bottom, float top) {
  const float width = right - left;
  const float height = top - bottom;
  Matrix4 projection{};  // column-major
  projection[0] = 2.0f / width;
  projection[5] = 2.0f / height;
  projection[10] = -1.0f;
  projection[12] = -(right + left) / width;
  projection[13] = -(top + bottom) / height;
  projection[15] = 1.0f;
  return projection;
}

vtpl::HostTexture acquireWorkingTexture(const HostCalls& host, GLuint width, GLuint height,
                                        bool wantFloat, bool hostFlag) {
  vtpl::HostTexture texture = workingTemplate(host.record());
  texture.width = width;
  texture.height = height;
  const GLenum internalFormat =
      wantFloat && texture.format == GL_RGBA ? GL_RGBA32F : texture.format;
  uint32_t allocatedWidth = 0;
  uint32_t allocatedHeight = 0;
  texture.name = host.call(&vtpl::HostEffectRecord::allocateTexture,
                           static_cast<const vtpl::HostRenderRecord*>(host.record().messageRecord),
                           width, height, internalFormat, GL_RGBA, texture.pixelType, 0u, 0u,
                           &allocatedWidth, &allocatedHeight, static_cast<uint8_t>(hostFlag));
  texture.allocatedWidth = allocatedWidth;
  texture.allocatedHeight = allocatedHeight;
  texture.uMin = 0.0f;
  texture.vMin = 0.0f;
  // A host that allocated nothing leaves the rectangle empty rather than dividing by zero.
  texture.uMax = allocatedWidth > 0 ? static_cast<float>(width) / allocatedWidth : 0.0f;
  texture.vMax = allocatedHeight > 0 ? static_cast<float>(height) / allocatedHeight : 0.0f;
  return texture;
}

}  // namespace Plugin::gl
