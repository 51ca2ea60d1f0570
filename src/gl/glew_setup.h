// Loads the GL entry points through GLEW for the context current on this thread.
#ifndef WAVEFORM_GL_GLEW_SETUP_H
#define WAVEFORM_GL_GLEW_SETUP_H

namespace Plugin::gl {

// True when the core entry points are loaded. With an EGL context GLEW's platform step finds no
// GLX display and reports it after the core step has succeeded; that counts as success, since
// the platform step has nothing to do there.
bool initialiseGlew();

// True once initialiseGlew has succeeded in this process. GLEW's entry points are process-wide:
// before that, every GL call beyond GL 1.1 would jump through a null pointer.
bool glewLoaded();

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_GLEW_SETUP_H
