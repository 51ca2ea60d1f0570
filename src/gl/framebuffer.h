// A framebuffer object the effect owns.
#ifndef WAVEFORM_GL_FRAMEBUFFER_H
#define WAVEFORM_GL_FRAMEBUFFER_H

#include "gl/gl_api.h"

namespace Plugin::gl {

class FBO {
 public:
  FBO() {
    glGenFramebuffers(1, &name_);
    created_ = true;
  }
  ~FBO() {
    if (created_) {
      glDeleteFramebuffers(1, &name_);
    }
  }
  FBO(const FBO&) = delete;
  FBO& operator=(const FBO&) = delete;

  GLuint name() const { return name_; }

 private:
  GLuint name_ = 0;
  bool created_ = false;
};

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_FRAMEBUFFER_H
