// The GL state a pass changes, put back when the pass is left. A pass that throws half-way
// (a host callback failing inside it, say) would otherwise leave blending or the stencil test
// on, its program bound and its own texture attached for whatever the host draws next.
#ifndef WAVEFORM_GL_PASS_STATE_GUARD_H
#define WAVEFORM_GL_PASS_STATE_GUARD_H

#include <array>

#include "gl/gl_api.h"

namespace Plugin::gl {

class PassStateGuard {
 public:
  enum class Restore {
    kOnException,  // a normal return keeps the state the pass leaves on purpose
    kAlways,       // the pass borrows the state and always hands it back
  };

  // Captures blending, the stencil test, the colour mask, the program, the framebuffer binding
  // with its colour and stencil attachments, the viewport, the point size, the active texture
  // unit and the vertex array and array buffer bindings.
  explicit PassStateGuard(Restore when = Restore::kOnException);
  ~PassStateGuard();
  PassStateGuard(const PassStateGuard&) = delete;
  PassStateGuard& operator=(const PassStateGuard&) = delete;

 private:
  struct Attachment {
    GLint type = GL_NONE;
    GLint name = 0;
    GLint level = 0;
  };

  void restore() const;

  Restore when_;
  int exceptionsAtEntry_;
  GLboolean blend_ = GL_FALSE;
  std::array<GLint, 2> blendEquations_{};  // colour, alpha
  std::array<GLint, 4> blendFactors_{};    // source and destination colour, then alpha
  GLboolean stencilTest_ = GL_FALSE;
  std::array<GLint, 3> stencilFunction_{};    // function, reference, mask
  std::array<GLint, 3> stencilOperations_{};  // fail, depth fail, pass
  std::array<GLboolean, 4> colourMask_{};
  GLint program_ = 0;
  GLint framebuffer_ = 0;
  Attachment colour_;
  Attachment stencil_;
  std::array<GLint, 4> viewport_{};
  GLfloat pointSize_ = 1;
  GLint activeTexture_ = GL_TEXTURE0;
  GLint vertexArray_ = 0;
  GLint arrayBuffer_ = 0;
};

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_PASS_STATE_GUARD_H
