// One compiled GLSL stage. It lives only while its program is built: once attached, dropping the
// last reference lets GL delete the stage together with the program.
#ifndef WAVEFORM_GL_QV_SHADER_H
#define WAVEFORM_GL_QV_SHADER_H

#include <memory>
#include <string>

#include "gl/gl_api.h"
#include "gl/shader_log.h"

namespace Plugin::gl {

class QvShader {
 public:
  // A new GL shader object of `stage` (GL_VERTEX_SHADER, GL_FRAGMENT_SHADER, GL_GEOMETRY_SHADER);
  // its name is 0 when GL could not create one.
  static std::shared_ptr<QvShader> create(GLenum stage);
  explicit QvShader(GLenum stage);
  ~QvShader();
  QvShader(const QvShader&) = delete;
  QvShader& operator=(const QvShader&) = delete;

  // Uploads `source` with its explicit length and compiles it, appending the stage's log to
  // `log`. Throws QvGLSLexception (compile) when GL reports failure. A stage without a GL name
  // is left uncompiled; its program then fails to link.
  void compile(const std::string& source, ShaderLog& log);

  GLuint name() const { return name_; }
  GLenum stage() const { return stage_; }
  GLint compiled() const { return compiled_; }
  const std::string& log() const { return log_; }

 private:
  GLuint name_ = 0;
  GLenum stage_;
  GLint compiled_ = 0;
  std::string log_;
};

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_QV_SHADER_H
