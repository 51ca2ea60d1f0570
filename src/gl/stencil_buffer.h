// Stencil render buffers for the analysis passes, and the per-instance pool that reuses them.
#ifndef WAVEFORM_GL_STENCIL_BUFFER_H
#define WAVEFORM_GL_STENCIL_BUFFER_H

#include <memory>
#include <mutex>

#include "gl/gl_api.h"
#include "gl/resource_types.h"

namespace Plugin::gl {

class StencilRenderBuffer {
 public:
  StencilRenderBuffer() { glGenRenderbuffers(1, &name_); }
  ~StencilRenderBuffer() { glDeleteRenderbuffers(1, &name_); }
  StencilRenderBuffer(const StencilRenderBuffer&) = delete;
  StencilRenderBuffer& operator=(const StencilRenderBuffer&) = delete;

  GLuint name() const { return name_; }
  GLuint width = 0;  // of the current storage
  GLuint height = 0;
  GLenum internalFormat = 0;

 private:
  GLuint name_ = 0;
};

// Hands out a pooled buffer nobody else holds, or a new one added to the pool. The caller keeps
// the reference for its pass, which keeps the buffer out of other hands. Guarded by the
// instance's resource lock, since both host threads draw.
std::shared_ptr<StencilRenderBuffer> acquireStencilBuffer(StencilBufferList& pool,
                                                          std::recursive_mutex& resourceLock);

// Gives the buffer 8-bit stencil storage of this size when it has other storage, keeping the
// draw framebuffer bound, then attaches it as the bound framebuffer's stencil attachment.
void attachStencil(StencilRenderBuffer& buffer, GLuint width, GLuint height);

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_STENCIL_BUFFER_H
