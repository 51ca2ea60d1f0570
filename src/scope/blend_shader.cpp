#include "scope/blend_shader.h"

#include "gl/quad_maths.h"
#include "gl/texture_units.h"
#include "gl/textured_quad_program.h"
#include "gl/vertex_buffer.h"

namespace plugin::Scopes {
namespace {

using Plugin::gl::EffectData;

constexpr char kLayerSampler[] = "layerTexture";
constexpr char kScopeSampler[] = "scopeTexture";
constexpr char kBlendModeUniform[] = "blendMode";
constexpr char kLayerRectUniform[] = "layerRect";
constexpr char kScopeRectUniform[] = "scopeRect";

// B is the layer's premultiplied pixel and b its colour; S is the scope's pixel clamped to a
// valid premultiplied colour, s its colour and a its alpha. Layers may hold float values outside
// 0..1, which is why the per-channel modes guard b < 0 and b > 1 themselves.
const char kDeclarations[] = R"(#version 410
uniform sampler2D layerTexture;
uniform sampler2D scopeTexture;
uniform int blendMode;
uniform vec4 layerRect;
uniform vec4 scopeRect;
in vec2 texCoord;
layout(location = 0) out vec4 fragColour;
)";

// Where the scope is transparent, the layer comes through unchanged.
const char kFragmentSource[] = R"(

// Un-premultiplies; a colour without alpha counts as black.
vec3 unpremultiplied(vec3 colour, float alpha) {
  return alpha == 0.0 ? vec3(0.0) : colour / alpha;
}

// The colour f of a mode, at the scope's coverage, over the rest of the layer.
vec4 composite(vec3 f, float a, vec4 layer) {
  return vec4(f * a, a) + layer * (1.0 - a);
}

float colorDodge(float s, float b) {
  return s >= 0.99 ? s : clamp(b / (1.0 - s), 0.0, 1.0);
}

float overlay(float s, float b) {
  if (b < 0.5) {
    return s < 0.0 ? s : 2.0 * b * s;
  }
  return (1.0 - 2.0 * (1.0 - min(s, 1.0)) * (1.0 - b)) * max(s, 1.0);
}

float softLight(float s, float b) {
  s = max(s, 0.0);
  if (b <= 0.0 || b >= 1.0) {
    return b;
  }
  if (s < 0.5) {
    return 2.0 * b * s + b * b * (1.0 - 2.0 * s);
  }
  return sqrt(b) * (2.0 * s - 1.0) + 2.0 * b * (1.0 - s);
}

float hardLight(float s, float b) {
  if (s < 0.5) {
    return b < 0.0 ? b : 2.0 * b * s;
  }
  return (1.0 - 2.0 * (1.0 - s) * (1.0 - min(b, 1.0))) * max(b, 1.0);
}

float colorBurn(float s, float b) {
  return s == 0.0 ? s : clamp(1.0 - (1.0 - b) / s, 0.0, 1.0);
}

void main() {
  vec4 B = sampleAtTexelCentres(layerTexture, mix(layerRect.xy, layerRect.zw, texCoord));
  vec4 S = texture(scopeTexture, mix(scopeRect.xy, scopeRect.zw, texCoord));
  float a = clamp(S.a, 0.0, 1.0);
  S = vec4(clamp(S.rgb, vec3(0.0), vec3(a)), a);
  vec3 s = unpremultiplied(S.rgb, a);
  vec3 b = unpremultiplied(B.rgb, B.a);

  vec4 result = S;
  if (blendMode == 1) {
    result = S + B * (1.0 - a);
  } else if (blendMode == 2) {
    result = vec4(max(S.rgb, 0.0) + B.rgb, S.a + B.a * (1.0 - a));
  } else if (blendMode == 3) {
    result = composite(max(s, b), a, B);
  } else if (blendMode == 4) {
    result = composite(1.0 - (1.0 - b) * (1.0 - clamp(s, 0.0, 1.0)), a, B);
  } else if (blendMode == 5) {
    result = composite(vec3(colorDodge(s.r, b.r), colorDodge(s.g, b.g), colorDodge(s.b, b.b)),
                       a, B);
  } else if (blendMode == 6) {
    result = composite(vec3(overlay(s.r, b.r), overlay(s.g, b.g), overlay(s.b, b.b)), a, B);
  } else if (blendMode == 7) {
    result = composite(vec3(softLight(s.r, b.r), softLight(s.g, b.g), softLight(s.b, b.b)),
                       a, B);
  } else if (blendMode == 8) {
    result = composite(vec3(hardLight(s.r, b.r), hardLight(s.g, b.g), hardLight(s.b, b.b)),
                       a, B);
  } else if (blendMode == 9) {
    result = composite(max(s, 0.0) * b, a, B);
  } else if (blendMode == 10) {
    result = composite(min(s, b), a, B);
  } else if (blendMode == 11) {
    result = composite(vec3(colorBurn(s.r, b.r), colorBurn(s.g, b.g), colorBurn(s.b, b.b)),
                       a, B);
  } else if (blendMode == 12) {
    result = composite(b - max(s, 0.0), a, B);
  } else if (blendMode == 13) {
    result = composite(abs(b - s), a, B);
  } else if (blendMode == 14) {
    result = composite(s + b - 2.0 * s * b, a, B);
  }
  fragColour = result;
}
)";

void setMatrix(const EffectData& programs, const char* uniform, const float* matrix) {
  programs.setUniformMatrix(programs.uniformLocation(uniform), 4, 1, false,
                            matrix != nullptr ? matrix : Plugin::gl::kIdentityMatrix.data());
}

void setRect(const EffectData& programs, const char* uniform, const std::array<float, 4>& rect) {
  programs.setUniform4f(programs.uniformLocation(uniform), rect[0], rect[1], rect[2], rect[3]);
}

}  // namespace

const std::string& blendFragmentSource() {
  static const std::string source =
      std::string(kDeclarations) + Plugin::gl::kTexelCentreSamplingSource + kFragmentSource;
  return source;
}

void ensureBlendProgram(EffectData& programs, bool echo) {
  programs.ensureProgram(kBlendShaderProgram,
                         {Plugin::gl::kTexturedQuadVertexSource, {}, blendFragmentSource()},
                         {echo, Plugin::gl::AttributeNames::kStored, Plugin::gl::TexCoords::kOne});
}

void drawBlendPass(const Plugin::host::HostCalls& host, EffectData& programs,
                   const BlendPass& pass) {
  programs.useProgram(kBlendShaderProgram);
  setMatrix(programs, Plugin::gl::kProjectionUniform, pass.projection);
  setMatrix(programs, Plugin::gl::kModelViewUniform, pass.modelView);
  programs.setUniform1i(programs.uniformLocation(kLayerSampler), 0);
  programs.setUniform1i(programs.uniformLocation(kScopeSampler), 1);
  programs.setUniform1i(programs.uniformLocation(kBlendModeUniform), pass.mode);
  setRect(programs, kLayerRectUniform, pass.layerRect);
  setRect(programs, kScopeRectUniform, pass.scopeRect);

  const auto& [xmin, ymin, xmax, ymax] = pass.quad;
  const Plugin::gl::QuadVertices quad = Plugin::gl::rectangleQuad(xmin, ymin, xmax, ymax);
  Plugin::gl::bindTextureUnit(GL_TEXTURE0, GL_TEXTURE_2D, pass.layerTexture, true);
  Plugin::gl::bindTextureUnit(GL_TEXTURE1, GL_TEXTURE_2D, pass.scopeTexture, true);
  glDisable(GL_BLEND);
  Plugin::gl::drawQuadArrays(host, quad.data(), 4, GL_TRIANGLE_STRIP);
  programs.releaseProgram();
  glActiveTexture(GL_TEXTURE0);
}

}  // namespace plugin::Scopes
