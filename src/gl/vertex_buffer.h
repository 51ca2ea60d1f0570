// A vertex buffer the host provides, filled with the given data at creation and handed back to
// the host when the wrapper goes.
#ifndef WAVEFORM_GL_VERTEX_BUFFER_H
#define WAVEFORM_GL_VERTEX_BUFFER_H

#include "gl/gl_api.h"
#include "gl/host_calls.h"

namespace Plugin::gl {

class VertexBufferObjectRAII {
 public:
  // Asks the host for a GL_ARRAY_BUFFER of `sizeBytes` holding `data` and binds it.
  VertexBufferObjectRAII(const HostCalls& host, const void* data, GLuint sizeBytes, GLenum usage,
                         bool keepBuffer = false);
  // Unbinds the target and, unless kept, hands the buffer back.
  ~VertexBufferObjectRAII();
  VertexBufferObjectRAII(const VertexBufferObjectRAII&) = delete;
  VertexBufferObjectRAII& operator=(const VertexBufferObjectRAII&) = delete;

  GLuint name() const { return name_; }

 private:
  vtpl::HostEffectRecord* record_;
  vtpl::HostContext context_;
  GLuint name_ = 0;
  GLenum target_ = GL_ARRAY_BUFFER;
  uint32_t filled_ = 0;  // written by the host's createBuffer
  bool keepBuffer_;
};

// Draws `vertexCount` (x, y, u, v) vertices with position at attribute 0 and texture coordinate
// at attribute 8, through the host's vertex array and a host buffer.
void drawQuadArrays(const HostCalls& host, const float* vertices, GLsizei vertexCount, GLenum mode);
// Draws `vertexCount` (x, y) vertices, position only, at attribute 0.
void drawPositionArrays(const HostCalls& host, const float* vertices, GLsizei vertexCount,
                        GLenum mode);

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_VERTEX_BUFFER_H
