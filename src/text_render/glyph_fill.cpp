#include "text_render/glyph_fill.h"

#include "gl/gl_api.h"
#include "gl/vertex_attributes.h"
#include "gl/vertex_buffer.h"

namespace Plugin::gl {

void drawFill(const qvtl::geometry::CharacterOutline& outline, const host::HostCalls& host) {
  if (outline.indices.size() < 3 || outline.vertices.empty()) {
    return;
  }
  using qvtl::geometry::Point2f;
  glBindVertexArray(host.call(&vtpl::HostEffectRecord::vertexArray));
  {
    const VertexBufferObjectRAII vertices(
        host, outline.vertices.data(),
        static_cast<GLuint>(outline.vertices.size() * sizeof(Point2f)), GL_DYNAMIC_DRAW);
    const VertexBufferObjectRAII indices(
        host, outline.indices.data(),
        static_cast<GLuint>(outline.indices.size() * sizeof(uint32_t)), GL_DYNAMIC_DRAW,
        GL_ELEMENT_ARRAY_BUFFER);
    glEnableVertexAttribArray(kPositionLocation);
    glVertexAttribPointer(kPositionLocation, 2, GL_FLOAT, GL_FALSE, sizeof(Point2f), nullptr);
    glDrawElements(GL_TRIANGLES, static_cast<GLsizei>(outline.indices.size()), GL_UNSIGNED_INT,
                   nullptr);
    glDisableVertexAttribArray(kPositionLocation);
  }
  glBindVertexArray(0);
}

}  // namespace Plugin::gl
