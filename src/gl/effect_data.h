// Base of every effect instance's data: the registry of its named GLSL programs. Programs are
// created the first time a pass needs them and live until the instance is destroyed. Everything
// here issues GL calls and needs the host's context current on the calling thread.
#ifndef WAVEFORM_GL_EFFECT_DATA_H
#define WAVEFORM_GL_EFFECT_DATA_H

#include <cstdint>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "gl/gl_api.h"

namespace Plugin::gl {

struct ShaderProgram;

// The stages of a program; an empty geometry source builds none.
struct ProgramSources {
  std::string vertex;
  std::string geometry;
  std::string fragment;
};

// Which names the program's sources declare their attributes under.
enum class AttributeNames { kPlain, kStored };
// How many texture coordinates the program takes besides its position.
enum class TexCoords { kNone, kOne, kTwo };

struct ProgramOptions {
  bool echo = false;  // print build logs that hold a warning or an error
  AttributeNames names = AttributeNames::kStored;
  TexCoords texCoords = TexCoords::kOne;
};

class EffectData {
 public:
  EffectData();
  EffectData(const EffectData&) = delete;
  EffectData& operator=(const EffectData&) = delete;

  // Builds and attaches the vertex, fragment and (when not empty) geometry stages and registers
  // the unlinked program under `name`. A stage that fails to compile throws QvGLSLexception and
  // nothing is registered.
  virtual void addProgram(const std::string& vertexSource, const std::string& geometrySource,
                          const std::string& fragmentSource, bool echo, const std::string& name);
  virtual void addProgram(const std::string& vertexSource, const std::string& fragmentSource,
                          bool echo, const std::string& name);
  // Links a registered program; throws QvGLSLexception (link) with the program's log on
  // failure. An unknown name answers false.
  virtual bool linkProgram(const std::string& name, bool echo);
  virtual bool linkProgram(int32_t index, bool echo);
  // Adds the program, binds position to 0 and the texture coordinates the options ask for (8,
  // then 9), and links it. A failure throws QvGLSLexception with the driver's log.
  virtual void createProgram(const std::string& name, const ProgramSources& sources,
                             const ProgramOptions& options);
  // createProgram, unless the registry already has a program of that name.
  void ensureProgram(const std::string& name, const ProgramSources& sources,
                     const ProgramOptions& options);
  // Destroys the programs from the newest to the oldest.
  virtual ~EffectData();

  // The GL program registered under `name`, or -1.
  int32_t programId(const std::string& name) const;
  void useProgram(const std::string& name) const;
  void releaseProgram() const;
  // Takes effect at the program's next link; an unknown program name does nothing.
  void bindAttribute(const std::string& programName, GLuint location,
                     const std::string& attributeName) const;
  // Asks the current program when it is one of ours, else the first registered; -1 when the
  // uniform is unknown or nothing is registered.
  GLint uniformLocation(const std::string& uniformName) const;

  void setUniform1i(GLint location, GLint value) const;
  void setUniform2i(GLint location, GLint x, GLint y) const;
  void setUniform1f(GLint location, GLfloat value) const;
  void setUniform2f(GLint location, GLfloat x, GLfloat y) const;
  void setUniform4f(GLint location, GLfloat x, GLfloat y, GLfloat z, GLfloat w) const;
  // Dimensions 2, 3 and 4; any other dimension does nothing.
  void setUniformMatrix(GLint location, int32_t dimension, GLsizei count, bool transpose,
                        const GLfloat* values) const;

  int32_t programCount() const { return static_cast<int32_t>(programs_.size()); }
  // Registered names in name order, each with its creation index.
  const std::vector<std::pair<std::string, int32_t>>& nameIndex() const { return nameIndex_; }

 private:
  int32_t indexOf(const std::string& name) const;
  void bindStandardAttributes(const ProgramOptions& options);

  std::vector<std::unique_ptr<ShaderProgram>> programs_;    // in creation order
  std::vector<std::pair<std::string, int32_t>> nameIndex_;  // sorted by name
};

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_EFFECT_DATA_H
