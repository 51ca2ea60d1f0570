#include "gl/glsl_exception.h"

namespace Plugin::gl {

QvGLSLexception::QvGLSLexception(GLSLErrorType type) noexcept
    : message_(type == GLSLErrorType_ShaderCompile
                   ? "GLSLErrorType_ShaderCompile - The Shader failed to compile."
                   : "GLSLErrorType_ShaderLink - The shader program failed to link."),
      type_(type) {}

}  // namespace Plugin::gl
