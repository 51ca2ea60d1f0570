// The standard vertex stage of every program that draws a textured quad: (x, y, u, v) vertices
// through the projection and model-view matrices, the texture coordinate handed on unchanged.
#ifndef WAVEFORM_GL_TEXTURED_QUAD_PROGRAM_H
#define WAVEFORM_GL_TEXTURED_QUAD_PROGRAM_H

namespace Plugin::gl {

inline constexpr char kProjectionUniform[] = "projectionMatrix";
inline constexpr char kModelViewUniform[] = "modelViewMatrix";

// Declares `texCoord` for the fragment stage.
inline constexpr char kTexturedQuadVertexSource[] = R"(#version 410
in vec4 vertexPosition;
in vec2 vertexTexCoord;
uniform mat4 projectionMatrix;
uniform mat4 modelViewMatrix;
out vec2 texCoord;
void main() {
  texCoord = vertexTexCoord;
  gl_Position = projectionMatrix * modelViewMatrix * vertexPosition;
}
)";

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_TEXTURED_QUAD_PROGRAM_H
