#include "gl/effect_data.h"

#include <algorithm>

#include "gl/glsl_exception.h"
#include "gl/info_log.h"
#include "gl/qv_shader.h"
#include "gl/shader_log.h"
#include "gl/shader_program.h"
#include "gl/vertex_attributes.h"

namespace Plugin::gl {
namespace {

void attachStage(GLuint program, GLenum stage, const std::string& source, ShaderLog& log) {
  const std::shared_ptr<QvShader> shader = QvShader::create(stage);
  shader->compile(source, log);
  glAttachShader(program, shader->name());
}

}  // namespace

EffectData::EffectData() = default;

EffectData::~EffectData() {
  while (!programs_.empty()) {
    programs_.pop_back();
  }
}

void EffectData::addProgram(const std::string& vertexSource, const std::string& geometrySource,
                            const std::string& fragmentSource, bool echo, const std::string& name) {
  ShaderLog log(echo);
  // Owned from the start, so that a stage failing to compile deletes the program again.
  auto program = std::make_unique<ShaderProgram>(glCreateProgram());
  attachStage(program->name, GL_VERTEX_SHADER, vertexSource, log);
  attachStage(program->name, GL_FRAGMENT_SHADER, fragmentSource, log);
  if (!geometrySource.empty()) {
    attachStage(program->name, GL_GEOMETRY_SHADER, geometrySource, log);
  }
  programs_.push_back(std::move(program));
  nameIndex_.emplace_back(name, programCount() - 1);
  std::sort(nameIndex_.begin(), nameIndex_.end());
}

void EffectData::addProgram(const std::string& vertexSource, const std::string& fragmentSource,
                            bool echo, const std::string& name) {
  addProgram(vertexSource, std::string(), fragmentSource, echo, name);
}

bool EffectData::linkProgram(const std::string& name, bool echo) {
  const int32_t index = indexOf(name);
  return index >= 0 && linkProgram(index, echo);
}

bool EffectData::linkProgram(int32_t index, bool echo) {
  if (index < 0 || index >= programCount()) {
    return false;
  }
  ShaderLog log(echo);
  ShaderProgram& program = *programs_[static_cast<size_t>(index)];
  glLinkProgram(program.name);
  glGetProgramiv(program.name, GL_LINK_STATUS, &program.linked);
  if (program.log.empty() && program.name != 0) {
    program.log = programInfoLog(program.name);
  }
  log.append(program.log);
  if (program.linked == 0) {
    throw QvGLSLexception(GLSLErrorType_ShaderLink, program.log);
  }
  return true;
}

void EffectData::createProgram(const std::string& name, const ProgramSources& sources,
                               const ProgramOptions& options) {
  addProgram(sources.vertex, sources.geometry, sources.fragment, options.echo, name);
  bindStandardAttributes(options);
  linkProgram(programCount() - 1, options.echo);
}

void EffectData::ensureProgram(const std::string& name, const ProgramSources& sources,
                               const ProgramOptions& options) {
  if (programId(name) < 0) {
    createProgram(name, sources, options);
  }
}

// Binds on the newest program: the attribute locations must be fixed before its link.
void EffectData::bindStandardAttributes(const ProgramOptions& options) {
  const GLuint program = programs_.back()->name;
  const bool stored = options.names == AttributeNames::kStored;
  glBindAttribLocation(program, kPositionLocation,
                       stored ? kStoredPositionName : kPlainPositionName);
  switch (options.texCoords) {
    case TexCoords::kNone:
      break;
    case TexCoords::kOne:
      glBindAttribLocation(program, kTexCoordLocation,
                           stored ? kStoredTexCoordName : kPlainTexCoordName);
      break;
    case TexCoords::kTwo:
      glBindAttribLocation(program, kTexCoordLocation,
                           stored ? kStoredTexCoordName : kPlainFirstTexCoordName);
      glBindAttribLocation(program, kSecondTexCoordLocation,
                           stored ? kStoredSecondTexCoordName : kPlainSecondTexCoordName);
      break;
  }
}

int32_t EffectData::indexOf(const std::string& name) const {
  const auto found = std::lower_bound(nameIndex_.begin(), nameIndex_.end(), name,
                                      [](const std::pair<std::string, int32_t>& entry,
                                         const std::string& key) { return entry.first < key; });
  return found != nameIndex_.end() && found->first == name ? found->second : -1;
}

int32_t EffectData::programId(const std::string& name) const {
  const int32_t index = indexOf(name);
  return index < 0 ? -1 : static_cast<int32_t>(programs_[static_cast<size_t>(index)]->name);
}

void EffectData::useProgram(const std::string& name) const {
  const int32_t index = indexOf(name);
  if (index >= 0) {
    glUseProgram(programs_[static_cast<size_t>(index)]->name);
  }
}

void EffectData::releaseProgram() const {
  glUseProgram(0);
}

void EffectData::bindAttribute(const std::string& programName, GLuint location,
                               const std::string& attributeName) const {
  const int32_t index = indexOf(programName);
  if (index >= 0) {
    glBindAttribLocation(programs_[static_cast<size_t>(index)]->name, location,
                         attributeName.c_str());
  }
}

GLint EffectData::uniformLocation(const std::string& uniformName) const {
  if (programs_.empty()) {
    return -1;
  }
  GLint current = 0;
  glGetIntegerv(GL_CURRENT_PROGRAM, &current);
  GLuint program = programs_.front()->name;
  for (const auto& registered : programs_) {
    if (static_cast<GLint>(registered->name) == current) {
      program = registered->name;
    }
  }
  return glGetUniformLocation(program, uniformName.c_str());
}

void EffectData::setUniform1i(GLint location, GLint value) const {
  glUniform1i(location, value);
}

void EffectData::setUniform2i(GLint location, GLint x, GLint y) const {
  glUniform2i(location, x, y);
}

void EffectData::setUniform1f(GLint location, GLfloat value) const {
  glUniform1f(location, value);
}

void EffectData::setUniform2f(GLint location, GLfloat x, GLfloat y) const {
  glUniform2f(location, x, y);
}

void EffectData::setUniform4f(GLint location, GLfloat x, GLfloat y, GLfloat z, GLfloat w) const {
  glUniform4f(location, x, y, z, w);
}

void EffectData::setUniformMatrix(GLint location, int32_t dimension, GLsizei count, bool transpose,
                                  const GLfloat* values) const {
  const GLboolean transposed = transpose ? GL_TRUE : GL_FALSE;
  switch (dimension) {
    case 2:
      glUniformMatrix2fv(location, count, transposed, values);
      break;
    case 3:
      glUniformMatrix3fv(location, count, transposed, values);
      break;
    case 4:
      glUniformMatrix4fv(location, count, transposed, values);
      break;
    default:
      break;
  }
}

}  // namespace Plugin::gl
