// The "blendShader" program: composites the finished scope picture into the layer with one of the
// fourteen blend modes of "blendType", and the pass that draws it over a quad of the layer.
#ifndef WAVEFORM_SCOPE_BLEND_SHADER_H
#define WAVEFORM_SCOPE_BLEND_SHADER_H

#include <array>
#include <cstdint>
#include <string>

#include "gl/effect_data.h"
#include "gl/gl_api.h"
#include "host_access/host_calls.h"

namespace plugin::Scopes {

inline constexpr char kBlendShaderProgram[] = "blendShader";

// The fragment stage of "blendShader".
const std::string& blendFragmentSource();

// Builds "blendShader" unless the registry has it; a build failure throws
// QvGLSLexception with the driver's log.
void ensureBlendProgram(Plugin::gl::EffectData& programs, bool echo);

struct BlendPass {
  GLuint layerTexture = 0;      // sampled on unit 0
  GLuint scopeTexture = 0;      // sampled on unit 1
  int32_t mode = 0;             // a "blendType" value, 0..14
  std::array<float, 4> quad{};  // xmin, ymin, xmax, ymax, in the projection's units
  // Texture coordinates (u0, v0, u1, v1) that the quad spans, from its (xmin, ymin) corner to
  // its (xmax, ymax) corner: u1 < u0 or v1 < v0 mirrors.
  std::array<float, 4> layerRect{};
  std::array<float, 4> scopeRect{};
  const float* projection = nullptr;  // column-major 4x4; null means identity
  const float* modelView = nullptr;   // column-major 4x4; null means identity
};

// Draws the quad into the bound framebuffer with "blendShader" and GL blending off: the program
// composites the scope over the layer itself. Leaves the layer bound on unit 0, the scope on
// unit 1 and unit 0 active; unbinding is the caller's.
void drawBlendPass(const Plugin::host::HostCalls& host, Plugin::gl::EffectData& programs,
                   const BlendPass& pass);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_BLEND_SHADER_H
