#include "gl/texture_units.h"

namespace Plugin::gl {
namespace {

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

}  // namespace Plugin::gl
