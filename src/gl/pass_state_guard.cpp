#include "gl/pass_state_guard.h"

#include <exception>

namespace Plugin::gl {
namespace {

GLint integer(GLenum name) {
  GLint value = 0;
  glGetIntegerv(name, &value);
  return value;
}

GLint attachmentParameter(GLenum attachment, GLenum name) {
  GLint value = 0;
  glGetFramebufferAttachmentParameteriv(GL_FRAMEBUFFER, attachment, name, &value);
  return value;
}

}  // namespace

PassStateGuard::PassStateGuard(Restore when)
    : when_(when), exceptionsAtEntry_(std::uncaught_exceptions()) {
  blend_ = glIsEnabled(GL_BLEND);
  blendEquations_ = {integer(GL_BLEND_EQUATION_RGB), integer(GL_BLEND_EQUATION_ALPHA)};
  blendFactors_ = {integer(GL_BLEND_SRC_RGB), integer(GL_BLEND_DST_RGB),
                   integer(GL_BLEND_SRC_ALPHA), integer(GL_BLEND_DST_ALPHA)};
  stencilTest_ = glIsEnabled(GL_STENCIL_TEST);
  stencilFunction_ = {integer(GL_STENCIL_FUNC), integer(GL_STENCIL_REF),
                      integer(GL_STENCIL_VALUE_MASK)};
  stencilOperations_ = {integer(GL_STENCIL_FAIL), integer(GL_STENCIL_PASS_DEPTH_FAIL),
                        integer(GL_STENCIL_PASS_DEPTH_PASS)};
  glGetBooleanv(GL_COLOR_WRITEMASK, colourMask_.data());
  program_ = integer(GL_CURRENT_PROGRAM);
  framebuffer_ = integer(GL_DRAW_FRAMEBUFFER_BINDING);
  // The default framebuffer's attachments are not the effect's to change.
  if (framebuffer_ != 0) {
    for (auto [attachment, saved] :
         {std::pair{GL_COLOR_ATTACHMENT0, &colour_}, std::pair{GL_STENCIL_ATTACHMENT, &stencil_}}) {
      saved->type = attachmentParameter(attachment, GL_FRAMEBUFFER_ATTACHMENT_OBJECT_TYPE);
      if (saved->type != GL_NONE) {
        saved->name = attachmentParameter(attachment, GL_FRAMEBUFFER_ATTACHMENT_OBJECT_NAME);
      }
      if (saved->type == GL_TEXTURE) {
        saved->level = attachmentParameter(attachment, GL_FRAMEBUFFER_ATTACHMENT_TEXTURE_LEVEL);
      }
    }
  }
  glGetIntegerv(GL_VIEWPORT, viewport_.data());
  glGetFloatv(GL_POINT_SIZE, &pointSize_);
  activeTexture_ = integer(GL_ACTIVE_TEXTURE);
  vertexArray_ = integer(GL_VERTEX_ARRAY_BINDING);
  arrayBuffer_ = integer(GL_ARRAY_BUFFER_BINDING);
}

PassStateGuard::~PassStateGuard() {
  if (when_ == Restore::kAlways || std::uncaught_exceptions() > exceptionsAtEntry_) {
    restore();
  }
}

void PassStateGuard::restore() const {
  const auto enable = [](GLenum capability, GLboolean on) {
    on != GL_FALSE ? glEnable(capability) : glDisable(capability);
  };
  enable(GL_BLEND, blend_);
  glBlendEquationSeparate(static_cast<GLenum>(blendEquations_[0]),
                          static_cast<GLenum>(blendEquations_[1]));
  glBlendFuncSeparate(static_cast<GLenum>(blendFactors_[0]), static_cast<GLenum>(blendFactors_[1]),
                      static_cast<GLenum>(blendFactors_[2]), static_cast<GLenum>(blendFactors_[3]));
  enable(GL_STENCIL_TEST, stencilTest_);
  glStencilFunc(static_cast<GLenum>(stencilFunction_[0]), stencilFunction_[1],
                static_cast<GLuint>(stencilFunction_[2]));
  glStencilOp(static_cast<GLenum>(stencilOperations_[0]),
              static_cast<GLenum>(stencilOperations_[1]),
              static_cast<GLenum>(stencilOperations_[2]));
  glColorMask(colourMask_[0], colourMask_[1], colourMask_[2], colourMask_[3]);
  glUseProgram(static_cast<GLuint>(program_));
  glBindFramebuffer(GL_FRAMEBUFFER, static_cast<GLuint>(framebuffer_));
  if (framebuffer_ != 0) {
    for (auto [attachment, saved] :
         {std::pair{GL_COLOR_ATTACHMENT0, &colour_}, std::pair{GL_STENCIL_ATTACHMENT, &stencil_}}) {
      const auto name = static_cast<GLuint>(saved->name);
      if (saved->type == GL_RENDERBUFFER) {
        glFramebufferRenderbuffer(GL_FRAMEBUFFER, attachment, GL_RENDERBUFFER, name);
      } else {
        glFramebufferTexture2D(GL_FRAMEBUFFER, attachment, GL_TEXTURE_2D,
                               saved->type == GL_TEXTURE ? name : 0, saved->level);
      }
    }
  }
  glViewport(viewport_[0], viewport_[1], viewport_[2], viewport_[3]);
  glPointSize(pointSize_);
  glActiveTexture(static_cast<GLenum>(activeTexture_));
  glBindVertexArray(static_cast<GLuint>(vertexArray_));
  glBindBuffer(GL_ARRAY_BUFFER, static_cast<GLuint>(arrayBuffer_));
}

}  // namespace Plugin::gl
