#include "gl_test_context.h"

#include <EGL/egl.h>
#include <EGL/eglext.h>

#include <cstdlib>
#include <cstring>

#include "gl/glew_setup.h"

namespace waveform_test {
namespace {

struct TestContext {
  EGLDisplay display = EGL_NO_DISPLAY;
  EGLContext context = EGL_NO_CONTEXT;
  std::string failure;
};

TestContext createContext() {
  TestContext result;
  const auto getPlatformDisplay = reinterpret_cast<PFNEGLGETPLATFORMDISPLAYEXTPROC>(
      eglGetProcAddress("eglGetPlatformDisplayEXT"));
  if (getPlatformDisplay == nullptr) {
    result.failure = "EGL has no eglGetPlatformDisplayEXT";
    return result;
  }
  result.display = getPlatformDisplay(EGL_PLATFORM_SURFACELESS_MESA, EGL_DEFAULT_DISPLAY, nullptr);
  EGLint major = 0, minor = 0;
  if (result.display == EGL_NO_DISPLAY || !eglInitialize(result.display, &major, &minor)) {
    result.failure = "no surfaceless EGL display";
    return result;
  }
  const EGLint configAttributes[] = {EGL_SURFACE_TYPE,
                                     EGL_PBUFFER_BIT,
                                     EGL_RENDERABLE_TYPE,
                                     EGL_OPENGL_BIT,
                                     EGL_RED_SIZE,
                                     8,
                                     EGL_GREEN_SIZE,
                                     8,
                                     EGL_BLUE_SIZE,
                                     8,
                                     EGL_ALPHA_SIZE,
                                     8,
                                     EGL_NONE};
  EGLConfig config = nullptr;
  EGLint configCount = 0;
  if (!eglChooseConfig(result.display, configAttributes, &config, 1, &configCount) ||
      configCount == 0 || !eglBindAPI(EGL_OPENGL_API)) {
    result.failure = "no EGL config for desktop OpenGL";
    return result;
  }
  const EGLint contextAttributes[] = {EGL_CONTEXT_MAJOR_VERSION,
                                      4,
                                      EGL_CONTEXT_MINOR_VERSION,
                                      1,
                                      EGL_CONTEXT_OPENGL_PROFILE_MASK,
                                      EGL_CONTEXT_OPENGL_CORE_PROFILE_BIT,
                                      EGL_NONE};
  result.context = eglCreateContext(result.display, config, EGL_NO_CONTEXT, contextAttributes);
  if (result.context == EGL_NO_CONTEXT) {
    result.failure = "cannot create an OpenGL 4.1 core context";
    return result;
  }
  if (!eglMakeCurrent(result.display, EGL_NO_SURFACE, EGL_NO_SURFACE, result.context)) {
    result.failure = "cannot make the context current without a surface";
    return result;
  }
  if (!Plugin::gl::initialiseGlew()) {
    result.failure = "GLEW could not load the GL entry points";
  }
  return result;
}

}  // namespace

std::string makeTestContextCurrent() {
  static const TestContext context = createContext();
  if (context.failure.empty()) {
    eglMakeCurrent(context.display, EGL_NO_SURFACE, EGL_NO_SURFACE, context.context);
  }
  return context.failure;
}

void GlTest::SetUp() {
  const std::string failure = makeTestContextCurrent();
  if (failure.empty()) {
    return;
  }
  const char* ci = std::getenv("CI");
  if (ci != nullptr && std::strcmp(ci, "true") == 0) {
    FAIL() << "GL is required under CI: " << failure;
  }
  GTEST_SKIP() << "no GL: " << failure;
}

}  // namespace waveform_test
