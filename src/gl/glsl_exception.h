// The failure of a GLSL stage to compile or of a program to link. It carries one of two fixed
// messages; the GL info log goes to the ShaderLog instead.
#ifndef WAVEFORM_GL_GLSL_EXCEPTION_H
#define WAVEFORM_GL_GLSL_EXCEPTION_H

#include <cstdint>
#include <exception>

namespace Plugin::gl {

enum GLSLErrorType : uint32_t {
  GLSLErrorType_ShaderCompile = 0,
  GLSLErrorType_ShaderLink = 1,
};

class QvGLSLexception : public std::exception {
 public:
  explicit QvGLSLexception(GLSLErrorType type) noexcept;
  const char* what() const noexcept override { return message_; }
  GLSLErrorType errorType() const noexcept { return type_; }

 private:
  const char* message_;
  GLSLErrorType type_;
};

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_GLSL_EXCEPTION_H
