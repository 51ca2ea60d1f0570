#include "headless_gl.h"

#include <EGL/egl.h>
#include <EGL/eglext.h>
#include <GL/glew.h>

#include <cstring>

namespace vtpl::host {
namespace {

struct Display {
  EGLDisplay display = EGL_NO_DISPLAY;
  EGLConfig config = nullptr;
  std::string error;
};

// The first GPU that EGL lists as a device, if any: Mesa lists its software renderer as a device
// too, marked by its own extension, and that one is left to the surfaceless platform.
EGLDisplay hardwareDeviceDisplay(PFNEGLGETPLATFORMDISPLAYEXTPROC getPlatformDisplay) {
  const auto queryDevices =
      reinterpret_cast<PFNEGLQUERYDEVICESEXTPROC>(eglGetProcAddress("eglQueryDevicesEXT"));
  const auto queryDeviceString = reinterpret_cast<PFNEGLQUERYDEVICESTRINGEXTPROC>(
      eglGetProcAddress("eglQueryDeviceStringEXT"));
  if (queryDevices == nullptr || queryDeviceString == nullptr) {
    return EGL_NO_DISPLAY;
  }
  EGLDeviceEXT devices[16];
  EGLint count = 0;
  if (!queryDevices(16, devices, &count)) {
    return EGL_NO_DISPLAY;
  }
  for (EGLint i = 0; i < count; ++i) {
    const char* extensions = queryDeviceString(devices[i], EGL_EXTENSIONS);
    if (extensions != nullptr && std::strstr(extensions, "EGL_MESA_device_software") != nullptr) {
      continue;
    }
    EGLDisplay display = getPlatformDisplay(EGL_PLATFORM_DEVICE_EXT, devices[i], nullptr);
    EGLint major = 0, minor = 0;
    if (display != EGL_NO_DISPLAY && eglInitialize(display, &major, &minor)) {
      return display;
    }
  }
  return EGL_NO_DISPLAY;
}

// A GPU through the EGL device platform where a driver provides one; otherwise Mesa's
// surfaceless platform (the software renderer on machines without a GPU). Opened once per
// process.
const Display& display() {
  static const Display opened = [] {
    Display result;
    const auto getPlatformDisplay = reinterpret_cast<PFNEGLGETPLATFORMDISPLAYEXTPROC>(
        eglGetProcAddress("eglGetPlatformDisplayEXT"));
    if (getPlatformDisplay == nullptr) {
      result.error = "EGL cannot open platform displays";
      return result;
    }
    result.display = hardwareDeviceDisplay(getPlatformDisplay);
    if (result.display == EGL_NO_DISPLAY) {
      EGLint major = 0, minor = 0;
      result.display =
          getPlatformDisplay(EGL_PLATFORM_SURFACELESS_MESA, EGL_DEFAULT_DISPLAY, nullptr);
      if (result.display == EGL_NO_DISPLAY || !eglInitialize(result.display, &major, &minor)) {
        result.error = "no headless EGL display (GPU device or surfaceless)";
        return result;
      }
    }
    const EGLint attributes[] = {EGL_SURFACE_TYPE,
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
    EGLint count = 0;
    if (!eglChooseConfig(result.display, attributes, &result.config, 1, &count) || count == 0) {
      result.error = "no EGL configuration for desktop OpenGL";
    }
    return result;
  }();
  return opened;
}

}  // namespace

HeadlessContext createCurrentContext(void* shareWith) {
  HeadlessContext result;
  const Display& gl = display();
  if (!gl.error.empty()) {
    result.error = gl.error;
    return result;
  }
  const EGLint attributes[] = {EGL_CONTEXT_MAJOR_VERSION,
                               4,
                               EGL_CONTEXT_MINOR_VERSION,
                               1,
                               EGL_CONTEXT_OPENGL_PROFILE_MASK,
                               EGL_CONTEXT_OPENGL_CORE_PROFILE_BIT,
                               EGL_NONE};
  eglBindAPI(EGL_OPENGL_API);
  const EGLContext share = shareWith != nullptr ? shareWith : EGL_NO_CONTEXT;
  EGLContext context = eglCreateContext(gl.display, gl.config, share, attributes);
  if (context == EGL_NO_CONTEXT) {
    result.error = "cannot create an OpenGL 4.1 core context";
    return result;
  }
  if (!eglMakeCurrent(gl.display, EGL_NO_SURFACE, EGL_NO_SURFACE, context)) {
    eglDestroyContext(gl.display, context);
    result.error = "cannot make the context current without a surface";
    return result;
  }
  // Core profiles list extensions only through glGetStringi, which this flag makes GLEW use. With
  // an EGL context GLEW's GLX step finds no display after the core entry points are loaded.
  glewExperimental = GL_TRUE;
  const GLenum glew = glewInit();
  if (glew != GLEW_OK && glew != GLEW_ERROR_NO_GLX_DISPLAY) {
    makeCurrent(nullptr);
    eglDestroyContext(gl.display, context);
    result.error = "GLEW cannot load the GL entry points";
    return result;
  }
  result.context = context;
  return result;
}

void makeCurrent(void* context) {
  const EGLContext current = context != nullptr ? context : EGL_NO_CONTEXT;
  eglMakeCurrent(display().display, EGL_NO_SURFACE, EGL_NO_SURFACE, current);
}

void destroyContext(void* context) {
  if (context != nullptr) {
    eglDestroyContext(display().display, context);
  }
}

}  // namespace vtpl::host
