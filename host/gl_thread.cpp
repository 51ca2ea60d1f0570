#include "gl_thread.h"

#include <EGL/egl.h>
#include <EGL/eglext.h>
#include <GL/glew.h>

#include <cstring>

#include "host_error.h"

namespace vtpl::host {
namespace {

thread_local GlThread* currentThread = nullptr;

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

GlThread::GlThread(std::string name, const GlThread* shareWith) : name_(std::move(name)) {
  thread_ = std::thread(&GlThread::loop, this, shareWith);
  std::unique_lock<std::mutex> lock(mutex_);
  wake_.wait(lock, [this] { return started_; });
  if (!startError_.empty()) {
    lock.unlock();
    thread_.join();
    throw HostError(name_ + " thread: " + startError_);
  }
}

GlThread::~GlThread() {
  {
    const std::lock_guard<std::mutex> lock(mutex_);
    stopping_ = true;
  }
  wake_.notify_all();
  if (thread_.joinable()) {
    thread_.join();
  }
}

GlThread* GlThread::current() {
  return currentThread;
}

void GlThread::run(const std::function<void()>& task) {
  const std::lock_guard<std::mutex> oneCallerAtATime(callers_);
  std::unique_lock<std::mutex> lock(mutex_);
  task_ = &task;
  failure_ = nullptr;
  wake_.notify_all();
  wake_.wait(lock, [this] { return task_ == nullptr; });
  if (failure_) {
    std::rethrow_exception(failure_);
  }
}

uint32_t GlThread::vertexArray() {
  if (vertexArray_ == 0) {
    glGenVertexArrays(1, &vertexArray_);
  }
  return vertexArray_;
}

uint32_t GlThread::framebuffer() {
  if (framebuffer_ == 0) {
    glGenFramebuffers(1, &framebuffer_);
  }
  return framebuffer_;
}

void GlThread::loop(const GlThread* shareWith) {
  const Display& gl = display();
  std::string error = gl.error;
  EGLContext context = EGL_NO_CONTEXT;
  if (error.empty()) {
    const EGLint attributes[] = {EGL_CONTEXT_MAJOR_VERSION,
                                 4,
                                 EGL_CONTEXT_MINOR_VERSION,
                                 1,
                                 EGL_CONTEXT_OPENGL_PROFILE_MASK,
                                 EGL_CONTEXT_OPENGL_CORE_PROFILE_BIT,
                                 EGL_NONE};
    eglBindAPI(EGL_OPENGL_API);
    const EGLContext share = shareWith != nullptr ? shareWith->context_ : EGL_NO_CONTEXT;
    context = eglCreateContext(gl.display, gl.config, share, attributes);
    if (context == EGL_NO_CONTEXT) {
      error = "cannot create an OpenGL 4.1 core context";
    } else if (!eglMakeCurrent(gl.display, EGL_NO_SURFACE, EGL_NO_SURFACE, context)) {
      error = "cannot make the context current without a surface";
    } else {
      glewExperimental = GL_TRUE;
      const GLenum glew = glewInit();
      if (glew != GLEW_OK && glew != GLEW_ERROR_NO_GLX_DISPLAY) {
        error = "GLEW cannot load the GL entry points";
      }
    }
  }
  {
    const std::lock_guard<std::mutex> lock(mutex_);
    context_ = context;
    startError_ = error;
    started_ = true;
  }
  wake_.notify_all();
  if (!error.empty()) {
    if (context != EGL_NO_CONTEXT) {
      eglDestroyContext(gl.display, context);
    }
    return;
  }
  currentThread = this;

  std::unique_lock<std::mutex> lock(mutex_);
  for (;;) {
    wake_.wait(lock, [this] { return task_ != nullptr || stopping_; });
    if (task_ == nullptr) {
      break;
    }
    const std::function<void()>* task = task_;
    std::exception_ptr failure;
    lock.unlock();
    try {
      (*task)();
    } catch (...) {
      failure = std::current_exception();
    }
    lock.lock();
    failure_ = failure;
    task_ = nullptr;
    wake_.notify_all();
  }
  lock.unlock();

  if (vertexArray_ != 0) {
    glDeleteVertexArrays(1, &vertexArray_);
  }
  if (framebuffer_ != 0) {
    glDeleteFramebuffers(1, &framebuffer_);
  }
  currentThread = nullptr;
  eglMakeCurrent(gl.display, EGL_NO_SURFACE, EGL_NO_SURFACE, EGL_NO_CONTEXT);
  eglDestroyContext(gl.display, context);
}

}  // namespace vtpl::host
