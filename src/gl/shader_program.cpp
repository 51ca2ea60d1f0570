#include "gl/shader_program.h"

namespace Plugin::gl {

ShaderProgram::~ShaderProgram() {
  try {
    constexpr GLsizei kMaxStages = 10;
    GLuint stages[kMaxStages] = {};
    GLsizei count = 0;
    glGetAttachedShaders(name, kMaxStages, &count, stages);
    for (GLsizei i = 0; i < count; ++i) {
      glDetachShader(name, stages[i]);
    }
    glDeleteProgram(name);
  } catch (...) {
    // Destruction must not throw; a failing driver call leaves nothing to clean up here.
  }
}

}  // namespace Plugin::gl
