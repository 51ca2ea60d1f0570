#include "gl/glew_setup.h"

#include <atomic>

#include "gl/gl_api.h"

namespace Plugin::gl {
namespace {

std::atomic<bool> loaded{false};

}  // namespace

bool initialiseGlew() {
  // Core profiles list extensions only through glGetStringi, which this flag makes GLEW use.
  glewExperimental = GL_TRUE;
  const GLenum result = glewInit();
  const bool success = result == GLEW_OK || result == GLEW_ERROR_NO_GLX_DISPLAY;
  if (success) {
    loaded = true;
  }
  return success;
}

bool glewLoaded() {
  return loaded;
}

}  // namespace Plugin::gl
