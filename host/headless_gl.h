// Headless OpenGL 4.1 core contexts through EGL: on a GPU where a driver provides one, else on
// Mesa's software renderer. No window system is needed.
#ifndef VTPL_HOST_HEADLESS_GL_H
#define VTPL_HOST_HEADLESS_GL_H

#include <string>

namespace vtpl::host {

struct HeadlessContext {
  void* context = nullptr;  // EGLContext; null when creation failed
  std::string error;        // why it failed
};

// Creates a context sharing objects with `shareWith` (null for none), makes it current on the
// calling thread and loads the GL entry points. On failure nothing is left current.
HeadlessContext createCurrentContext(void* shareWith);
// Makes `context` current on the calling thread; null releases the thread's context.
void makeCurrent(void* context);
void destroyContext(void* context);

}  // namespace vtpl::host

#endif  // VTPL_HOST_HEADLESS_GL_H
