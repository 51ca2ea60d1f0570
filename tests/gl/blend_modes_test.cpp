// The "blendShader" program: every blend mode on a row of layer and scope pixel pairs, checked
// pixel by pixel against the formulas evaluated here, and the GL state the pass leaves.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <sstream>
#include <string>
#include <vector>

#include "gl/framebuffer.h"
#include "gl/quad_maths.h"
#include "gl_test_context.h"
#include "gl_test_host.h"
#include "scope/blend_shader.h"

namespace waveform_test {
namespace {

using namespace plugin::Scopes;
using Pixel = std::array<float, 4>;
using Rect = std::array<float, 4>;

constexpr Rect kWholeTexture = {0, 0, 1, 1};
constexpr int32_t kModeNormal = 1;
const char* const kModeNames[] = {"None",      "Normal",      "Add",      "Lighten",
                                  "Screen",    "Color Dodge", "Overlay",  "Softlight",
                                  "Hardlight", "Multiply",    "Darken",   "Color Burn",
                                  "Subtract",  "Difference",  "Exclusion"};

class BlendModes : public GlTest {};

GLuint floatTexture(const std::vector<Pixel>& pixels) {
  GLuint name = 0;
  glGenTextures(1, &name);
  glBindTexture(GL_TEXTURE_2D, name);
  glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA32F, static_cast<GLsizei>(pixels.size()), 1, 0, GL_RGBA,
               GL_FLOAT, pixels.data());
  glBindTexture(GL_TEXTURE_2D, 0);
  return name;
}

// A layer row and a scope row as float textures and a float target as wide as the scope row,
// bound for drawing. A nearest-filter sampler object on units 0 and 1 overrides the linear
// filter the pass sets on the textures, so that every fragment reads exactly one texel.
class BlendRow {
 public:
  BlendRow(const std::vector<Pixel>& layer, const std::vector<Pixel>& scope)
      : layerTexture(floatTexture(layer)),
        scopeTexture(floatTexture(scope)),
        target_(floatTexture(std::vector<Pixel>(scope.size()))),
        width_(static_cast<GLsizei>(scope.size())) {
    glGenSamplers(1, &sampler_);
    glSamplerParameteri(sampler_, GL_TEXTURE_MIN_FILTER, GL_NEAREST);
    glSamplerParameteri(sampler_, GL_TEXTURE_MAG_FILTER, GL_NEAREST);
    glBindSampler(0, sampler_);
    glBindSampler(1, sampler_);
    glBindFramebuffer(GL_FRAMEBUFFER, framebuffer_.name());
    glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, target_, 0);
    glViewport(0, 0, width_, 1);
    ensureBlendProgram(programs, false);
  }
  ~BlendRow() {
    glBindFramebuffer(GL_FRAMEBUFFER, 0);
    glBindSampler(0, 0);
    glBindSampler(1, 0);
    glDeleteSamplers(1, &sampler_);
    const GLuint textures[3] = {layerTexture, scopeTexture, target_};
    glDeleteTextures(3, textures);
  }
  BlendRow(const BlendRow&) = delete;
  BlendRow& operator=(const BlendRow&) = delete;

  // Fills the target with a value no mode produces, draws one pass over the whole row and reads
  // the row back.
  std::vector<Pixel> draw(int32_t mode, const Rect& layerRect = kWholeTexture,
                          const Rect& scopeRect = kWholeTexture) {
    glClearColor(-7, -7, -7, -7);
    glClear(GL_COLOR_BUFFER_BIT);
    glClearColor(0, 0, 0, 0);
    const auto w = static_cast<float>(width_);
    const Plugin::gl::Matrix4 projection = Plugin::gl::orthographicMatrix(w, 1);
    BlendPass pass;
    pass.layerTexture = layerTexture;
    pass.scopeTexture = scopeTexture;
    pass.mode = mode;
    pass.quad = {0, 0, w, 1};
    pass.layerRect = layerRect;
    pass.scopeRect = scopeRect;
    pass.projection = projection.data();
    pass.modelView = Plugin::gl::kIdentityMatrix.data();
    drawBlendPass(host.calls(), programs, pass);
    std::vector<Pixel> row(static_cast<size_t>(width_));
    glReadPixels(0, 0, width_, 1, GL_RGBA, GL_FLOAT, row.data());
    return row;
  }

  GlTestHost host;
  Plugin::gl::EffectData programs;
  const GLuint layerTexture;
  const GLuint scopeTexture;

 private:
  const GLuint target_;
  const GLsizei width_;
  GLuint sampler_ = 0;
  const Plugin::gl::FBO framebuffer_;
};

// The reference: the blend-mode table evaluated per channel on the CPU.

float unpremultiplied(float colour, float alpha) {
  return alpha == 0 ? 0.0f : colour / alpha;
}

// Alpha to 0..1, then each colour channel to 0..alpha.
Pixel clampedScope(const Pixel& raw) {
  const float a = std::clamp(raw[3], 0.0f, 1.0f);
  return {std::clamp(raw[0], 0.0f, a), std::clamp(raw[1], 0.0f, a), std::clamp(raw[2], 0.0f, a), a};
}

// The colour f of the modes 3 to 14 for one channel: scope colour s, layer colour b.
float modeColour(int32_t mode, float s, float b) {
  switch (mode) {
    case 3:
      return std::max(s, b);
    case 4:
      return 1 - (1 - b) * (1 - std::clamp(s, 0.0f, 1.0f));
    case 5:
      return s >= 0.99f ? s : std::clamp(b / (1 - s), 0.0f, 1.0f);
    case 6:
      if (b < 0.5f) {
        return s < 0 ? s : 2 * b * s;
      }
      return (1 - 2 * (1 - std::min(s, 1.0f)) * (1 - b)) * std::max(s, 1.0f);
    case 7: {
      const float t = std::max(s, 0.0f);
      if (b <= 0 || b >= 1) {
        return b;
      }
      if (t < 0.5f) {
        return 2 * b * t + b * b * (1 - 2 * t);
      }
      return std::sqrt(b) * (2 * t - 1) + 2 * b * (1 - t);
    }
    case 8:
      if (s < 0.5f) {
        return b < 0 ? b : 2 * b * s;
      }
      return (1 - 2 * (1 - s) * (1 - std::min(b, 1.0f))) * std::max(b, 1.0f);
    case 9:
      return std::max(s, 0.0f) * b;
    case 10:
      return std::min(s, b);
    case 11:
      return s == 0 ? s : std::clamp(1 - (1 - b) / s, 0.0f, 1.0f);
    case 12:
      return b - std::max(s, 0.0f);
    case 13:
      return std::abs(b - s);
    case 14:
      return s + b - 2 * s * b;
    default:
      ADD_FAILURE() << "no colour formula for mode " << mode;
      return 0;
  }
}

Pixel expectedPixel(int32_t mode, const Pixel& layer, const Pixel& rawScope) {
  const Pixel scope = clampedScope(rawScope);
  const float a = scope[3];
  Pixel result{};
  for (size_t c = 0; c < 4; ++c) {
    switch (mode) {
      case 0:
        result[c] = scope[c];
        break;
      case 1:
        result[c] = scope[c] + layer[c] * (1 - a);
        break;
      case 2:
        result[c] = c < 3 ? std::max(scope[c], 0.0f) + layer[c] : a + layer[3] * (1 - a);
        break;
      default: {
        const float f = c < 3 ? modeColour(mode, unpremultiplied(scope[c], a),
                                           unpremultiplied(layer[c], layer[3]))
                              : 1.0f;
        result[c] = f * a + layer[c] * (1 - a);
      }
    }
  }
  return result;
}

std::string describe(const Pixel& p) {
  std::ostringstream text;
  text << "(" << p[0] << ", " << p[1] << ", " << p[2] << ", " << p[3] << ")";
  return text.str();
}

void expectPixelNear(const Pixel& actual, const Pixel& expected, float tolerance,
                     const std::string& where) {
  for (size_t c = 0; c < 4; ++c) {
    EXPECT_NEAR(actual[c], expected[c], tolerance * std::max(1.0f, std::abs(expected[c])))
        << where << " channel " << c << ": expected " << describe(expected) << ", got "
        << describe(actual);
  }
}

// Scope pixels as the scope texture may hold them: transparent and opaque, partly covered,
// colours above alpha and below 0, alpha above 1 and below 0; colours s near 0, 0.3, 0.5, 0.99
// and 1 after un-premultiplying.
const std::vector<Pixel> kScopePixels = {
    {0, 0, 0, 0},
    {1, 1, 1, 1},
    {0, 0, 0, 1},
    {0.3f, 0.5f, 0.99f, 1},
    {0.15f, 0.25f, 0.4f, 0.5f},
    {1.2f, 0.7f, -0.2f, 0.6f},
    {0.5f, 0.2f, 0.1f, 1.4f},
    {0.0025f, 0.24875f, 0.24625f, 0.25f},
    {0.001f, 0.7f, 0.9f, -0.5f},
    {0.05f, 0.2f, 0.5f, 0.6f},
};

// Premultiplied layer pixels, float storage: colours b below 0, 0, 0.25, 0.5, 0.75, 1 and above
// 1, near 0 and near 1; transparent, colour without alpha, partly covered.
const std::vector<Pixel> kLayerPixels = {
    {0, 0, 0, 0},
    {0.2f, 0.1f, 0.05f, 0},
    {-0.1f, 0, 0.25f, 1},
    {0.5f, 0.75f, 1, 1},
    {1.5f, 0.4f, 0.6f, 1},
    {0.125f, 0.25f, 0.375f, 0.5f},
    {0.6f, -0.05f, 0.2f, 0.4f},
    {1, 1, 1, 1},
    {0.005f, 0.995f, 0.45f, 1},
    {0.3f, 0.18f, 0.9f, 0.6f},
};

// Division and the square root may round differently on the GPU; the rest is a few operations.
float toleranceOf(int32_t mode) {
  return mode == 5 || mode == 7 || mode == 11 ? 5e-5f : 1e-5f;
}

TEST_F(BlendModes, EveryModeMatchesItsFormulaOnEveryPixelPair) {
  std::vector<Pixel> layer;
  std::vector<Pixel> scope;
  for (const Pixel& s : kScopePixels) {
    for (const Pixel& b : kLayerPixels) {
      scope.push_back(s);
      layer.push_back(b);
    }
  }
  BlendRow row(layer, scope);
  for (int32_t mode = 0; mode <= 14; ++mode) {
    const std::vector<Pixel> drawn = row.draw(mode);
    for (size_t i = 0; i < drawn.size(); ++i) {
      expectPixelNear(drawn[i], expectedPixel(mode, layer[i], scope[i]), toleranceOf(mode),
                      "mode " + std::to_string(mode) + " (" + kModeNames[mode] + ") pixel " +
                          std::to_string(i) + ", scope " + describe(scope[i]) + " over layer " +
                          describe(layer[i]));
    }
  }
}

TEST_F(BlendModes, CompositesWithGlBlendingOffAndLeavesBothTexturesBound) {
  BlendRow row({{0.2f, 0.4f, 0.6f, 1}}, {{0.25f, 0, 0.5f, 0.5f}});
  ensureBlendProgram(row.programs, false);
  EXPECT_EQ(row.programs.programCount(), 1);
  // Additive GL blending left on by an earlier pass must not reach the target.
  glEnable(GL_BLEND);
  glBlendFunc(GL_ONE, GL_ONE);
  expectPixelNear(row.draw(kModeNormal)[0], {0.35f, 0.2f, 0.8f, 1}, 1e-6f, "Normal");
  EXPECT_FALSE(glIsEnabled(GL_BLEND));

  GLint active = 0;
  glGetIntegerv(GL_ACTIVE_TEXTURE, &active);
  EXPECT_EQ(active, GL_TEXTURE0);
  GLint bound = 0;
  glGetIntegerv(GL_TEXTURE_BINDING_2D, &bound);
  EXPECT_EQ(static_cast<GLuint>(bound), row.layerTexture);
  glActiveTexture(GL_TEXTURE1);
  glGetIntegerv(GL_TEXTURE_BINDING_2D, &bound);
  EXPECT_EQ(static_cast<GLuint>(bound), row.scopeTexture);
  glBindTexture(GL_TEXTURE_2D, 0);
  glActiveTexture(GL_TEXTURE0);
  glBindTexture(GL_TEXTURE_2D, 0);
  glBlendFunc(GL_ONE, GL_ZERO);
}

}  // namespace
}  // namespace waveform_test
