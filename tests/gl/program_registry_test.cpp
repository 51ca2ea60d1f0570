// The program registry of EffectData, QvShader and QvGLSLexception on Mesa's software GL.
#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
#include <string>

#include "gl/effect_data.h"
#include "gl/glsl_exception.h"
#include "gl_test_context.h"

namespace waveform_test {
namespace {

using Plugin::gl::EffectData;
using Plugin::gl::ProgramOptions;
using Plugin::gl::QvGLSLexception;
using Plugin::gl::TexCoords;

const std::string kVertex = R"(#version 410
in vec4 in_Position;
in vec2 in_TexCoord;
out vec2 texCoord;
uniform mat4 transform;
void main() { texCoord = in_TexCoord; gl_Position = transform * in_Position; })";

const std::string kFragment = R"(#version 410
in vec2 texCoord;
uniform vec4 colour;
layout(location = 0) out vec4 result;
void main() { result = colour * texCoord.x; })";

const std::string kOtherFragment = R"(#version 410
uniform vec4 tint;
layout(location = 0) out vec4 result;
void main() { result = tint; })";

const std::string kBrokenVertex = R"(#version 410
void main() { gl_Position = undeclaredValue; })";

// Calls a function that is declared but defined nowhere: compiles, but cannot link.
const std::string kUnlinkableFragment = R"(#version 410
vec4 definedNowhere();
layout(location = 0) out vec4 result;
void main() { result = definedNowhere(); })";

const std::string kTwoCoordVertex = R"(#version 410
in vec4 vertexPosition;
in vec2 vertexTexCoord;
in vec2 vertexTexCoord1;
out vec2 sum;
void main() { sum = vertexTexCoord + vertexTexCoord1; gl_Position = vertexPosition; })";

const std::string kSumFragment = R"(#version 410
in vec2 sum;
layout(location = 0) out vec4 result;
void main() { result = vec4(sum, 0.0, 1.0); })";

const std::string kGeometry = R"(#version 410
layout(points) in;
layout(points, max_vertices = 1) out;
in vec2 texCoord[];
out vec2 texCoordOut;
void main() { texCoordOut = texCoord[0]; gl_Position = gl_in[0].gl_Position; EmitVertex(); })";

const std::string kGeometryFragment = R"(#version 410
in vec2 texCoordOut;
layout(location = 0) out vec4 result;
void main() { result = vec4(texCoordOut, 0.0, 1.0); })";

class ProgramRegistry : public GlTest {};

const ProgramOptions kPlainNames{false, Plugin::gl::AttributeNames::kPlain, TexCoords::kOne};

void createPlain(EffectData& registry, const std::string& name,
                 const std::string& fragment = kFragment) {
  registry.createProgram(name, {kVertex, {}, fragment}, kPlainNames);
}

GLint attachedStageCount(GLuint program) {
  GLint count = 0;
  glGetProgramiv(program, GL_ATTACHED_SHADERS, &count);
  return count;
}

// Both failures carry their fixed message and the driver's log, whatever the echo flag; only an
// echoed build prints, and a link log is printed on its own.
TEST_F(ProgramRegistry, BuildFailuresCarryTheDriverLog) {
  for (const bool echo : {false, true}) {
    EffectData registry;
    testing::internal::CaptureStdout();
    try {
      registry.addProgram(kBrokenVertex, kFragment, echo, "broken");
      ADD_FAILURE() << "no exception";
    } catch (const QvGLSLexception& error) {
      EXPECT_EQ(error.errorType(), Plugin::gl::GLSLErrorType_ShaderCompile);
      EXPECT_STREQ(error.what(), "GLSLErrorType_ShaderCompile - The Shader failed to compile.");
      EXPECT_NE(error.log().find("undeclaredValue"), std::string::npos) << error.log();
    }
    EXPECT_EQ(registry.programId("broken"), -1);  // nothing registered
    try {
      registry.createProgram("unlinkable", {kVertex, {}, kUnlinkableFragment},
                             {echo, Plugin::gl::AttributeNames::kPlain, TexCoords::kOne});
      ADD_FAILURE() << "no exception";
    } catch (const QvGLSLexception& error) {
      EXPECT_EQ(error.errorType(), Plugin::gl::GLSLErrorType_ShaderLink);
      EXPECT_STREQ(error.what(), "GLSLErrorType_ShaderLink - The shader program failed to link.");
      EXPECT_NE(error.log().find("definedNowhere"), std::string::npos) << error.log();
    }
    const std::string printed = testing::internal::GetCapturedStdout();
    if (echo) {
      EXPECT_NE(printed.find("undeclaredValue"), std::string::npos) << printed;
      const size_t link = printed.find("definedNowhere");
      ASSERT_NE(link, std::string::npos) << printed;
    } else {
      EXPECT_EQ(printed, "");
    }
    // A failed link keeps the program registered, unlinked.
    GLint linked = 1;
    glGetProgramiv(static_cast<GLuint>(registry.programId("unlinkable")), GL_LINK_STATUS, &linked);
    EXPECT_EQ(linked, 0);
  }
}

TEST_F(ProgramRegistry, CreationIndexesStayWhileNamesSort) {
  EffectData registry;
  for (const char* name : {"gamma", "beta", "alpha"}) {
    createPlain(registry, name);
  }
  const std::vector<std::pair<std::string, int32_t>> expected = {
      {"alpha", 2}, {"beta", 1}, {"gamma", 0}};
  EXPECT_EQ(registry.nameIndex(), expected);
  EXPECT_NE(registry.programId("gamma"), registry.programId("alpha"));
  EXPECT_TRUE(glIsProgram(static_cast<GLuint>(registry.programId("alpha"))));
  for (const char* unknown : {"alphabet", "alph", ""}) {
    EXPECT_EQ(registry.programId(unknown), -1) << unknown;
  }
  // ensureProgram builds nothing for a name the registry has.
  registry.ensureProgram("beta", {kVertex, {}, kOtherFragment}, kPlainNames);
  EXPECT_EQ(registry.programCount(), 3);
}

TEST_F(ProgramRegistry, GeometryStageOnlyWhenItsSourceIsGiven) {
  EffectData registry;
  registry.addProgram(kVertex, "", kFragment, false, "twoStages");
  registry.addProgram(kVertex, kGeometry, kGeometryFragment, false, "threeStages");
  EXPECT_EQ(attachedStageCount(static_cast<GLuint>(registry.programId("twoStages"))), 2);
  EXPECT_EQ(attachedStageCount(static_cast<GLuint>(registry.programId("threeStages"))), 3);
  EXPECT_TRUE(registry.linkProgram("threeStages", false));
  EXPECT_FALSE(registry.linkProgram("unknown", false));
}

TEST_F(ProgramRegistry, CreatingBindsTheFixedAttributeLocations) {
  EffectData registry;
  createPlain(registry, "plain");
  registry.createProgram("stored", {kTwoCoordVertex, {}, kSumFragment},
                         {false, Plugin::gl::AttributeNames::kStored, TexCoords::kTwo});
  const auto plain = static_cast<GLuint>(registry.programId("plain"));
  const auto stored = static_cast<GLuint>(registry.programId("stored"));
  EXPECT_EQ(glGetAttribLocation(plain, "in_Position"), 0);
  EXPECT_EQ(glGetAttribLocation(plain, "in_TexCoord"), 8);
  EXPECT_EQ(glGetAttribLocation(stored, "vertexPosition"), 0);
  EXPECT_EQ(glGetAttribLocation(stored, "vertexTexCoord"), 8);
  EXPECT_EQ(glGetAttribLocation(stored, "vertexTexCoord1"), 9);
}

TEST_F(ProgramRegistry, UniformLocationAsksTheCurrentOrElseTheFirstProgram) {
  EffectData registry;
  createPlain(registry, "first");
  createPlain(registry, "second", kOtherFragment);
  registry.releaseProgram();
  EXPECT_GE(registry.uniformLocation("colour"), 0);
  EXPECT_EQ(registry.uniformLocation("tint"), -1);  // only the second program has it
  registry.useProgram("second");
  EXPECT_GE(registry.uniformLocation("tint"), 0);
  EXPECT_EQ(registry.uniformLocation("colour"), -1);
  registry.releaseProgram();
  EXPECT_EQ(EffectData().uniformLocation("colour"), -1);
}

TEST_F(ProgramRegistry, MatrixUniformsOnlyForDimensionsTwoToFour) {
  EffectData registry;
  createPlain(registry, "program");
  registry.useProgram("program");
  const GLint location = registry.uniformLocation("transform");
  ASSERT_GE(location, 0);
  float identity[16] = {};
  for (int i = 0; i < 4; ++i) {
    identity[i * 5] = 1.0f;
  }
  registry.setUniformMatrix(location, 4, 1, false, identity);
  float other[25];
  std::fill(std::begin(other), std::end(other), 7.0f);
  registry.setUniformMatrix(location, 1, 1, false, other);
  registry.setUniformMatrix(location, 5, 1, false, other);
  float readBack[16] = {};
  glGetUniformfv(static_cast<GLuint>(registry.programId("program")), location, readBack);
  EXPECT_TRUE(std::equal(std::begin(readBack), std::end(readBack), std::begin(identity)));
  registry.releaseProgram();
}

TEST_F(ProgramRegistry, DestroyingTheRegistryDeletesItsPrograms) {
  GLuint program = 0;
  {
    EffectData registry;
    createPlain(registry, "program");
    program = static_cast<GLuint>(registry.programId("program"));
    ASSERT_TRUE(glIsProgram(program));
  }
  EXPECT_FALSE(glIsProgram(program));
}

}  // namespace
}  // namespace waveform_test
