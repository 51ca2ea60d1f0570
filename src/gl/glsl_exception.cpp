#include "gl/glsl_exception.h"

#include <utility>

namespace Plugin::gl {

QvGLSLexception::QvGLSLexception(GLSLErrorType type, std::string log)
    : message_(type == GLSLErrorType_ShaderCompile
                   ? "GLSLErrorType_ShaderCompile - The Shader failed to compile."
                   : "GLSLErrorType_ShaderLink - The shader program failed to link."),
      type_(type),
      log_(std::make_shared<const std::string>(std::move(log))) {}

}  // namespace Plugin::gl
