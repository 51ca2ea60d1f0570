#include "gl/info_log.h"

#include <cstring>
#include <vector>

namespace Plugin::gl {
namespace {

// GL_INFO_LOG_LENGTH bytes, kept up to the first NUL when GL wrote anything.
template <typename GetLength, typename GetLog>
std::string infoLog(GLuint object, GetLength getLength, GetLog getLog) {
  GLint length = 0;
  getLength(object, GL_INFO_LOG_LENGTH, &length);
  if (length <= 0) {
    return {};
  }
  std::vector<char> buffer(static_cast<size_t>(length) + 1, '\0');
  GLsizei written = 0;
  getLog(object, length, &written, buffer.data());
  if (written <= 0) {
    return {};
  }
  return std::string(buffer.data(), strnlen(buffer.data(), static_cast<size_t>(length)));
}

}  // namespace

std::string shaderInfoLog(GLuint shader) {
  return infoLog(shader, glGetShaderiv, glGetShaderInfoLog);
}

std::string programInfoLog(GLuint program) {
  return infoLog(program, glGetProgramiv, glGetProgramInfoLog);
}

}  // namespace Plugin::gl
