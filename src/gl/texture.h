// A 2D texture the effect owns. Held only through shared references: the analysis result lives
// while the shared data or a reader holds it, and GL deletes it with the last reference.
#ifndef WAVEFORM_GL_TEXTURE_H
#define WAVEFORM_GL_TEXTURE_H

#include <memory>

#include "gl/gl_api.h"

namespace Plugin::gl {

class Texture {
 public:
  // A fresh GL texture name, no storage, scale 1.
  static std::shared_ptr<Texture> create();
  Texture();
  ~Texture();
  Texture(const Texture&) = delete;
  Texture& operator=(const Texture&) = delete;

  // Gives the texture storage of this size and internal format (depth formats get a depth pixel
  // format, all others GL_RED). An unchanged size and format only stores the new scale.
  void define(GLuint width, GLuint height, GLenum internalFormat, float scale);
  // Places a GPU fence after the commands that produced the texture, so that a reader on the
  // other thread's context can wait for them; an earlier fence is waited for and replaced.
  void placeFence();
  // Makes this context's later commands wait on the GPU for the fenced ones, then drops the
  // fence. Callers on different threads serialise this with the lock that publishes the texture.
  void waitAndDeleteFence();

  GLuint name() const { return name_; }
  GLsync fence() const { return fence_; }
  GLuint width() const { return width_; }
  GLuint height() const { return height_; }
  GLenum internalFormat() const { return internalFormat_; }
  float scale() const { return scale_; }

 private:
  GLuint name_ = 0;
  GLsync fence_ = nullptr;
  GLuint width_ = 0;
  GLuint height_ = 0;
  GLenum internalFormat_ = 0;
  float scale_ = 1.0f;
};

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_TEXTURE_H
