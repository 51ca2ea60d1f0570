// The failure of a GLSL stage to compile or of a program to link. Its message is one of two
// fixed texts; the driver's info log travels with it to where the failure is reported.
#ifndef WAVEFORM_GL_GLSL_EXCEPTION_H
#define WAVEFORM_GL_GLSL_EXCEPTION_H

#include <cstdint>
#include <exception>
#include <memory>
#include <string>

namespace Plugin::gl {

enum GLSLErrorType : uint32_t {
  GLSLErrorType_ShaderCompile = 0,
  GLSLErrorType_ShaderLink = 1,
};

class QvGLSLexception : public std::exception {
 public:
  explicit QvGLSLexception(GLSLErrorType type, std::string log = {});
  const char* what() const noexcept override { return message_; }
  GLSLErrorType errorType() const noexcept { return type_; }
  // The stage's or the program's info log as the driver wrote it; empty when it wrote none.
  const std::string& log() const noexcept { return *log_; }

 private:
  const char* message_;
  GLSLErrorType type_;
  std::shared_ptr<const std::string> log_;  // shared, so that copying cannot throw
};

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_GLSL_EXCEPTION_H
