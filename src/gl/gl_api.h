// The GL entry points. Everything beyond GL 1.1 is reached through GLEW, which must have been
// initialised with the host's context current.
#ifndef WAVEFORM_GL_GL_API_H
#define WAVEFORM_GL_GL_API_H

#include <GL/glew.h>

#endif  // WAVEFORM_GL_GL_API_H
