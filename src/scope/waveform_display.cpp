#include "scope/waveform_display.h"

#include <cstdio>

#include "gl/texture_units.h"
#include "gl/textured_quad_program.h"
#include "gl/vertex_buffer.h"
#include "scope/colour_space.h"
#include "scope/parameter_choices.h"

namespace plugin::Scopes {
namespace {

using Plugin::gl::EffectData;

constexpr char kWaveformSampler[] = "waveformTexture";
constexpr char kDisplayIndexUniform[] = "displayIndex";
constexpr char kFillColourUniform[] = "fillColour";

// A GLSL mat3 that multiplies like `rows`: GLSL's constructor takes columns.
std::string glslMatrix(const Matrix3& rows) {
  std::string text = "mat3(";
  for (size_t column = 0; column < 3; ++column) {
    for (size_t row = 0; row < 3; ++row) {
      char value[40];
      std::snprintf(value, sizeof value, "%.17g", rows[row][column]);
      text += value;
      text += column == 2 && row == 2 ? ")" : ", ";
    }
  }
  return text;
}

std::string buildFragmentSource() {
  const ColourSpaceMatrices& rec2020 = *colourSpaceMatrices(kRec2020);
  return std::string(R"(#version 410
uniform sampler2D waveformTexture;
uniform int displayIndex;
in vec2 texCoord;
layout(location = 0) out vec4 fragColour;
const mat3 toYCbCr = )") +
         glslMatrix(rec2020.toYCbCr) + ";\nconst mat3 toRgb = " + glslMatrix(rec2020.toRgb) +
         R"(;

// One channel's trace in its own hue: faint values fade towards grey, values above half move
// towards white, reaching it at 1.
vec3 tintedTrace(vec3 tint, float x) {
  vec3 trace = toYCbCr * tint;
  vec3 white = toYCbCr * vec3(1.0);
  trace.x = x;
  trace.yz *= clamp(2.0 * x, 0.0, 1.0);
  trace.yz = mix(trace.yz, white.yz, clamp((x - 0.5) * 2.0, 0.0, 1.0));
  return toRgb * trace;
}

// The waveform under this pixel. Where the panel is smaller than the waveform along an axis, the
// brightest of the texels the pixel covers along it: a single filtered read there would fall
// between thin traces and show them broken or not at all.
vec4 waveformAt(vec2 uv) {
  vec2 size = vec2(textureSize(waveformTexture, 0));
  vec2 footprint = fwidth(uv) * size;
  bvec2 minified = greaterThan(footprint, vec2(1.0));
  if (!any(minified)) {
    return texture(waveformTexture, uv);
  }
  // Texels whose centres lie under the pixel, at most 16 along an axis.
  vec2 centre = uv * size;
  ivec2 first = ivec2(ceil(centre - 0.5 * footprint - 0.5));
  ivec2 last = min(ivec2(floor(centre + 0.5 * footprint - 0.5)), first + 15);
  first = ivec2(minified.x ? first.x : 0, minified.y ? first.y : 0);
  last = ivec2(minified.x ? last.x : 0, minified.y ? last.y : 0);
  vec4 brightest = vec4(0.0);
  for (int j = first.y; j <= last.y; ++j) {
    for (int i = first.x; i <= last.x; ++i) {
      vec2 at = vec2(minified.x ? (float(i) + 0.5) / size.x : uv.x,
                     minified.y ? (float(j) + 0.5) / size.y : uv.y);
      brightest = max(brightest, texture(waveformTexture, at));
    }
  }
  return brightest;
}

void main() {
  vec4 w = waveformAt(texCoord);
  vec3 colour = w.rgb;
  if (displayIndex == 1) {
    colour = vec3(w.r);
  } else if (displayIndex == 2) {
    colour = vec3(w.g);
  } else if (displayIndex == 3) {
    colour = vec3(w.b);
  } else if (displayIndex == 4) {
    colour = vec3(w.b, 0.0, w.g);
  } else if (displayIndex == 5) {
    colour = vec3((w.r + w.g + w.b) * 0.3333);
  } else if (displayIndex == 6) {
    colour = tintedTrace(vec3(1.0, 0.0, 0.0), w.r);
  } else if (displayIndex == 7) {
    colour = tintedTrace(vec3(0.0, 1.0, 0.0), w.g);
  } else if (displayIndex == 8) {
    colour = tintedTrace(vec3(0.0, 0.0, 1.0), w.b);
  }
  // Empty parts of the waveform stay transparent over the scope's background.
  fragColour = vec4(colour, min(max(colour.r, max(colour.g, colour.b)), 1.0));
}
)";
}

const char kFillFragmentSource[] = R"(#version 410
uniform vec4 fillColour;
in vec2 texCoord;
layout(location = 0) out vec4 fragColour;
void main() {
  fragColour = fillColour;
}
)";

void setMatrices(EffectData& programs, const Plugin::gl::Matrix4& projection,
                 const Plugin::gl::Matrix4& modelView) {
  programs.setUniformMatrix(programs.uniformLocation(Plugin::gl::kProjectionUniform), 4, 1, false,
                            projection.data());
  programs.setUniformMatrix(programs.uniformLocation(Plugin::gl::kModelViewUniform), 4, 1, false,
                            modelView.data());
}

}  // namespace

const std::string& waveformDisplayFragmentSource() {
  static const std::string source = buildFragmentSource();
  return source;
}

void ensureWaveformDisplayPrograms(EffectData& programs, bool echo) {
  const Plugin::gl::ProgramOptions options{echo, Plugin::gl::AttributeNames::kStored,
                                           Plugin::gl::TexCoords::kOne};
  programs.ensureProgram(
      kCopyWaveformProgram,
      {Plugin::gl::kTexturedQuadVertexSource, {}, waveformDisplayFragmentSource()}, options);
  programs.ensureProgram(kFillWaveformBackgroundProgram,
                         {Plugin::gl::kTexturedQuadVertexSource, {}, kFillFragmentSource}, options);
}

void drawWaveformDisplay(const Plugin::host::HostCalls& host, EffectData& programs,
                         GLuint waveformTexture, const Rectangle& destination,
                         const TextureRows& rows, DisplayIndex displayIndex,
                         const Plugin::gl::Matrix4& projection,
                         const Plugin::gl::Matrix4& modelView) {
  programs.useProgram(kCopyWaveformProgram);
  setMatrices(programs, projection, modelView);
  programs.setUniform1i(programs.uniformLocation(kWaveformSampler), 0);
  programs.setUniform1i(programs.uniformLocation(kDisplayIndexUniform), displayIndex);
  const Rectangle& d = destination;
  Plugin::gl::QuadVertices quad = Plugin::gl::rectangleQuad(d.left, d.bottom, d.right, d.top);
  // Each vertex is (x, y, u, v), bottom edge first.
  quad[3] = quad[7] = rows.bottom;
  quad[11] = quad[15] = rows.top;
  Plugin::gl::bindTextureUnit(GL_TEXTURE0, GL_TEXTURE_2D, waveformTexture, true);
  Plugin::gl::drawQuadArrays(host, quad.data(), 4, GL_TRIANGLE_STRIP);
  Plugin::gl::unbindTextureUnit(GL_TEXTURE0, GL_TEXTURE_2D, false);
  programs.releaseProgram();
}

void fillWaveformPanel(const Plugin::host::HostCalls& host, EffectData& programs,
                       const Rectangle& destination, const std::array<float, 4>& colour,
                       const Plugin::gl::Matrix4& projection,
                       const Plugin::gl::Matrix4& modelView) {
  programs.useProgram(kFillWaveformBackgroundProgram);
  setMatrices(programs, projection, modelView);
  programs.setUniform4f(programs.uniformLocation(kFillColourUniform), colour[0], colour[1],
                        colour[2], colour[3]);
  const Rectangle& d = destination;
  const Plugin::gl::QuadVertices quad = Plugin::gl::rectangleQuad(d.left, d.bottom, d.right, d.top);
  Plugin::gl::drawQuadArrays(host, quad.data(), 4, GL_TRIANGLE_STRIP);
  programs.releaseProgram();
}

}  // namespace plugin::Scopes
