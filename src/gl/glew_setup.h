// Loads the GL entry points through GLEW for the context current on this thread.
#ifndef WAVEFORM_GL_GLEW_SETUP_H
#define WAVEFORM_GL_GLEW_SETUP_H

namespace Plugin::gl {

// True when the core entry points are loaded. With an EGL context GLEW's platform step finds no
// GLX display and reports it after the core step has succeeded; that counts as success, since
// the platform step has nothing to do there.
bool initialiseGlew();

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_GLEW_SETUP_H
