#include "geometry/triangulate_pieces.h"
#include "gl/gl_api.h"
#include "gl/host_calls.h"
#include "gl/vertex_attributes.h"

namespace qvtl::geometry {
namespace {

// Asks the host for a buffer of `target` holding `data` and binds it.
GLuint createBoundBuffer(const Plugin::gl::HostCalls& host, GLenum target, const void* data,
                         size_t sizeBytes) {
  uint32_t filled = 0;
  const GLuint name = host.call(&vtpl::HostEffectRecord::createBuffer,
                                static_cast<uint32_t>(target), static_cast<uint32_t>(sizeBytes),
                                data, static_cast<uint32_t>(GL_DYNAMIC_DRAW), &filled, 0);
  glBindBuffer(target, name);
  return name;
}

// Unbinds the target and hands the buffer back to the host.
void releaseBoundBuffer(const Plugin::gl::HostCalls& host, GLenum target, GLuint name) {
  glBindBuffer(target, 0);
  host.call(&vtpl::HostEffectRecord::releaseBuffer, name);
}

}  // namespace

void drawFill(CharacterOutline& outline, const Plugin::gl::HostCalls& host) {
  triangulatePieces(outline);
  if (outline.indices.size() < 3 || outline.vertices.empty()) {
    return;
  }
  glBindVertexArray(host.call(&vtpl::HostEffectRecord::vertexArray));
  const GLuint vertices = createBoundBuffer(host, GL_ARRAY_BUFFER, outline.vertices.data(),
                                            outline.vertices.size() * sizeof(Point2f));
  const GLuint indices = createBoundBuffer(host, GL_ELEMENT_ARRAY_BUFFER, outline.indices.data(),
                                           outline.indices.size() * sizeof(uint32_t));
  glEnableVertexAttribArray(Plugin::gl::kPositionLocation);
  glVertexAttribPointer(Plugin::gl::kPositionLocation, 2, GL_FLOAT, GL_FALSE, sizeof(Point2f),
                        nullptr);
  glDrawElements(GL_TRIANGLES, static_cast<GLsizei>(outline.indices.size()), GL_UNSIGNED_INT,
                 nullptr);
  glDisableVertexAttribArray(Plugin::gl::kPositionLocation);
  releaseBoundBuffer(host, GL_ELEMENT_ARRAY_BUFFER, indices);
  releaseBoundBuffer(host, GL_ARRAY_BUFFER, vertices);
  glBindVertexArray(0);
}

}  // namespace qvtl::geometry
