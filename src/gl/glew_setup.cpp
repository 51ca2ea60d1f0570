#include "gl/glew_setup.h"

#include "gl/gl_api.h"

namespace Plugin::gl {

bool initialiseGlew() {
  // Core profiles list extensions only through glGetStringi, which this flag makes GLEW use.
  glewExperimental = GL_TRUE;
  const GLenum result = glewInit();
  return result == GLEW_OK || result == GLEW_ERROR_NO_GLX_DISPLAY;
}

}  // namespace Plugin::gl
