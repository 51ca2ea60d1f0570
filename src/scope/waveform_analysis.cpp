#include "scope/waveform_analysis.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <vector>

#include "gl/pass_state_guard.h"
#include "gl/stencil_buffer.h"
#include "gl/texture_units.h"
#include "gl/textured_quad_program.h"
#include "gl/vertex_attributes.h"
#include "gl/vertex_buffer.h"
#include "scope/colour_space.h"
#include "scope/parameter_choices.h"
#include "scope/waveform_analysis_shaders.h"

namespace plugin::Scopes {
namespace {

using Plugin::gl::EffectData;
using Plugin::host::HostCalls;
using vtpl::HostEffectRecord;
namespace shader = AnalysisShader;

constexpr float kDegreesToRadians = 0.017453292f;
constexpr GLenum kEightBitFormat = GL_RGBA;

// "vec3 name() { if (colorSpace == 601) return vec3(...); ... return vec3(0.0); }"
std::string coefficientFunction(const char* name, size_t row) {
  std::string text = std::string("vec3 ") + name + "() {\n";
  for (const int32_t space : {kRec601, kRec709, kRec2020}) {
    const Vector3& weights = colourSpaceMatrices(space)->toYCbCr[row];
    char line[160];
    std::snprintf(line, sizeof line, "  if (colorSpace == %d) return vec3(%.17g, %.17g, %.17g);\n",
                  space, weights[0], weights[1], weights[2]);
    text += line;
  }
  return text + "  return vec3(0.0);\n}\n";
}

std::string buildVertexSource() {
  std::string source = shader::kVertexSourceTemplate;
  const std::string placeholder = "@COLOUR_SPACE_ROWS@";
  source.replace(source.find(placeholder), placeholder.size(),
                 coefficientFunction("lumaWeights", 0) + coefficientFunction("cbWeights", 1) +
                     coefficientFunction("crWeights", 2));
  return source;
}

struct Pass {
  int32_t channelIndex;
  GLboolean red, green, blue;
};

std::vector<Pass> passesFor(int32_t mode) {
  switch (mode) {
    case kModeLuminance:
      return {{0, GL_TRUE, GL_TRUE, GL_TRUE}};
    case kModeRGB:
      return {{1, GL_TRUE, GL_FALSE, GL_FALSE},
              {2, GL_FALSE, GL_TRUE, GL_FALSE},
              {3, GL_FALSE, GL_FALSE, GL_TRUE}};
    case kModeCbCr:
      return {{5, GL_TRUE, GL_FALSE, GL_FALSE},
              {6, GL_FALSE, GL_TRUE, GL_FALSE},
              {7, GL_FALSE, GL_FALSE, GL_TRUE}};
    case kModeRed:
      return {{1, GL_TRUE, GL_FALSE, GL_FALSE}};
    case kModeGreen:
      return {{2, GL_FALSE, GL_TRUE, GL_FALSE}};
    case kModeBlue:
      return {{3, GL_FALSE, GL_FALSE, GL_TRUE}};
    case kModeAlpha:
      return {{4, GL_TRUE, GL_TRUE, GL_TRUE}};
    default:
      return {};
  }
}

// Luminance and Alpha write one value into all three channels, so they may take three times as
// many points before the cap.
bool writesAllChannels(int32_t mode) {
  return mode == kModeLuminance || mode == kModeAlpha;
}

float samplingFactor(int32_t downsample) {
  switch (downsample) {
    case kDownsampleHalf:
      return 0.5f;
    case kDownsampleQuarter:
      return 0.25f;
    default:
      return 1.0f;
  }
}

struct Grid {
  GLint x0 = 0, y0 = 0;
  GLsizei columns = 0, rows = 0;
  float sx = 1, sy = 1;
};

Grid samplingGrid(const AnalysisSettings& settings, const AnalysisInput& input, float factor) {
  const float halfWidth = input.frameWidth / 2.0f;
  const float halfHeight = input.frameHeight / 2.0f;
  FramePoint start = {-halfWidth, -halfHeight};
  FramePoint end = {halfWidth, halfHeight};
  if (!input.fullFrame) {
    start = settings.clipStart;
    end = settings.clipEnd;
  }
  Grid grid;
  grid.sx = input.renderScaleX * input.layerScale[0] * factor;
  grid.sy = input.renderScaleY * input.layerScale[1] * factor;
  const float xa = (halfWidth + start[0]) * grid.sx;
  const float xb = (halfWidth + end[0]) * grid.sx;
  const float ya = (halfHeight + start[1]) * grid.sy;
  const float yb = (halfHeight + end[1]) * grid.sy;
  // The origin is the first pixel inside the rectangle; the extent runs to its far edge, which
  // may be the layer's own edge, so that a full-frame analysis takes the last column and row too.
  const float width = static_cast<float>(input.layer.width);
  const float height = static_cast<float>(input.layer.height);
  grid.x0 = static_cast<GLint>(std::clamp(std::floor(std::min(xa, xb)), 0.0f, width - 1.0f));
  grid.y0 = static_cast<GLint>(std::clamp(std::floor(std::min(ya, yb)), 0.0f, height - 1.0f));
  grid.columns =
      static_cast<GLsizei>(std::clamp(std::ceil(std::max(xa, xb)), 0.0f, width)) - grid.x0;
  grid.rows = static_cast<GLsizei>(std::clamp(std::ceil(std::max(ya, yb)), 0.0f, height)) - grid.y0;
  return grid;
}

// How the points of one analysis are drawn: where, how bright, and how many may pile up.
struct PointPlan {
  Grid grid;
  float intensity = 0;
  GLint stencilReference = 0;
  ValueRange range;
};

PointPlan planPoints(const AnalysisSettings& settings, const AnalysisInput& input) {
  const float factor = samplingFactor(settings.downsample);
  PointPlan plan;
  plan.grid = samplingGrid(settings, input, factor);
  // The range follows the waveform texture, so that a comparison layer of another bit depth
  // than the output is measured on the same scale as the effect's own layer.
  plan.range = waveformValueRange(input.target->internalFormat());
  plan.intensity = pointIntensity(settings.brightness, static_cast<float>(input.target->height()),
                                  plan.range, static_cast<float>(input.layer.height));
  const int32_t cap = saturationCap(plan.intensity);
  plan.stencilReference = std::min(writesAllChannels(settings.mode) ? 3 * cap : cap, 255);
  return plan;
}

// The waveform texture as colour target, with a stencil buffer of its size from the pool to
// count points per pixel.
std::shared_ptr<Plugin::gl::StencilRenderBuffer> attachTargets(const AnalysisResources& resources,
                                                               const Plugin::gl::Texture& target) {
  glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, target.name(), 0);
  glViewport(0, 0, static_cast<GLsizei>(target.width()), static_cast<GLsizei>(target.height()));
  std::shared_ptr<Plugin::gl::StencilRenderBuffer> stencil =
      Plugin::gl::acquireStencilBuffer(resources.stencilPool, resources.resourceLock);
  Plugin::gl::attachStencil(*stencil, target.width(), target.height());
  return stencil;
}

void setAnalysisUniforms(const EffectData& programs, const AnalysisSettings& settings,
                         const AnalysisInput& input, const PointPlan& plan) {
  const auto location = [&programs](const char* name) { return programs.uniformLocation(name); };
  programs.setUniformMatrix(location(Plugin::gl::kProjectionUniform), 4, 1, false,
                            input.projection);
  programs.setUniformMatrix(location(Plugin::gl::kModelViewUniform), 4, 1, false, input.modelView);
  Plugin::gl::bindTextureUnit(GL_TEXTURE0, GL_TEXTURE_2D, input.layer.name, false);
  Plugin::gl::resetTextureUnit(GL_TEXTURE0, GL_TEXTURE_2D, true);
  programs.setUniform1i(location(shader::kLayerSampler), 0);
  programs.setUniform2f(location(shader::kFrameSize), static_cast<float>(input.frameWidth),
                        static_cast<float>(input.frameHeight));
  programs.setUniform2f(location(shader::kLayerExtent), input.layer.uMax, input.layer.vMax);
  programs.setUniform1f(location(shader::kDirection),
                        settings.directionDegrees * kDegreesToRadians);
  programs.setUniform2i(location(shader::kGridOrigin), plan.grid.x0, plan.grid.y0);
  programs.setUniform2f(location(shader::kSamplingScale), plan.grid.sx, plan.grid.sy);
  programs.setUniform1f(location(shader::kIntensity), plan.intensity);
  programs.setUniform2f(location(shader::kValueRange), plan.range.low, plan.range.high);
  programs.setUniform1i(location(shader::kColorSpace), settings.colorSpace);
  programs.setUniform1i(location(shader::kLinearInput), input.linearInput ? 1 : 0);
}

// Colour adds up, alpha keeps its largest value; the stencil counts points per pixel, and a
// pixel stops taking points once the count reaches the plan's reference.
void drawChannelPasses(const AnalysisResources& resources, int32_t mode, const PointPlan& plan) {
  const EffectData& programs = resources.programs;
  const GLint channelIndex = programs.uniformLocation(shader::kChannelIndex);
  const GLint gridOrigin = programs.uniformLocation(shader::kGridOrigin);
  glEnable(GL_BLEND);
  glBlendEquationSeparate(GL_FUNC_ADD, GL_MAX);
  glBlendFunc(GL_ONE, GL_ONE);
  glEnable(GL_STENCIL_TEST);
  glStencilOp(GL_KEEP, GL_INCR, GL_INCR);
  glClear(GL_COLOR_BUFFER_BIT | GL_STENCIL_BUFFER_BIT);
  const Grid& grid = plan.grid;
  for (const Pass& pass : passesFor(mode)) {
    glClear(GL_STENCIL_BUFFER_BIT);
    programs.setUniform1i(channelIndex, pass.channelIndex);
    glColorMask(pass.red, pass.green, pass.blue, GL_TRUE);
    glStencilFunc(GL_GEQUAL, plan.stencilReference, 0xFF);
    if (grid.rows <= 0 || grid.columns <= 0) {
      continue;
    }
    if (resources.instancedDrawing) {
      glDrawArraysInstanced(GL_POINTS, 0, grid.rows, grid.columns);
    } else {
      for (GLsizei column = 0; column < grid.columns; ++column) {
        programs.setUniform2i(gridOrigin, grid.x0 + column, grid.y0);
        glDrawArrays(GL_POINTS, 0, grid.rows);
      }
    }
  }
}

// The state the host and the next pass expect: blending and the stencil test off, all channels
// written, no program, no stencil attachment and nothing bound on unit 0.
void finishAnalysis(const EffectData& programs) {
  glColorMask(GL_TRUE, GL_TRUE, GL_TRUE, GL_TRUE);
  glBlendEquation(GL_FUNC_ADD);
  glDisable(GL_BLEND);
  glDisable(GL_STENCIL_TEST);
  glFlush();
  glPointSize(1.0f);
  Plugin::gl::unbindTextureUnit(GL_TEXTURE0, GL_TEXTURE_2D, false);
  programs.releaseProgram();
  glFramebufferRenderbuffer(GL_FRAMEBUFFER, GL_STENCIL_ATTACHMENT, GL_RENDERBUFFER, 0);
  glDisableVertexAttribArray(Plugin::gl::kPositionLocation);
}

}  // namespace

const std::string& analysisVertexSource() {
  static const std::string source = buildVertexSource();
  return source;
}

void ensureAnalysisPrograms(EffectData& programs, bool echo) {
  for (const char* name : {kWaveformProgram, kWaveformUIProgram}) {
    if (programs.programId(name) >= 0) {
      continue;
    }
    programs.addProgram(analysisVertexSource(), shader::kFragmentSource, echo, name);
    // The vertex stage takes its grid row, not a position, at location 0.
    programs.bindAttribute(name, Plugin::gl::kPositionLocation, shader::kRowAttribute);
    programs.linkProgram(name, echo);
  }
}

uint32_t waveformTextureHeight(uint32_t outputFormat, uint32_t referenceHeight) {
  return outputFormat == kEightBitFormat ? 256u : std::max(referenceHeight, 256u);
}

float pointIntensity(float brightness, float waveformHeight, const ValueRange& range,
                     float layerHeight) {
  const float span = range.high - range.low;
  return brightness * 0.1f * (waveformHeight / span) / layerHeight;
}

int32_t saturationCap(float intensity) {
  return static_cast<int32_t>(std::clamp(std::ceil(1.0f / intensity), 1.0f, 100.0f));
}

void analyseLayer(const HostCalls& host, const AnalysisResources& resources,
                  const AnalysisSettings& settings, const AnalysisInput& input) {
  const Plugin::gl::PassStateGuard stateGuard;
  const PointPlan plan = planPoints(settings, input);
  const float factor = samplingFactor(settings.downsample);
  if (factor < 1.0f) {
    glPointSize(1.0f / factor);
  }
  const auto stencil = attachTargets(resources, *input.target);
  resources.programs.useProgram(input.interfaceProgram ? kWaveformUIProgram : kWaveformProgram);
  setAnalysisUniforms(resources.programs, settings, input, plan);

  // One vertex per grid row; the values only feed a negligible depth offset.
  glBindVertexArray(host.call(&HostEffectRecord::vertexArray));
  const std::vector<int8_t> rowOffsets(static_cast<size_t>(std::max(plan.grid.rows, 1)), 0);
  {
    const Plugin::gl::VertexBufferObjectRAII rowBuffer(
        host, rowOffsets.data(), static_cast<GLuint>(rowOffsets.size()), GL_STATIC_DRAW);
    glEnableVertexAttribArray(Plugin::gl::kPositionLocation);
    glVertexAttribPointer(Plugin::gl::kPositionLocation, 1, GL_BYTE, GL_FALSE, 0, nullptr);
    drawChannelPasses(resources, settings.mode, plan);
    finishAnalysis(resources.programs);
  }
  glBindVertexArray(0);
}

}  // namespace plugin::Scopes
