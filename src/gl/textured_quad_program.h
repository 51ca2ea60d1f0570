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

// GLSL: a texture read that keeps a layer's pixels bit for bit where a quad maps them one to one.
// Such a draw lands on texel centres only up to the rounding of the interpolated coordinates,
// and linear filtering then mixes a trace of the neighbours into float textures (eight-bit
// filtering rounds it away). Coordinates within 1/64 texel of a centre fetch that texel
// unfiltered; any other coordinate, as in a scaled draw, is filtered as usual.
inline constexpr char kTexelCentreSamplingSource[] = R"(
vec4 sampleAtTexelCentres(sampler2D source, vec2 coordinate) {
  ivec2 size = textureSize(source, 0);
  vec2 texel = coordinate * vec2(size) - 0.5;
  vec2 centre = floor(texel + 0.5);
  if (all(lessThan(abs(texel - centre), vec2(1.0 / 64.0)))) {
    return texelFetch(source, clamp(ivec2(centre), ivec2(0), size - 1), 0);
  }
  return texture(source, coordinate);
}
)";

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_TEXTURED_QUAD_PROGRAM_H
