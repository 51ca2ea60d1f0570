// Reads a GL info log (of a shader or a program) into a string.
#ifndef WAVEFORM_GL_INFO_LOG_H
#define WAVEFORM_GL_INFO_LOG_H

#include <string>

#include "gl/gl_api.h"

namespace Plugin::gl {

std::string shaderInfoLog(GLuint shader);
std::string programInfoLog(GLuint program);

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_INFO_LOG_H
