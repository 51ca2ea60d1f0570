// One GL program of the registry. Deleting it detaches its stages and deletes the program.
#ifndef WAVEFORM_GL_SHADER_PROGRAM_H
#define WAVEFORM_GL_SHADER_PROGRAM_H

#include <string>

#include "gl/gl_api.h"

namespace Plugin::gl {

struct ShaderProgram {
  explicit ShaderProgram(GLuint programName) : name(programName) {}
  ~ShaderProgram();
  ShaderProgram(const ShaderProgram&) = delete;
  ShaderProgram& operator=(const ShaderProgram&) = delete;

  GLuint name;
  GLint linked = 0;
  std::string log;  // fetched at the first link, kept afterwards
};

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_SHADER_PROGRAM_H
