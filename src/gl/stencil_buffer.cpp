#include "gl/stencil_buffer.h"

namespace Plugin::gl {

std::shared_ptr<StencilRenderBuffer> acquireStencilBuffer(StencilBufferList& pool,
                                                          std::recursive_mutex& resourceLock) {
  const std::lock_guard<std::recursive_mutex> guard(resourceLock);
  for (const std::shared_ptr<StencilRenderBuffer>& buffer : pool) {
    if (buffer.use_count() == 1) {
      return buffer;
    }
  }
  pool.push_back(std::make_shared<StencilRenderBuffer>());
  return pool.back();
}

void attachStencil(StencilRenderBuffer& buffer, GLuint width, GLuint height) {
  if (buffer.width != width || buffer.height != height ||
      buffer.internalFormat != GL_STENCIL_INDEX8) {
    GLint drawFramebuffer = 0;
    glGetIntegerv(GL_DRAW_FRAMEBUFFER_BINDING, &drawFramebuffer);
    glBindRenderbuffer(GL_RENDERBUFFER, buffer.name());
    glRenderbufferStorage(GL_RENDERBUFFER, GL_STENCIL_INDEX8, static_cast<GLsizei>(width),
                          static_cast<GLsizei>(height));
    buffer.width = width;
    buffer.height = height;
    buffer.internalFormat = GL_STENCIL_INDEX8;
    glBindFramebuffer(GL_DRAW_FRAMEBUFFER, static_cast<GLuint>(drawFramebuffer));
  }
  glFramebufferRenderbuffer(GL_FRAMEBUFFER, GL_STENCIL_ATTACHMENT, GL_RENDERBUFFER, buffer.name());
}

}  // namespace Plugin::gl
