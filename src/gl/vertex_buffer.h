// A vertex buffer the host provides, filled with the given data at creation, bound while the
// wrapper lives and handed back to the host when it goes.
#ifndef WAVEFORM_GL_VERTEX_BUFFER_H
#define WAVEFORM_GL_VERTEX_BUFFER_H

#include "gl/gl_api.h"
#include "host_access/host_buffer.h"
#include "host_access/host_calls.h"

namespace Plugin::gl {

class VertexBufferObjectRAII {
 public:
  // Asks the host for a buffer of `target` holding `sizeBytes` of `data` and binds it.
  VertexBufferObjectRAII(const host::HostCalls& host, const void* data, GLuint sizeBytes,
                         GLenum usage, GLenum target = GL_ARRAY_BUFFER);
  // Unbinds the target, then the buffer goes back to the host.
  ~VertexBufferObjectRAII();
  VertexBufferObjectRAII(const VertexBufferObjectRAII&) = delete;
  VertexBufferObjectRAII& operator=(const VertexBufferObjectRAII&) = delete;

  GLuint name() const { return buffer_.name(); }

 private:
  host::HostBuffer buffer_;
  GLenum target_;
};

// Draws `vertexCount` (x, y, u, v) vertices with position at attribute 0 and texture coordinate
// at attribute 8, through the host's vertex array and a host buffer.
void drawQuadArrays(const host::HostCalls& host, const float* vertices, GLsizei vertexCount,
                    GLenum mode);
// Draws `vertexCount` (x, y) vertices, position only, at attribute 0.
void drawPositionArrays(const host::HostCalls& host, const float* vertices, GLsizei vertexCount,
                        GLenum mode);

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_VERTEX_BUFFER_H
