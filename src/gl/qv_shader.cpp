#include "gl/qv_shader.h"

#include "gl/glsl_exception.h"
#include "gl/info_log.h"

namespace Plugin::gl {

std::shared_ptr<QvShader> QvShader::create(GLenum stage) {
  return std::make_shared<QvShader>(stage);
}

QvShader::QvShader(GLenum stage) : stage_(stage) {
  name_ = glCreateShader(stage);
}

QvShader::~QvShader() {
  if (name_ != 0) {
    glDeleteShader(name_);
  }
}

void QvShader::compile(const std::string& source, ShaderLog& log) {
  if (name_ == 0) {
    return;
  }
  const GLchar* text = source.data();
  const auto length = static_cast<GLint>(source.size());
  glShaderSource(name_, 1, &text, &length);
  glCompileShader(name_);
  glGetShaderiv(name_, GL_COMPILE_STATUS, &compiled_);
  if (log_.empty()) {
    log_ = shaderInfoLog(name_);
  }
  log.append(log_);
  if (compiled_ == 0) {
    throw QvGLSLexception(GLSLErrorType_ShaderCompile, log_);
  }
}

}  // namespace Plugin::gl
