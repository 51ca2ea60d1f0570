#include "scope/graticule_drawing.h"

#include <array>

#include "gl/textured_quad_program.h"
#include "gl/vertex_attributes.h"
#include "gl/vertex_buffer.h"

namespace plugin::Scopes {
namespace {

using Plugin::gl::EffectData;

constexpr char kLineColourUniform[] = "lineColour";
constexpr char kLinePositionUniform[] = "linePosition";
constexpr char kLineStrengthUniform[] = "lineStrength";

constexpr std::array<float, 4> kGuidelineColour = {0.25f, 0.25f, 0.25f, 0.25f};

const char kGuidelineVertexSource[] = R"(#version 410
in vec2 vertexPosition;
uniform mat4 projectionMatrix;
uniform mat4 modelViewMatrix;
out vec2 scopePosition;
void main() {
  scopePosition = vertexPosition;
  gl_Position = projectionMatrix * modelViewMatrix * vec4(vertexPosition, 0.0, 1.0);
}
)";

// Full colour on the line, fading to nothing one pixel away on either side.
const char kGuidelineFragmentSource[] = R"(#version 410
uniform vec4 lineColour;
uniform float linePosition;
uniform float lineStrength;
in vec2 scopePosition;
layout(location = 0) out vec4 fragColour;
void main() {
  float coverage = max(1.0 - abs(scopePosition.y - linePosition), 0.0);
  fragColour = lineColour * coverage * min(lineStrength, 1.0);
}
)";

struct Line {
  float left, right, y;
  std::array<float, 4> colour;
};

// Lines add their colour over what the target holds, weighted by their coverage.
void drawLines(const Plugin::host::HostCalls& host, EffectData& programs,
               const std::vector<Line>& lines, const GraticuleFrame& frame) {
  if (lines.empty()) {
    return;
  }
  programs.useProgram(kGuidelineProgram);
  programs.setUniformMatrix(programs.uniformLocation(Plugin::gl::kProjectionUniform), 4, 1, false,
                            frame.projection.data());
  programs.setUniformMatrix(programs.uniformLocation(Plugin::gl::kModelViewUniform), 4, 1, false,
                            frame.modelView.data());
  programs.setUniform1f(programs.uniformLocation(kLineStrengthUniform), 1.0f);
  glEnable(GL_BLEND);
  glBlendEquation(GL_FUNC_ADD);
  glBlendFunc(GL_ONE, GL_ONE_MINUS_SRC_ALPHA);
  const GLint colour = programs.uniformLocation(kLineColourUniform);
  const GLint position = programs.uniformLocation(kLinePositionUniform);
  for (const Line& line : lines) {
    programs.setUniform4f(colour, line.colour[0], line.colour[1], line.colour[2], line.colour[3]);
    programs.setUniform1f(position, line.y);
    const float quad[8] = {line.left, frame.bottom, line.right, frame.bottom,
                           line.left, frame.top,    line.right, frame.top};
    Plugin::gl::drawPositionArrays(host, quad, 4, GL_TRIANGLE_STRIP);
  }
  glBlendFunc(GL_ONE, GL_ONE);
  glDisable(GL_BLEND);
  programs.releaseProgram();
}

}  // namespace

void ensureGuidelineProgram(EffectData& programs, bool echo) {
  programs.ensureProgram(kGuidelineProgram, {kGuidelineVertexSource, {}, kGuidelineFragmentSource},
                         {echo, Plugin::gl::AttributeNames::kStored, Plugin::gl::TexCoords::kNone});
}

void drawGuidelines(const Plugin::host::HostCalls& host, EffectData& programs,
                    const GuidelineList& guidelines, float left, float right,
                    const GraticuleFrame& frame) {
  std::vector<Line> lines;
  for (const Guideline& guideline : guidelines) {
    lines.push_back({left, right, guideline.y, kGuidelineColour});
  }
  drawLines(host, programs, lines, frame);
}

void drawColourBarMarkers(const Plugin::host::HostCalls& host, EffectData& programs,
                          const std::vector<ColourBarMarker>& markers,
                          const GraticuleFrame& frame) {
  std::vector<Line> lines;
  for (const ColourBarMarker& marker : markers) {
    lines.push_back(
        {marker.left, marker.right, marker.y, {marker.rgb[0], marker.rgb[1], marker.rgb[2], 1}});
  }
  drawLines(host, programs, lines, frame);
}

}  // namespace plugin::Scopes
