#include "gl/vertex_buffer.h"

#include "gl/vertex_attributes.h"

namespace Plugin::gl {
namespace {

constexpr GLsizei kVertexStride = 4 * sizeof(float);

}  // namespace

VertexBufferObjectRAII::VertexBufferObjectRAII(const host::HostCalls& host, const void* data,
                                               GLuint sizeBytes, GLenum usage, GLenum target)
    : buffer_(host, target, data, sizeBytes, usage), target_(target) {
  glBindBuffer(target_, buffer_.name());
}

VertexBufferObjectRAII::~VertexBufferObjectRAII() {
  glBindBuffer(target_, 0);
}

void drawQuadArrays(const host::HostCalls& host, const float* vertices, GLsizei vertexCount,
                    GLenum mode) {
  glBindVertexArray(host.call(&vtpl::HostEffectRecord::vertexArray));
  {
    const VertexBufferObjectRAII buffer(
        host, vertices, static_cast<GLuint>(vertexCount) * kVertexStride, GL_DYNAMIC_DRAW);
    glEnableVertexAttribArray(kPositionLocation);
    glVertexAttribPointer(kPositionLocation, 2, GL_FLOAT, GL_FALSE, kVertexStride, nullptr);
    glEnableVertexAttribArray(kTexCoordLocation);
    glVertexAttribPointer(kTexCoordLocation, 2, GL_FLOAT, GL_FALSE, kVertexStride,
                          reinterpret_cast<const void*>(2 * sizeof(float)));
    glDrawArrays(mode, 0, vertexCount);
    glDisableVertexAttribArray(kPositionLocation);
    glDisableVertexAttribArray(kTexCoordLocation);
  }
  glBindVertexArray(0);
}

void drawPositionArrays(const host::HostCalls& host, const float* vertices, GLsizei vertexCount,
                        GLenum mode) {
  constexpr GLsizei kPositionStride = 2 * sizeof(float);
  glBindVertexArray(host.call(&vtpl::HostEffectRecord::vertexArray));
  {
    const VertexBufferObjectRAII buffer(
        host, vertices, static_cast<GLuint>(vertexCount) * kPositionStride, GL_DYNAMIC_DRAW);
    glEnableVertexAttribArray(kPositionLocation);
    glVertexAttribPointer(kPositionLocation, 2, GL_FLOAT, GL_FALSE, kPositionStride, nullptr);
    glDrawArrays(mode, 0, vertexCount);
    glDisableVertexAttribArray(kPositionLocation);
  }
  glBindVertexArray(0);
}

}  // namespace Plugin::gl
